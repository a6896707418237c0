// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The sample repository's catalogue tells the truth: every size is the real size of its archive, and a
// full size or premium quality is a better voice, never its compact twin packed again under a new name.
#include "TestEnvironment.h"

#include "core/formats/PropertyList.h"

#include <QCryptographicHash>
#include <QDir>
#include <QDirIterator>
#include <QFileInfo>
#include <QTest>

using namespace Cadenza;

namespace {

const QString PremiumSuffix = QStringLiteral(".premium");
const QString CompactSuffix = QStringLiteral(".compact");

/// What a voice sounds like, as far as its bundle decides it: the engine, the engine's voice and
/// variant, and every resource file but the credits.
QByteArray voiceData(const QString &bundle)
{
    const auto info = Platform::PropertyList::readFile(bundle + QStringLiteral("/Info.plist"));
    if (!info) {
        return {};
    }
    const QVariantMap engine = info->toMap().value(QStringLiteral("Engine")).toMap();
    QByteArray data = engine.value(QStringLiteral("Name"), QStringLiteral("espeak-ng")).toString().toUtf8()
        + '|' + engine.value(QStringLiteral("Voice")).toString().toUtf8() + '|'
        + engine.value(QStringLiteral("Variant")).toString().toUtf8();
    QStringList files;
    QDirIterator it(bundle + QStringLiteral("/Resources"), QDir::Files, QDirIterator::Subdirectories);
    while (it.hasNext()) {
        files.append(it.next());
    }
    files.sort();
    for (const QString &file : files) {
        if (QFileInfo(file).fileName() == u"Credits.txt") {
            continue;
        }
        QFile f(file);
        if (!f.open(QIODevice::ReadOnly)) {
            return {};
        }
        QCryptographicHash hash(QCryptographicHash::Sha256);
        hash.addData(&f);
        data += '|' + QFileInfo(file).fileName().toUtf8() + '=' + hash.result().toHex();
    }
    return data;
}

/// Where the bundles of a repository and the installed sample voices are.
struct Folders
{
    QString repository; ///< the archives, as the catalogue's package paths name them
    QString bundles; ///< the same bundles unpacked (the build's staging folder)
    QString installed; ///< the installed sample voices
};

/// Everything untrue about @p catalogue; empty when it holds.
QStringList problems(const QVariantMap &catalogue, const Folders &folders)
{
    QStringList found;
    const QVariantMap packages = catalogue.value(QStringLiteral("Packages")).toMap();
    for (auto it = packages.cbegin(); it != packages.cend(); ++it) {
        const QVariantMap package = it.value().toMap();
        const QFileInfo archive(
            folders.repository + QLatin1Char('/') + package.value(QStringLiteral("Path")).toString());
        if (!archive.isFile()) {
            found.append(it.key() + QStringLiteral(": no archive ") + archive.filePath());
        } else if (package.value(QStringLiteral("ByteSize")).toLongLong() != archive.size()) {
            found.append(it.key()
                + QStringLiteral(": catalogue says %1 bytes, the archive has %2")
                      .arg(package.value(QStringLiteral("ByteSize")).toLongLong())
                      .arg(archive.size()));
        }
    }
    const auto bundleOf = [&](const QString &tag) {
        const QString name = packages.value(tag).toMap().value(QStringLiteral("BundleName")).toString();
        return name.isEmpty() ? QString() : folders.bundles + QLatin1Char('/') + name;
    };
    const auto packageBytes = [&](const QString &tag) {
        return packages.value(tag).toMap().value(QStringLiteral("ByteSize")).toLongLong();
    };
    // The installed compact voices, by identifier, for the premium qualities offered as their upgrades.
    QHash<QString, QString> installed;
    for (const QString &name :
        QDir(folders.installed).entryList({QStringLiteral("*.SpeechVoice")}, QDir::Dirs)) {
        const QString bundle = folders.installed + QLatin1Char('/') + name;
        const auto info = Platform::PropertyList::readFile(bundle + QStringLiteral("/Info.plist"));
        if (info) {
            installed.insert(info->toMap()
                                 .value(QStringLiteral("VoiceAttributes"))
                                 .toMap()
                                 .value(QStringLiteral("VoiceIdentifier"))
                                 .toString(),
                bundle);
        }
    }
    const auto differs = [&](const QString &what, const QString &lesser, const QString &better) {
        const QByteArray lesserData = voiceData(lesser);
        const QByteArray betterData = voiceData(better);
        if (lesserData.isEmpty() || betterData.isEmpty()) {
            found.append(what + QStringLiteral(": cannot read ") + (lesserData.isEmpty() ? lesser : better));
        } else if (lesserData == betterData) {
            found.append(what + QStringLiteral(": the better quality is the same voice as ") + lesser);
        }
    };

    const QVariantMap voices = catalogue.value(QStringLiteral("DownloadableVoices")).toMap();
    for (auto it = voices.cbegin(); it != voices.cend(); ++it) {
        const QVariantMap voice = it.value().toMap();
        const QString tag = voice.value(QStringLiteral("VoiceTag")).toString();
        if (!packages.contains(tag)) {
            found.append(it.key() + QStringLiteral(": no package for ") + tag);
            continue;
        }
        if (voice.value(QStringLiteral("VoiceByteSize")).toLongLong() != packageBytes(tag)) {
            found.append(it.key() + QStringLiteral(": its size is not its archive's"));
        }
        const QString fullSize = voice.value(QStringLiteral("FullSizeBundleIdentifier")).toString();
        const QString fullSizeTag = voice.value(QStringLiteral("FullSizeTagName")).toString();
        const qint64 fullSizeBytes = voice.value(QStringLiteral("FullSizeByteSize")).toLongLong();
        if (fullSize.isEmpty() || fullSize == it.key()) {
            // One quality: a full size, if named at all, is the voice itself.
            if (!fullSizeTag.isEmpty() && (fullSizeTag != tag || fullSizeBytes != packageBytes(tag))) {
                found.append(it.key() + QStringLiteral(": a full size that is not a voice of its own"));
            }
        } else if (!packages.contains(fullSizeTag)) {
            found.append(it.key() + QStringLiteral(": no package for its full size ") + fullSizeTag);
        } else {
            if (fullSizeTag == tag || fullSizeBytes != packageBytes(fullSizeTag)
                || fullSizeBytes == packageBytes(tag)) {
                found.append(
                    it.key() + QStringLiteral(": compact and full size have the same size or package"));
            }
            differs(it.key(), bundleOf(tag), bundleOf(fullSizeTag));
        }
        // A premium quality offered on its own is the upgrade of its compact twin, wherever that is.
        if (it.key().endsWith(PremiumSuffix)) {
            const QString twin = it.key().chopped(PremiumSuffix.size()) + CompactSuffix;
            const QString twinBundle = installed.contains(twin) ? installed.value(twin)
                                                                : bundleOf(QStringLiteral("VOICEID:") + twin);
            if (!twinBundle.isEmpty()) {
                differs(it.key(), twinBundle, bundleOf(tag));
            }
        }
    }
    // The installed sample voices follow the same rule.
    for (auto it = installed.cbegin(); it != installed.cend(); ++it) {
        if (it.key().endsWith(PremiumSuffix)) {
            const QString twin = it.key().chopped(PremiumSuffix.size()) + CompactSuffix;
            if (installed.contains(twin)) {
                differs(it.key(), installed.value(twin), it.value());
            }
        }
    }
    return found;
}

QVariantMap sampleCatalogue()
{
    QString error;
    const auto catalogue
        = Platform::PropertyList::readFile(QStringLiteral(":/cadenza/SpeechDataDefaults.plist"), &error);
    return catalogue ? catalogue->toMap() : QVariantMap();
}

const Folders SampleFolders {QStringLiteral(CADENZA_SAMPLE_REPOSITORY),
    QStringLiteral(CADENZA_SAMPLE_REPOSITORY_BUNDLES "/voices"), QStringLiteral(CADENZA_SAMPLE_VOICES)};

} // namespace

class SampleCatalogueTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void theSampleCatalogueTellsTheTruth()
    {
        const QVariantMap catalogue = sampleCatalogue();
        QVERIFY(!catalogue.value(QStringLiteral("DownloadableVoices")).toMap().isEmpty());
        const QStringList found = problems(catalogue, SampleFolders);
        QVERIFY2(found.isEmpty(), qPrintable(found.join(u'\n')));
    }

    /// The journeys need one downloadable voice with two real sizes: its full size is a flite voice of
    /// megabytes, its compact quality an espeak-ng voice of a few kilobytes.
    void aDownloadableVoiceHasTwoRealSizes()
    {
        const QVariantMap catalogue = sampleCatalogue();
        const QVariantMap tobias
            = catalogue.value(QStringLiteral("DownloadableVoices"))
                  .toMap()
                  .value(QStringLiteral("com.vendra.speech.synthesis.voice.tobias.compact"))
                  .toMap();
        QCOMPARE(tobias.value(QStringLiteral("FullSizeBundleIdentifier")).toString(),
            QStringLiteral("com.vendra.speech.synthesis.voice.tobias.premium"));
        QVERIFY(tobias.value(QStringLiteral("VoiceByteSize")).toLongLong() < 64 * 1024);
        QVERIFY(tobias.value(QStringLiteral("FullSizeByteSize")).toLongLong() > 1024 * 1024);
        const auto premium = Platform::PropertyList::readFile(
            SampleFolders.bundles + QStringLiteral("/TobiasPremium.SpeechVoice/Info.plist"));
        QVERIFY(premium);
        QCOMPARE(
            premium->toMap().value(QStringLiteral("Engine")).toMap().value(QStringLiteral("Name")).toString(),
            QStringLiteral("flite"));
    }

    /// Where no better voice exists, nothing is offered: no premium of another language is left.
    void onlyVoicesWithABetterVoiceHaveAPremium()
    {
        const QVariantMap voices = sampleCatalogue().value(QStringLiteral("DownloadableVoices")).toMap();
        for (auto it = voices.cbegin(); it != voices.cend(); ++it) {
            const QVariantMap voice = it.value().toMap();
            const QString fullSize = voice.value(QStringLiteral("FullSizeBundleIdentifier")).toString();
            if (it.key().endsWith(PremiumSuffix) || (!fullSize.isEmpty() && fullSize != it.key())) {
                QVERIFY2(voice.value(QStringLiteral("VoiceAttributes"))
                             .toMap()
                             .value(QStringLiteral("VoiceLocaleIdentifier"))
                             .toString()
                             .startsWith(QStringLiteral("en_")),
                    qPrintable(it.key()));
            }
        }
    }

    /// The check catches what it is there for: a premium that is its compact twin again, and a
    /// size that is not the archive's.
    void aCopiedPremiumIsCaught()
    {
        QVariantMap catalogue = sampleCatalogue();
        QVariantMap voices = catalogue.value(QStringLiteral("DownloadableVoices")).toMap();
        QVariantMap packages = catalogue.value(QStringLiteral("Packages")).toMap();
        const QString femke = QStringLiteral("com.vendra.speech.synthesis.voice.femke.compact");
        const QString copy = QStringLiteral("com.vendra.speech.synthesis.voice.femke.premium");
        QVariantMap entry = voices.value(femke).toMap();
        QVERIFY(!entry.isEmpty());
        entry.insert(QStringLiteral("FullSizeBundleIdentifier"), copy);
        entry.insert(QStringLiteral("FullSizeTagName"), QString(QStringLiteral("VOICEID:") + copy));
        voices.insert(femke, entry);
        // Packed again with the same voice: another archive of the same bundle.
        QVariantMap package = packages.value(QStringLiteral("VOICEID:") + femke).toMap();
        packages.insert(QStringLiteral("VOICEID:") + copy, package);
        catalogue.insert(QStringLiteral("DownloadableVoices"), voices);
        catalogue.insert(QStringLiteral("Packages"), packages);
        QStringList found = problems(catalogue, SampleFolders);
        QVERIFY2(found.filter(QStringLiteral("same size")).size() == 1, qPrintable(found.join(u'\n')));
        QVERIFY2(found.filter(QStringLiteral("same voice")).size() == 1, qPrintable(found.join(u'\n')));

        catalogue = sampleCatalogue();
        packages = catalogue.value(QStringLiteral("Packages")).toMap();
        package = packages.value(QStringLiteral("VOICEID:") + femke).toMap();
        package.insert(
            QStringLiteral("ByteSize"), package.value(QStringLiteral("ByteSize")).toLongLong() + 1);
        packages.insert(QStringLiteral("VOICEID:") + femke, package);
        catalogue.insert(QStringLiteral("Packages"), packages);
        found = problems(catalogue, SampleFolders);
        QVERIFY2(found.filter(QStringLiteral("the archive has")).size() == 1, qPrintable(found.join(u'\n')));
        QVERIFY2(found.filter(QStringLiteral("its size is not its archive's")).size() == 1,
            qPrintable(found.join(u'\n')));
    }
};

QTEST_GUILESS_MAIN(SampleCatalogueTest)
#include "tst_samplecatalogue.moc"
