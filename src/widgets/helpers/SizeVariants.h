// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_SIZEVARIANTS_H
#define CADENZA_PLATFORM_SIZEVARIANTS_H

#include "cadenza_export.h"

#include <QString>

class QComboBox;

namespace Cadenza::Platform {

/**
 * The choice between the two download sizes of a voice or language, in a row's pop-up whose items
 * hold the tags 0 (compact) and 1 (full size) as their data. Both items also carry the identifier of
 * what they size, so the pop-up's handler finds it without asking the table.
 */
class CADENZA_EXPORT SizeVariants
{
public:
    /// Titles the two items with their sizes, selects the chosen one and shows the pop-up.
    static void show(QComboBox *popUp, const QString &identifier, quint64 compactBytes, quint64 fullSizeBytes,
        bool downloadFullSize);
    /// The identifier item @p index carries.
    [[nodiscard]] static QString identifier(const QComboBox *popUp, int index);
    /// Whether item @p index stands for the full size.
    [[nodiscard]] static bool isFullSize(const QComboBox *popUp, int index);
};

} // namespace Cadenza::Platform

#endif
