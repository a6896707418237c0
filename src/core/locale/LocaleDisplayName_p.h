// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_LOCALE_LOCALEDISPLAYNAME_P_H
#define CADENZA_LOCALE_LOCALEDISPLAYNAME_P_H

#include "cadenzacore_export.h"

namespace Cadenza::LocaleDisplayNamePrivate {

/// Open ICU handles and given answers are kept per display locale and context; off, every call asks ICU
/// with a handle of its own (benchmarks).
CADENZACORE_EXPORT void setHandleCacheEnabled(bool enabled);
/// Forgets the qualified-name template, so the next call reads it from the current localisation table.
CADENZACORE_EXPORT void resetQualifiedTemplate();

} // namespace Cadenza::LocaleDisplayNamePrivate

#endif
