// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_SPEECHNAMES_H
#define CADENZA_PLATFORM_SPEECHNAMES_H

#include <QString>

/**
 * Names that several processes or several parts of Cadenza must spell alike: preference domains and
 * their shared keys, cross-process notifications and fixed identifiers. Each is written here once;
 * everything else refers to it, so a typo cannot split one name into two.
 */
namespace Cadenza::SpeechNames {

/// Preference domain of the voices: visibility table, default voice, voice installation log.
inline const QString VoicePreferencesDomain = QStringLiteral("com.vendra.speech.voice.prefs");
/// Preference domain of the dictation languages: visibility table, installation log, switches.
inline const QString RecognitionPreferencesDomain
    = QStringLiteral("com.vendra.speech.recognition.VendraSpeechRecognition.prefs");

/// The user's default voice, in VoicePreferencesDomain.
inline const QString SelectedVoiceCreatorKey = QStringLiteral("SelectedVoiceCreator");
inline const QString SelectedVoiceIDKey = QStringLiteral("SelectedVoiceID");
inline const QString SelectedVoiceNameKey = QStringLiteral("SelectedVoiceName");

/// Posted (no object) whenever the voice menus of every process must be rebuilt.
inline const QString DefaultVoiceChangedNotification
    = QStringLiteral("com.vendra.speech.DefaultVoiceChangedNotification");
/// Posted when the dictation language choice or its visibility table changed.
inline const QString DefaultSRLanguageChangedNotification
    = QStringLiteral("com.vendra.speech.DefaultSRLanguageChangedNotification");
/// Posted by the desktop when the user's languages or number formats changed.
inline const QString LanguagePreferencesChangedNotification
    = QStringLiteral("VendraLanguagePreferencesChangedNotification");
inline const QString NumberPreferencesChangedNotification
    = QStringLiteral("VendraNumberPreferencesChangedNotification");

/// The default voice: always present, the voice that stands in when nothing else fits.
inline const QString OrinIdentifier = QStringLiteral("com.vendra.speech.synthesis.voice.Orin");

} // namespace Cadenza::SpeechNames

#endif
