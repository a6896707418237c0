// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_VOICEDESCRIPTION_H
#define CADENZA_PLATFORM_VOICEDESCRIPTION_H

#include "cadenzacore_export.h"

#include <QString>
#include <QStringList>
#include <QVariantMap>

#include <functional>
#include <optional>

namespace Cadenza::Platform {

/// Attribute keys of a voice, as found in the "VoiceAttributes" dictionary of a voice bundle.
namespace VoiceAttribute {
inline const QString Identifier = QStringLiteral("VoiceIdentifier");
inline const QString Name = QStringLiteral("VoiceName");
inline const QString LocaleIdentifier = QStringLiteral("VoiceLocaleIdentifier");
inline const QString Language = QStringLiteral("VoiceLanguage");
inline const QString Gender = QStringLiteral("VoiceGender");
inline const QString Age = QStringLiteral("VoiceAge");
inline const QString DemoText = QStringLiteral("VoiceDemoText");
inline const QString NameRoot = QStringLiteral("VoiceNameRoot");
inline const QString RelativeDesirability = QStringLiteral("VoiceRelativeDesirability");
inline const QString ShowInFullListOnly = QStringLiteral("VoiceShowInFullListOnly");
inline const QString Creator = QStringLiteral("VoiceCreator");
inline const QString VoiceID = QStringLiteral("VoiceID");
inline const QString Groups = QStringLiteral("VoiceGroups");
} // namespace VoiceAttribute

/// The groups a voice may belong to (VoiceAttribute::Groups).
namespace VoiceGroup {
inline const QString Default = QStringLiteral("VoiceGroupDefault");
inline const QString Compact = QStringLiteral("VoiceGroupCompact");
} // namespace VoiceGroup

/// The gender values of VoiceAttribute::Gender.
namespace VoiceGender {
inline const QString Male = QStringLiteral("VoiceGenderMale");
inline const QString Female = QStringLiteral("VoiceGenderFemale");
inline const QString Neuter = QStringLiteral("VoiceGenderNeuter");
} // namespace VoiceGender

/// The quality of a voice, told by the end of its identifier.
enum class VoiceQuality { Compact, Default, Premium };

/// One installed voice: its attributes and what the speech engine needs to speak with it.
struct CADENZACORE_EXPORT VoiceDescription
{
    QString identifier;
    QString version;
    QString bundlePath; ///< empty for voices that have no bundle (test voices)
    QVariantMap attributes; ///< always holds VoiceAttribute::Identifier
    QStringList groups;
    std::optional<std::pair<qint32, qint32>> spec; ///< (creator, id)
    QString engineName; ///< the engine that speaks the voice, such as "espeak-ng" or "flite"
    QString engineVoice; ///< the engine's voice: an espeak-ng voice or language ("en-us"), a flite voice file
    QString engineVariant; ///< espeak-ng variant, such as "f2"; may be empty
    int enginePitch = 50; ///< the voice's own pitch on the 0..100 pitch scale
    int engineRate = 175; ///< words per minute at normal speed
    QVariantMap engineSettings; ///< the bundle's whole "Engine" dictionary, for keys of the engine's own

    [[nodiscard]] static VoiceQuality qualityOf(const QString &identifier);
    /// The identifier without ".premium" or ".compact".
    [[nodiscard]] static QString baseIdentifierOf(const QString &identifier);
    /**
     * The voices that stand for the base voice of @p identifier: for "X.premium" both "X" and
     * "X.compact" (either one installed means its base voice is installed); any other identifier is
     * its own base voice.
     */
    [[nodiscard]] static QStringList baseVoiceIdentifiersOf(const QString &identifier);
    /// Whether the base voice of @p identifier is there, as @p isPresent tells of each of its forms.
    [[nodiscard]] static bool isBaseVoicePresent(
        const QString &identifier, const std::function<bool(const QString &)> &isPresent);
    /// The groups a voice belongs to when its bundle does not say: compact voices to the compact group.
    [[nodiscard]] static QStringList defaultGroupsOf(const QString &identifier);

    /**
     * Builds a description from an Info.plist dictionary. Returns nothing, with @p error set, when the
     * dictionary lacks an identifier or a name, or when its locale identifier (or, without one, its
     * language) names no language; values of the wrong type are treated as absent.
     */
    [[nodiscard]] static std::optional<VoiceDescription> fromInfo(const QVariantMap &info, QString *error);
};

} // namespace Cadenza::Platform

#endif
