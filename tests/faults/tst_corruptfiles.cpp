// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// Broken and type-confused files where Cadenza reads them: voice bundles' Info.plist, the daemon's
// catalogue and the preference files. None may crash anything; each is named in a log line; nothing
// that was good is lost.
#include "QuillondProcess.h"
#include "TestEnvironment.h"

#include "core/SpeechNames.h"
#include "core/files/Paths.h"
#include "core/services/BundleSpeechSynthesisService.h"
#include "core/services/FilePreferencesStore.h"
#include "core/services/Services.h"
#include "core/voices/CZVoiceObject.h"
#include "core/voices/SpeechSynthesizer.h"

#include <QDir>
#include <QFile>
#include <QProcess>
#include <QRandomGenerator>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString Good = QStringLiteral("com.vendra.speech.synthesis.voice.good.compact");

QStringList &capturedWarnings()
{
    static QStringList warnings;
    return warnings;
}

void captureWarnings(QtMsgType type, const QMessageLogContext &, const QString &message)
{
    if (type == QtWarningMsg || type == QtCriticalMsg) {
        capturedWarnings().append(message);
    }
}

QByteArray plist(const QByteArray &body)
{
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<plist version=\"1.0\">" + body + "</plist>\n";
}

QByteArray noise(int bytes)
{
    QByteArray data(bytes, Qt::Uninitialized);
    QRandomGenerator(11).fillRange(reinterpret_cast<quint32 *>(data.data()), bytes / 4);
    return data;
}

void writeFile(const QString &path, const QByteArray &bytes)
{
    QDir().mkpath(QFileInfo(path).absolutePath());
    QFile file(path);
    QVERIFY(file.open(QIODevice::WriteOnly));
    file.write(bytes);
}
} // namespace

class CorruptFilesTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void infoPlists_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::newRow("empty") << QByteArray();
        QTest::newRow("not XML") << QByteArray("voice = good");
        QTest::newRow("random bytes") << noise(4096);
        QTest::newRow("cut short") << plist("<dict><key>VoiceAttributes</key><dict><key>VoiceIdent");
        QTest::newRow("root is an array") << plist("<array><string>x</string></array>");
        QTest::newRow("attributes are a string")
            << plist("<dict><key>VoiceAttributes</key><string>x</string></dict>");
        QTest::newRow("identifier is a number")
            << plist("<dict><key>VoiceAttributes</key><dict><key>VoiceIdentifier</key><integer>7</integer>"
                     "<key>VoiceName</key><string>Bad</string></dict></dict>");
        QTest::newRow("no identifier") << plist(
            "<dict><key>VoiceAttributes</key><dict><key>VoiceName</key><string>Bad</string></dict></dict>");
        QTest::newRow("integer out of range")
            << plist("<dict><key>VoiceAttributes</key><dict><key>VoiceIdentifier</key><string>x.bad</string>"
                     "<key>VoiceAge</key><integer>99999999999999999999999</integer></dict></dict>");
        QTest::newRow("nested ten thousand deep") << plist(QByteArray("<array>").repeated(10000));
        QTest::newRow("engine is an array") << plist(
            "<dict><key>Engine</key><array/><key>VoiceAttributes</key><dict><key>VoiceIdentifier</key>"
            "<string>x.bad</string><key>VoiceName</key><string>Bad</string></dict></dict>");
    }
    void infoPlists()
    {
        QFETCH(QByteArray, bytes);
        TestEnvironment environment;
        TestEnvironment::writeVoiceBundle(Paths::userVoicesFolder(), QStringLiteral("Good"),
            TestEnvironment::voiceAttributes(Good, QStringLiteral("Good Compact"), QStringLiteral("en_US")));
        const QString bad = Paths::userVoicesFolder() + QStringLiteral("/Bad.SpeechVoice");
        writeFile(bad + QStringLiteral("/Info.plist"), bytes);

        capturedWarnings().clear();
        const QtMessageHandler previous = qInstallMessageHandler(captureWarnings);
        BundleSpeechSynthesisService service;
        const QList<VoiceDescription> voices = service.installedVoices();
        qInstallMessageHandler(previous);

        // The good voice is there; a bad bundle is either skipped with a line naming it, or (when its
        // file still makes a voice, such as one with an unknown engine) listed under its own identifier.
        QVERIFY(std::any_of(
            voices.cbegin(), voices.cend(), [](const VoiceDescription &v) { return v.identifier == Good; }));
        const bool skipped = voices.size() == 1;
        if (skipped) {
            QVERIFY2(std::any_of(capturedWarnings().cbegin(), capturedWarnings().cend(),
                         [&](const QString &line) { return line.contains(bad); }),
                qPrintable(capturedWarnings().join(u'\n')));
        } else {
            QCOMPARE(voices.size(), 2);
            QVERIFY(std::none_of(voices.cbegin(), voices.cend(),
                [](const VoiceDescription &v) { return v.identifier.isEmpty(); }));
        }
    }

    void catalogues_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::addColumn<bool>("refused"); // the daemon refuses to start, naming the file
        QTest::newRow("empty") << QByteArray() << true;
        QTest::newRow("random bytes") << noise(4096) << true;
        QTest::newRow("packages are an array") << plist("<dict><key>Packages</key><array/></dict>") << true;
        QTest::newRow("entry is a string")
            << plist("<dict><key>Packages</key><dict><key>VOICEID:x</key><string>y</string></dict></dict>")
            << false;
        QTest::newRow("checksum is a number") << plist(
            "<dict><key>Packages</key><dict><key>VOICEID:x</key><dict><key>Path</key><string>x.tar.gz</"
            "string>"
            "<key>SHA256</key><integer>1</integer><key>ByteSize</key><integer>1</integer><key>Kind</key>"
            "<string>voice</string><key>BundleName</key><string>X.SpeechVoice</string></dict></dict></dict>")
                                              << false;
        QTest::newRow("bundle name leaves the folder") << plist(
            "<dict><key>Packages</key><dict><key>VOICEID:x</key><dict><key>Path</key><string>x.tar.gz</"
            "string>"
            "<key>SHA256</key><string>"
            + QByteArray(64, 'a')
            + "</string><key>ByteSize</key><integer>1</integer>"
              "<key>Kind</key><string>voice</string><key>BundleName</key><string>../../X.SpeechVoice</string>"
              "</dict></dict></dict>") << false;
    }
    void catalogues()
    {
        QFETCH(QByteArray, bytes);
        QFETCH(bool, refused);
        TestEnvironment environment;
        const QString catalogue = environment.path(QStringLiteral("catalogue.plist"));
        writeFile(catalogue, bytes);
        if (refused) {
            QProcess daemon;
            daemon.start(QStringLiteral(QUILLOND_PATH), {QStringLiteral("--catalogue"), catalogue});
            QVERIFY(daemon.waitForFinished(10000));
            QCOMPARE(daemon.exitStatus(), QProcess::NormalExit);
            QVERIFY(daemon.exitCode() != 0);
            QVERIFY(QString::fromLocal8Bit(daemon.readAllStandardError()).contains(catalogue));
            return;
        }
        // A bad entry is ignored with a line naming it; the daemon serves.
        Testing::QuillondProcess daemon;
        QVERIFY(daemon.start({QStringLiteral("--catalogue"), catalogue}));
        QVERIFY(daemon.waitForLog(QStringLiteral("VOICEID:x")));
    }

    void typeConfusedPreferences()
    {
        TestEnvironment environment;
        Services::setSpeechSynthesis(nullptr);
        TestEnvironment::writeVoiceBundle(Paths::userVoicesFolder(), QStringLiteral("Good"),
            TestEnvironment::voiceAttributes(Good, QStringLiteral("Good Compact"), QStringLiteral("en_US")));
        const QString folder = Paths::configFolder();
        FilePreferencesStore store(folder);
        const QString domain = Cadenza::SpeechNames::VoicePreferencesDomain;
        writeFile(store.filePath(domain),
            plist("<dict><key>VisibleIdentifiers</key><string>everything</string>"
                  "<key>SelectedVoiceCreator</key><string>abc</string><key>SelectedVoiceID</key><array/>"
                  "<key>Kept</key><string>still here</string></dict>"));
        auto preferences = std::make_shared<FilePreferencesStore>(folder);
        Services::setPreferences(preferences);
        // Wrong types read as absent: no table, and the default voice is chosen by the usual rules.
        QVERIFY(!CZVoiceObject::visibleVoicesTable() || CZVoiceObject::visibleVoicesTable()->isEmpty());
        QCOMPARE(SpeechSynthesizer::defaultVoiceFromAllVoices(), Good);
        // Writing the table back keeps what was good in the file.
        CZVoiceObject::setVisibleVoicesTable({{Good, 1}});
        FilePreferencesStore reader(folder);
        QVERIFY(reader.synchronize(domain));
        QCOMPARE(reader.value(QStringLiteral("Kept"), domain).toString(), QStringLiteral("still here"));
        QCOMPARE(reader.value(CZVoiceObject::VisibleIdentifiersKey, domain).toMap().value(Good).toInt(), 1);
        Services::setPreferences(nullptr);
    }
};

QTEST_GUILESS_MAIN(CorruptFilesTest)
#include "tst_corruptfiles.moc"
