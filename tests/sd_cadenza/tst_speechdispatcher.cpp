// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
// sd_cadenza under a private speech-dispatcher, with python3-speechd as the client.
//
// The server runs in the foreground with its own configuration, log and runtime folders and plays
// through libao's null driver, so no audio device is needed. It finds the module in the per-user
// module folder, as it would after "cadenza-settings --install-speech-dispatcher-module". The module
// is reached through a small wrapper that keeps a copy of what it tells the server, so the audio the
// server received can be examined.

#include "ModuleDriver.h"
#include "TestEnvironment.h"

#include "core/files/Paths.h"

#include <QDir>
#include <QFile>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QLocalSocket>
#include <QProcess>
#include <QTest>

using namespace Cadenza::Platform;
using namespace Cadenza::Testing;

class TestSpeechDispatcher : public QObject
{
    Q_OBJECT

private:
    std::unique_ptr<TestEnvironment> m_env;
    QProcess m_server;
    QString m_socket;
    QString m_capture;

    /// Runs the client with @p arguments and returns what it printed.
    /// A text argument of "-" is read from @p input.
    QJsonObject client(const QStringList &arguments, const QByteArray &input = {})
    {
        QProcess process;
        process.setProcessChannelMode(QProcess::ForwardedErrorChannel);
        process.start(QStringLiteral("/usr/bin/python3"),
            QStringList {QStringLiteral(CADENZA_SOURCE_DIR "/tests/sd_cadenza/speechd_client.py"), m_socket}
                + arguments);
        process.write(input);
        process.closeWriteChannel();
        if (!process.waitForFinished(120000) || process.exitCode() != 0) {
            qWarning("the client failed: %s", qPrintable(arguments.join(QLatin1Char(' '))));
            return {};
        }
        return QJsonDocument::fromJson(process.readAllStandardOutput()).object();
    }

    QByteArray captured() const
    {
        QFile file(m_capture);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }

    /// Speaks through the server and returns the samples the module sent meanwhile.
    std::vector<qint16> speakAndCapture(const QString &voice, int rate, int pitch, const QString &text)
    {
        const qsizetype before = captured().size();
        const QJsonObject result
            = client({QStringLiteral("speak"), voice, QString::number(rate), QString::number(pitch), text});
        if (!result.value(QStringLiteral("finished")).toBool()) {
            return {};
        }
        return ModuleDriver::samplesOfStream(captured().mid(before));
    }

    static QStringList voiceLines(const QJsonObject &listing)
    {
        QStringList lines;
        for (const QJsonValue &voice : listing.value(QStringLiteral("voices")).toArray()) {
            QStringList fields;
            for (const QJsonValue &field : voice.toArray()) {
                fields.append(field.toString());
            }
            lines.append(fields.join(QLatin1Char('|')));
        }
        return lines;
    }

private Q_SLOTS:
    void initTestCase()
    {
        m_env = std::make_unique<TestEnvironment>();
        TestEnvironment::writeVoiceBundle(Paths::systemVoicesFolder(), QStringLiteral("Ada"),
            TestEnvironment::voiceAttributes(
                QStringLiteral("org.example.voice.ada"), QStringLiteral("Ada"), QStringLiteral("en_US")));
        TestEnvironment::writeVoiceBundle(Paths::systemVoicesFolder(), QStringLiteral("Bram"),
            TestEnvironment::voiceAttributes(QStringLiteral("org.example.voice.bram"), QStringLiteral("Bram"),
                QStringLiteral("en_GB"), QStringLiteral("VoiceGenderMale")),
            QStringLiteral("en-gb-x-rp"));

        const QString home = m_env->path(QStringLiteral("home"));
        const QString config = m_env->path(QStringLiteral("speechd-config"));
        const QString logs = m_env->path(QStringLiteral("speechd-log"));
        const QString runtime = m_env->path(QStringLiteral("speechd-run"));
        for (const QString &folder : QStringList {home, config + QStringLiteral("/modules"), logs, runtime}) {
            QVERIFY(QDir().mkpath(folder));
        }
        // libao's null driver: the server plays, nobody hears.
        QFile libao(home + QStringLiteral("/.libao"));
        QVERIFY(libao.open(QIODevice::WriteOnly));
        libao.write("default_driver=null\n");
        libao.close();
        QFile conf(config + QStringLiteral("/speechd.conf"));
        QVERIFY(conf.open(QIODevice::WriteOnly));
        conf.write(
            "LogLevel 2\nAudioOutputMethod \"libao\"\nDefaultModule \"cadenza\"\nDefaultLanguage \"en\"\n");
        conf.close();

        // The per-user module folder: speech-dispatcher looks beside $XDG_DATA_HOME, in ../libexec.
        const QString modules
            = Paths::userDataHome() + QStringLiteral("/../libexec/speech-dispatcher-modules");
        QVERIFY(QDir().mkpath(modules));
        m_capture = m_env->path(QStringLiteral("capture"));
        QFile wrapper(modules + QStringLiteral("/sd_cadenza"));
        QVERIFY(wrapper.open(QIODevice::WriteOnly));
        wrapper.write("#!/bin/sh\n\"" SD_CADENZA_PATH "\" \"$@\" | tee -a '" + m_capture.toUtf8() + "'\n");
        wrapper.close();
        QVERIFY(wrapper.setPermissions(QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner));

        m_socket = runtime + QStringLiteral("/speechd.sock");
        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        environment.insert(QStringLiteral("HOME"), home);
        m_server.setProcessEnvironment(environment);
        m_server.setProcessChannelMode(QProcess::ForwardedChannels);
        m_server.start(QStringLiteral("speech-dispatcher"),
            {QStringLiteral("--run-single"), QStringLiteral("--timeout"), QStringLiteral("0"),
                QStringLiteral("--config-dir"), config, QStringLiteral("--log-dir"), logs,
                QStringLiteral("--socket-path"), m_socket, QStringLiteral("--pid-file"),
                runtime + QStringLiteral("/speechd.pid")});
        QVERIFY(m_server.waitForStarted(10000));
        // Ready once it accepts connections.
        QTRY_VERIFY_WITH_TIMEOUT(
            [this] {
                QLocalSocket probe;
                probe.connectToServer(m_socket);
                return probe.waitForConnected(200);
            }(),
            30000);
    }

    void cleanupTestCase()
    {
        if (m_server.state() != QProcess::NotRunning) {
            m_server.terminate();
            if (!m_server.waitForFinished(10000)) {
                m_server.kill();
                m_server.waitForFinished(5000);
            }
        }
        m_env.reset();
    }

    void voicesAreListedWithNamesAndLanguages()
    {
        const QStringList voices = voiceLines(client({QStringLiteral("list")}));
        QCOMPARE(
            voices, QStringList({QStringLiteral("Ada|en-US|female1"), QStringLiteral("Bram|en-GB|male1")}));
    }

    void speakingBeginsEndsAndSendsAudio()
    {
        const qsizetype before = captured().size();
        const QJsonObject result
            = client({QStringLiteral("speak"), QStringLiteral("Ada"), QStringLiteral("0"),
                QStringLiteral("0"), QStringLiteral("Hello from a private speech dispatcher.")});
        QVERIFY(result.value(QStringLiteral("finished")).toBool());
        const QJsonArray events = result.value(QStringLiteral("events")).toArray();
        QCOMPARE(events.size(), 2);
        QCOMPARE(events.at(0).toArray().at(0).toString(), QStringLiteral("begin"));
        QCOMPARE(events.at(1).toArray().at(0).toString(), QStringLiteral("end"));
        // More than a second of speech went to the server.
        QVERIFY(ModuleDriver::samplesOfStream(captured().mid(before)).size() > 22050);
    }

    void rateAndPitchChangeTheAudio()
    {
        const QString text = QStringLiteral("The quick brown fox jumps over the lazy dog.");
        const auto normal = speakAndCapture(QStringLiteral("Ada"), 0, 0, text);
        const auto fast = speakAndCapture(QStringLiteral("Ada"), 80, 0, text);
        const auto high = speakAndCapture(QStringLiteral("Ada"), 0, 90, text);
        const auto low = speakAndCapture(QStringLiteral("Ada"), 0, -90, text);
        QVERIFY(!normal.empty());
        QVERIFY2(!fast.empty() && fast.size() < normal.size() * 0.7,
            qPrintable(QStringLiteral("%1 vs %2").arg(fast.size()).arg(normal.size())));
        const double pitchNormal = ModuleDriver::medianPitchHz(normal, 22050);
        const double pitchHigh = ModuleDriver::medianPitchHz(high, 22050);
        const double pitchLow = ModuleDriver::medianPitchHz(low, 22050);
        QVERIFY2(pitchLow > 0 && pitchHigh > pitchNormal * 1.2 && pitchNormal > pitchLow * 1.2,
            qPrintable(QStringLiteral("%1 %2 %3").arg(pitchLow).arg(pitchNormal).arg(pitchHigh)));
    }

    void stopInterruptsALongText()
    {
        // A megabyte: hours of speech.
        const QByteArray text = QByteArray("This long text would take hours to say. ").repeated(25000);
        const QJsonObject result
            = client({QStringLiteral("stop"), QStringLiteral("Bram"), QStringLiteral("-")}, text);
        QVERIFY(result.value(QStringLiteral("begun")).toBool());
        QVERIFY(result.value(QStringLiteral("finished")).toBool());
        const QJsonArray events = result.value(QStringLiteral("events")).toArray();
        QCOMPARE(events.last().toArray().at(0).toString(), QStringLiteral("cancel"));
        // And the server goes on speaking afterwards.
        QVERIFY(!speakAndCapture(QStringLiteral("Bram"), 0, 0, QStringLiteral("Still here.")).empty());
    }

    void voiceInstalledMeanwhileIsListed()
    {
        TestEnvironment::writeVoiceBundle(Paths::userVoicesFolder(), QStringLiteral("Dora"),
            TestEnvironment::voiceAttributes(QStringLiteral("org.example.voice.dora"), QStringLiteral("Dora"),
                QStringLiteral("it_IT"), QStringLiteral("VoiceGenderFemale")),
            QStringLiteral("it"));
        const QStringList voices = voiceLines(client({QStringLiteral("list")}));
        QVERIFY2(voices.contains(QStringLiteral("Dora|it-IT|female1")), qPrintable(voices.join(u',')));
        QVERIFY(!speakAndCapture(QStringLiteral("Dora"), 0, 0, QStringLiteral("Buongiorno.")).empty());
    }
};

QTEST_GUILESS_MAIN(TestSpeechDispatcher)
#include "tst_speechdispatcher.moc"
