// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The names other processes and other programs spell on their own: they must never drift. Everything
// else in the tree refers to the one definition, so these literals are the only check of its spelling.

#include "core/SpeechNames.h"
#include "protocol/InstallerProtocol.h"

#include <QTest>

using namespace Cadenza;

class SpeechNamesTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void preferenceDomainsAndKeys()
    {
        QCOMPARE(SpeechNames::VoicePreferencesDomain, QStringLiteral("com.vendra.speech.voice.prefs"));
        QCOMPARE(SpeechNames::RecognitionPreferencesDomain,
            QStringLiteral("com.vendra.speech.recognition.VendraSpeechRecognition.prefs"));
        QCOMPARE(SpeechNames::SelectedVoiceCreatorKey, QStringLiteral("SelectedVoiceCreator"));
        QCOMPARE(SpeechNames::SelectedVoiceIDKey, QStringLiteral("SelectedVoiceID"));
        QCOMPARE(SpeechNames::SelectedVoiceNameKey, QStringLiteral("SelectedVoiceName"));
    }

    void notificationsAndIdentifiers()
    {
        QCOMPARE(SpeechNames::DefaultVoiceChangedNotification,
            QStringLiteral("com.vendra.speech.DefaultVoiceChangedNotification"));
        QCOMPARE(SpeechNames::DefaultSRLanguageChangedNotification,
            QStringLiteral("com.vendra.speech.DefaultSRLanguageChangedNotification"));
        QCOMPARE(SpeechNames::LanguagePreferencesChangedNotification,
            QStringLiteral("VendraLanguagePreferencesChangedNotification"));
        QCOMPARE(SpeechNames::NumberPreferencesChangedNotification,
            QStringLiteral("VendraNumberPreferencesChangedNotification"));
        QCOMPARE(SpeechNames::OrinIdentifier, QStringLiteral("com.vendra.speech.synthesis.voice.Orin"));
    }

    // The numbers travel in status records between the daemon and its clients.
    void statusAndStateNumbersOnTheWire()
    {
        using namespace InstallerProtocol;
        QCOMPARE(qint64(InstalledStatus), 0);
        QCOMPARE(qint64(UpgradeAvailableStatus), 1);
        QCOMPARE(qint64(NotInstalledStatus), 2);
        QCOMPARE(qint64(DownloadingStatus), 3);
        QCOMPARE(qint64(WaitingStatus), 4);
        QCOMPARE(qint64(PreparingState), 1);
        QCOMPARE(qint64(DownloadingState), 2);
        QCOMPARE(qint64(InstallingState), 3);
        QCOMPARE(qint32(InstalledCompletion), 1);
        QCOMPARE(qint32(CancelledCompletion), 2);
        QCOMPARE(qint32(FailedCompletion), 3);
    }
};

QTEST_GUILESS_MAIN(SpeechNamesTest)
#include "tst_speechnames.moc"
