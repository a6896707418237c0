// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "core/SpeechNames.h"
#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/formats/VoiceIndex.h"
#include "core/services/BundleSpeechSynthesisService.h"
#include "core/services/PreferencesStore.h"
#include "core/services/Services.h"
#include "core/voices/SpeechSynthesizer.h"

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QProcess>
#include <QTest>

#include <fcntl.h>
#include <sys/stat.h>

using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {

const QString P = QStringLiteral("com.vendra.speech.synthesis.voice.");

/// Every field of a voice, so that lists can be compared whole.
QString describe(const VoiceDescription &v)
{
    auto variant = [](const QVariant &value) { return QString::fromUtf8(PropertyList::serialize(value)); };
    return QStringList {v.identifier, v.version, v.bundlePath, variant(v.attributes), v.groups.join(u','),
        v.spec ? QStringLiteral("%1/%2").arg(v.spec->first).arg(v.spec->second) : QStringLiteral("-"),
        v.engineName, v.engineVoice, v.engineVariant, QString::number(v.enginePitch),
        QString::number(v.engineRate), variant(v.engineSettings)}
        .join(u'|');
}

QStringList describe(const QList<VoiceDescription> &voices)
{
    QStringList lines;
    for (const auto &voice : voices) {
        lines.append(describe(voice));
    }
    return lines;
}

/// Sets a file's modification time @p secondsAgo in the past: the index keeps only settled bundles.
void age(const QString &path, int secondsAgo)
{
    QFile file(path);
    QVERIFY(file.open(QIODevice::ReadWrite));
    QVERIFY(file.setFileTime(
        QDateTime::currentDateTimeUtc().addSecs(-secondsAgo), QFileDevice::FileModificationTime));
}

QString writeVoice(const QString &folder, const QString &name, const QString &locale, int secondsAgo = 60)
{
    QVariantMap attributes = TestEnvironment::voiceAttributes(P + name, name, locale);
    attributes.insert(VoiceAttribute::Creator, 77);
    attributes.insert(VoiceAttribute::VoiceID, name.size());
    attributes.insert(QStringLiteral("VoiceExtra"),
        QVariantList {qint64(-5), quint64(18446744073709551615ULL), 2.5, true, QByteArray("\x00\x01", 2),
            QDateTime::fromMSecsSinceEpoch(1700000000000, Qt::UTC),
            QVariantMap {{QStringLiteral("k"), QString()}}});
    const QString bundle = TestEnvironment::writeVoiceBundle(folder, name, attributes);
    age(bundle + QStringLiteral("/Info.plist"), secondsAgo);
    return bundle;
}

QList<VoiceDescription> scan(bool withIndex)
{
    BundleSpeechSynthesisService service;
    if (!withIndex) {
        service.setVoiceIndexPath(QString());
    }
    return service.installedVoices();
}

} // namespace

class TestVoiceIndex : public QObject
{
    Q_OBJECT

private:
    /// Whether a new process would see the same voices with and without the index, and the index on
    /// disk is whole and knows every settled bundle.
    void compareWithAndWithout()
    {
        const QStringList with = describe(scan(true));
        const QStringList without = describe(scan(false));
        QCOMPARE(with, without);
        // Read back through the index a second time: now from what the first scan wrote.
        QCOMPARE(describe(scan(true)), without);
        VoiceIndex index(VoiceIndex::defaultPath());
        QVERIFY(index.load());
    }

private Q_SLOTS:
    void roundTrip()
    {
        TestEnvironment env;
        const QString bundle
            = writeVoice(Paths::systemVoicesFolder(), QStringLiteral("Alba"), QStringLiteral("en_GB"));
        const auto voice = BundleSpeechSynthesisService::readBundle(bundle);
        QVERIFY(voice);
        VoiceIndex::Entries entries;
        entries.insert(bundle, {{1, 2, 3}, voice, {}});
        entries.insert(QStringLiteral("/x/Bad.SpeechVoice"),
            {{-4, 5, 6}, std::nullopt, QStringLiteral("no voice name")});
        QString error;
        const auto decoded = VoiceIndex::decode(VoiceIndex::encode(entries), &error);
        QVERIFY2(decoded, qPrintable(error));
        QCOMPARE(decoded->size(), 2);
        QCOMPARE(describe(*decoded->value(bundle).voice), describe(*voice));
        QVERIFY(decoded->value(bundle).stamp == (VoiceIndex::Stamp {1, 2, 3}));
        QCOMPARE(decoded->value(QStringLiteral("/x/Bad.SpeechVoice")).error, QStringLiteral("no voice name"));
        QVERIFY(!decoded->value(QStringLiteral("/x/Bad.SpeechVoice")).voice);
        // The types stay apart: an integer is no double, unsigned beyond qint64 stays unsigned.
        const QVariantList extra
            = decoded->value(bundle).voice->attributes.value(QStringLiteral("VoiceExtra")).toList();
        QCOMPARE(extra.at(0).typeId(), QMetaType::LongLong);
        QCOMPARE(extra.at(1).typeId(), QMetaType::ULongLong);
        QCOMPARE(extra.at(2).typeId(), QMetaType::Double);
        QCOMPARE(extra.at(3).typeId(), QMetaType::Bool);
        QCOMPARE(extra.at(4).toByteArray(), QByteArray("\x00\x01", 2));
        QCOMPARE(extra.at(5).toDateTime(), QDateTime::fromMSecsSinceEpoch(1700000000000, Qt::UTC));
    }

    void everyCutIsRefused()
    {
        TestEnvironment env;
        const QString bundle
            = writeVoice(Paths::systemVoicesFolder(), QStringLiteral("Alba"), QStringLiteral("en_GB"));
        VoiceIndex::Entries entries;
        entries.insert(bundle, {{1, 2, 3}, BundleSpeechSynthesisService::readBundle(bundle), {}});
        const QByteArray bytes = VoiceIndex::encode(entries);
        for (qsizetype n = 0; n < bytes.size(); ++n) {
            QVERIFY2(!VoiceIndex::decode(bytes.left(n)), qPrintable(QString::number(n)));
        }
        // One flipped bit anywhere is caught as well.
        for (qsizetype i = 0; i < bytes.size(); ++i) {
            QByteArray damaged = bytes;
            damaged[i] = char(damaged.at(i) ^ 0x10);
            QVERIFY2(!VoiceIndex::decode(damaged), qPrintable(QString::number(i)));
        }
    }

    void theIndexIsUsed()
    {
        TestEnvironment env;
        const QString bundle
            = writeVoice(Paths::systemVoicesFolder(), QStringLiteral("Alba"), QStringLiteral("en_GB"));
        (void)scan(true);
        VoiceIndex index(VoiceIndex::defaultPath());
        QVERIFY(index.load());
        QCOMPARE(index.entries().size(), 1);
        // An entry with the bundle's present stamp is believed without parsing the bundle ...
        VoiceIndex::Entry entry = index.entries().value(bundle);
        entry.voice->attributes.insert(VoiceAttribute::Name, QStringLiteral("From the index"));
        index.insert(bundle, entry);
        QVERIFY(index.saveIfChanged());
        QCOMPARE(scan(true).value(0).attributes.value(VoiceAttribute::Name).toString(),
            QStringLiteral("From the index"));
        // ... and one with another stamp is not.
        entry.stamp.size += 1;
        index.insert(bundle, entry);
        QVERIFY(index.saveIfChanged());
        QCOMPARE(
            scan(true).value(0).attributes.value(VoiceAttribute::Name).toString(), QStringLiteral("Alba"));
    }

    void unsettledBundlesAreNotKept()
    {
        TestEnvironment env;
        writeVoice(Paths::systemVoicesFolder(), QStringLiteral("Alba"), QStringLiteral("en_GB"));
        writeVoice(Paths::systemVoicesFolder(), QStringLiteral("Fresh"), QStringLiteral("en_GB"), 0);
        QCOMPARE(scan(true).size(), 2);
        VoiceIndex index(VoiceIndex::defaultPath());
        QVERIFY(index.load());
        QCOMPARE(index.entries().keys(),
            QStringList {Paths::systemVoicesFolder() + QStringLiteral("/Alba.SpeechVoice")});
    }

    void sameListAfterEveryChange()
    {
        TestEnvironment env;
        const QString system = Paths::systemVoicesFolder();
        const QString user = Paths::userVoicesFolder();
        for (int i = 0; i < 20; ++i) {
            writeVoice(system, QStringLiteral("Voice%1").arg(i),
                i % 2 ? QStringLiteral("en_US") : QStringLiteral("de_DE"));
        }
        writeVoice(user, QStringLiteral("Voice3"), QStringLiteral("fr_FR")); // the user's copy wins
        compareWithAndWithout();
        QCOMPARE(scan(true).size(), 20);

        // Added.
        writeVoice(system, QStringLiteral("Added"), QStringLiteral("it_IT"));
        compareWithAndWithout();
        QCOMPARE(scan(true).size(), 21);

        // Removed.
        QVERIFY(QDir(system + QStringLiteral("/Voice4.SpeechVoice")).removeRecursively());
        compareWithAndWithout();
        QCOMPARE(scan(true).size(), 20);

        // Modified: same bundle, another locale and name (and so another size and time).
        writeVoice(system, QStringLiteral("Voice5"), QStringLiteral("es_ES"), 30);
        compareWithAndWithout();

        // Modified without a change of size: the time tells.
        {
            const QString plist = system + QStringLiteral("/Voice6.SpeechVoice/Info.plist");
            QFile file(plist);
            QVERIFY(file.open(QIODevice::ReadOnly));
            QByteArray bytes = file.readAll();
            file.close();
            const qsizetype at = bytes.indexOf("de_DE");
            QVERIFY(at > 0);
            bytes.replace(at, 5, "de_AT");
            QVERIFY(
                file.open(QIODevice::WriteOnly | QIODevice::Truncate) && file.write(bytes) == bytes.size());
            file.close();
            age(plist, 20);
        }
        compareWithAndWithout();
        QVERIFY(describe(scan(true)).join(u'\n').contains(u"de_AT"));

        // Info.plist damaged: the bundle is left out with and without the index.
        {
            const QString plist = system + QStringLiteral("/Voice7.SpeechVoice/Info.plist");
            QFile file(plist);
            QVERIFY(file.open(QIODevice::WriteOnly | QIODevice::Truncate));
            file.write("<plist><dict><key>");
            file.close();
            age(plist, 10);
        }
        compareWithAndWithout();
        QCOMPARE(scan(true).size(), 19);
        // Repaired again.
        writeVoice(system, QStringLiteral("Voice7"), QStringLiteral("de_DE"), 5);
        compareWithAndWithout();
        QCOMPARE(scan(true).size(), 20);

        const QString indexPath = VoiceIndex::defaultPath();
        auto rewriteIndex = [&indexPath](const std::function<void(QByteArray &)> &change) {
            QFile file(indexPath);
            QVERIFY(file.open(QIODevice::ReadOnly));
            QByteArray bytes = file.readAll();
            file.close();
            change(bytes);
            QVERIFY(file.open(QIODevice::WriteOnly | QIODevice::Truncate));
            file.write(bytes);
        };

        // Index truncated.
        rewriteIndex([](QByteArray &bytes) { bytes.truncate(bytes.size() / 2); });
        QVERIFY(!VoiceIndex(indexPath).load());
        compareWithAndWithout();

        // Index of a newer format version.
        rewriteIndex([](QByteArray &bytes) { bytes[8] = char(VoiceIndex::FormatVersion + 1); });
        QString why;
        QVERIFY(!VoiceIndex(indexPath).load(&why));
        QVERIFY2(why.contains(u"version"), qPrintable(why));
        compareWithAndWithout();

        // A foreign file where the index should be.
        rewriteIndex([](QByteArray &bytes) { bytes = QByteArray(4096, 'x'); });
        compareWithAndWithout();

        // A folder that went away.
        QVERIFY(QDir(user).removeRecursively());
        compareWithAndWithout();
        QCOMPARE(scan(true).size(), 20);
    }

    void defaultVoiceFollowsABundleChange()
    {
        TestEnvironment env;
        const QString system = Paths::systemVoicesFolder();
        writeVoice(system, QStringLiteral("Alba"), QStringLiteral("en_GB"));
        writeVoice(system, QStringLiteral("Bruno"), QStringLiteral("fr_FR"));
        PreferencesStore &preferences = Services::preferences();
        preferences.setValue(SpeechSynthesisService::SpeechLanguageKey, QStringLiteral("fr_FR"),
            Cadenza::SpeechNames::VoicePreferencesDomain);
        QVERIFY(preferences.synchronize(Cadenza::SpeechNames::VoicePreferencesDomain));
        QCOMPARE(Cadenza::SpeechSynthesizer::defaultVoiceFromAllVoices(), P + QStringLiteral("Bruno"));
        QCOMPARE(Cadenza::SpeechSynthesizer::defaultVoiceFromAllVoices(), P + QStringLiteral("Bruno"));
        // The preference changes: so does the answer.
        preferences.setValue(SpeechSynthesisService::SpeechLanguageKey, QStringLiteral("en_GB"),
            Cadenza::SpeechNames::VoicePreferencesDomain);
        QVERIFY(preferences.synchronize(Cadenza::SpeechNames::VoicePreferencesDomain));
        QCOMPARE(Cadenza::SpeechSynthesizer::defaultVoiceFromAllVoices(), P + QStringLiteral("Alba"));
        // A bundle is replaced by one of another language; the folder's time moves on as any
        // installation's rename moves it.
        QVERIFY(QDir(system + QStringLiteral("/Alba.SpeechVoice")).removeRecursively());
        writeVoice(system, QStringLiteral("Cora"), QStringLiteral("en_GB"));
        const timespec later[2] = {{0, UTIME_OMIT}, {::time(nullptr) + 5, 0}};
        QCOMPARE(::utimensat(AT_FDCWD, QFile::encodeName(system).constData(), later, 0), 0);
        QCOMPARE(Cadenza::SpeechSynthesizer::defaultVoiceFromAllVoices(), P + QStringLiteral("Cora"));
    }

    void twoProcessesAtOnce()
    {
        TestEnvironment env;
        for (int i = 0; i < 300; ++i) {
            writeVoice(
                Paths::systemVoicesFolder(), QStringLiteral("Voice%1").arg(i), QStringLiteral("en_US"));
        }
        auto run = [](QProcess &process, bool withIndex) {
            QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
            if (!withIndex) {
                // A cache folder that cannot be made: no index is read or written.
                environment.insert(QStringLiteral("XDG_CACHE_HOME"), QStringLiteral("/dev/null/none"));
            }
            process.setProcessEnvironment(environment);
            process.start(QStringLiteral(CADENZA_CLI_PATH),
                {QStringLiteral("voices"), QStringLiteral("--all"), QStringLiteral("--json")});
        };
        auto output = [](QProcess &process) -> QByteArray {
            if (!process.waitForFinished(60000) || process.exitCode() != 0) {
                return QByteArray("failed: ") + process.readAllStandardError();
            }
            return process.readAllStandardOutput();
        };
        QProcess reference;
        run(reference, false);
        const QByteArray expected = output(reference);
        QVERIFY(expected.contains("Voice299"));
        QVERIFY(!QFile::exists(VoiceIndex::defaultPath()));

        for (int round = 0; round < 4; ++round) {
            if (round == 2) {
                // A change between rounds: both processes notice it while updating the index.
                QVERIFY(QDir(Paths::systemVoicesFolder() + QStringLiteral("/Voice10.SpeechVoice"))
                            .removeRecursively());
                writeVoice(
                    Paths::systemVoicesFolder(), QStringLiteral("Voice11"), QStringLiteral("fr_FR"), 30);
            }
            QProcess first;
            QProcess second;
            run(first, true);
            run(second, true);
            QProcess now;
            run(now, false);
            const QByteArray want = output(now);
            QCOMPARE(output(first), want);
            QCOMPARE(output(second), want);
            // Whichever finished last left a whole index that knows every bundle.
            VoiceIndex index(VoiceIndex::defaultPath());
            QVERIFY(index.load());
            QCOMPARE(index.entries().size(), round < 2 ? 300 : 299);
        }
        // No temporary files are left behind.
        QCOMPARE(
            QDir(Paths::cacheFolder()).entryList(QDir::Files), QStringList {QStringLiteral("voices.index")});
    }
};

QTEST_GUILESS_MAIN(TestVoiceIndex)
#include "tst_voiceindex.moc"
