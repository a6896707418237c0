// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_RECOGNIZERBUNDLEINFO_H
#define CADENZA_PLATFORM_RECOGNIZERBUNDLEINFO_H

#include "cadenzacore_export.h"

#include <QString>
#include <QVariantMap>

#include <optional>

namespace Cadenza::Platform {

/**
 * What a recognizer bundle (".SpeechRecognition") says of itself in its Info.plist.
 *
 * A bundle is accepted only when its "LocaleIdentifier" is a string that names a language: every
 * list of dictation languages is titled by the language's name and stops the process when there is
 * none, so a bundle that cannot name its language must never get that far.
 */
struct CADENZACORE_EXPORT RecognizerBundleInfo
{
    QString localeIdentifier; ///< as the bundle spells it ("en-US", "de_DE")
    QString bundleIdentifier; ///< empty when the bundle gives none
    QString version; ///< empty when the bundle gives none

    /// The description in @p info; nothing, with @p error set, when the bundle must be left out.
    /// Optional values of the wrong type count as absent.
    [[nodiscard]] static std::optional<RecognizerBundleInfo> fromInfo(
        const QVariantMap &info, QString *error);
    /// The same for the Info.plist of the bundle folder @p bundlePath.
    [[nodiscard]] static std::optional<RecognizerBundleInfo> fromBundle(
        const QString &bundlePath, QString *error);
};

} // namespace Cadenza::Platform

#endif
