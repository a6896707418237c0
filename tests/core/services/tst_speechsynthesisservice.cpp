// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "core/SpeechNames.h"
#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/formats/WaveFile.h"
#include "core/services/BundleSpeechSynthesisService.h"
#include "core/services/PreferencesStore.h"
#include "core/services/Services.h"

#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QSignalSpy>
#include <QTest>

using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString P = QStringLiteral("com.vendra.speech.synthesis.voice.");

QVariantMap voice(const QString &suffix, const QString &name, const QString &locale, int id = 0)
{
    QVariantMap attributes = TestEnvironment::voiceAttributes(P + suffix, name, locale);
    if (id) {
        attributes.insert(VoiceAttribute::Creator, 77);
        attributes.insert(VoiceAttribute::VoiceID, id);
    }
    return attributes;
}
} // namespace

/// How a contract test puts voices and settings into one kind of service.
class ServiceFixture
{
public:
    virtual ~ServiceFixture() = default;
    virtual std::shared_ptr<SpeechSynthesisService> make() = 0;
    virtual void install(const QVariantMap &attributes) = 0;
    virtual void setSpeechLanguage(const QString &locale) = 0;
};

class FakeFixture final : public ServiceFixture
{
public:
    std::shared_ptr<SpeechSynthesisService> make() override
    {
        m_service = std::make_shared<FakeSpeechSynthesisService>();
        return m_service;
    }
    void install(const QVariantMap &attributes) override { m_service->addVoice(attributes); }
    void setSpeechLanguage(const QString &locale) override { m_service->setSpeechLanguageLocale(locale); }

private:
    std::shared_ptr<FakeSpeechSynthesisService> m_service;
};

class BundleFixture final : public ServiceFixture
{
public:
    std::shared_ptr<SpeechSynthesisService> make() override
    {
        return std::make_shared<BundleSpeechSynthesisService>();
    }
    void install(const QVariantMap &attributes) override
    {
        const QString identifier = attributes.value(VoiceAttribute::Identifier).toString();
        TestEnvironment::writeVoiceBundle(Paths::systemVoicesFolder(),
            identifier.section(QLatin1Char('.'), -2), attributes,
            attributes.value(VoiceAttribute::LocaleIdentifier).toString().startsWith(u"de")
                ? QStringLiteral("de")
                : QStringLiteral("en-us"));
    }
    void setSpeechLanguage(const QString &locale) override
    {
        Services::preferences().setValue(
            SpeechSynthesisService::SpeechLanguageKey, locale, Cadenza::SpeechNames::VoicePreferencesDomain);
        QVERIFY(Services::preferences().synchronize(Cadenza::SpeechNames::VoicePreferencesDomain));
    }
};

/// The contract every speech synthesis service keeps.
class SpeechSynthesisServiceContract : public QObject
{
    Q_OBJECT
public:
    SpeechSynthesisServiceContract(const QString &name, std::unique_ptr<ServiceFixture> fixture)
        : m_fixture(std::move(fixture))
    {
        setObjectName(name);
    }

private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_locale = std::make_shared<FakeUserLocaleService>();
        Services::setUserLocale(m_locale);
        m_service = m_fixture->make();
        for (const auto &attributes :
            {voice(QStringLiteral("Orin"), QStringLiteral("Orin"), QStringLiteral("en_US"), 1),
                voice(QStringLiteral("maren.compact"), QStringLiteral("Maren Compact"),
                    QStringLiteral("en_US"), 2),
                voice(QStringLiteral("maren.premium"), QStringLiteral("Maren Premium"),
                    QStringLiteral("en_US"), 3),
                voice(QStringLiteral("tobias.compact"), QStringLiteral("Tobias Compact"),
                    QStringLiteral("en_GB")),
                voice(QStringLiteral("liesel.compact"), QStringLiteral("Liesel Compact"),
                    QStringLiteral("de_DE")),
                voice(QStringLiteral("liesel.premium"), QStringLiteral("Liesel Premium"),
                    QStringLiteral("de_DE"))}) {
            m_fixture->install(attributes);
        }
    }
    void cleanup()
    {
        m_service.reset();
        m_environment.reset();
    }

    void groupsHoldEveryQuality()
    {
        const QStringList compact
            = m_service->voiceIdentifiersInGroups({SpeechSynthesisService::CompactVoiceGroup});
        QCOMPARE(compact,
            QStringList({P + QStringLiteral("liesel.compact"), P + QStringLiteral("maren.compact"),
                P + QStringLiteral("tobias.compact")}));
        const QStringList all = m_service->voiceIdentifiersInGroups(
            {SpeechSynthesisService::DefaultVoiceGroup, SpeechSynthesisService::CompactVoiceGroup});
        QCOMPARE(all.size(), 6);
        QVERIFY(m_service->voiceIdentifiersInGroups({QStringLiteral("NoSuchGroup")}).isEmpty());
    }

    void ordinaryListHoldsEachVoiceOnceInItsBestQuality()
    {
        QCOMPARE(m_service->availableVoices(),
            QStringList({P + QStringLiteral("Orin"), P + QStringLiteral("liesel.premium"),
                P + QStringLiteral("maren.premium"), P + QStringLiteral("tobias.compact")}));
    }

    void voiceSpecsNameVoices()
    {
        QCOMPARE(m_service->voiceIdentifierForSpec(77, 2), P + QStringLiteral("maren.compact"));
        QVERIFY(m_service->voiceIdentifierForSpec(77, 99).isEmpty());
        QVERIFY(m_service->voiceIdentifierForSpec(0, 0).isEmpty());
    }

    void attributesOfUnknownVoicesAreEmpty()
    {
        QCOMPARE(
            m_service->attributesForVoice(P + QStringLiteral("Orin")).value(VoiceAttribute::Name).toString(),
            QStringLiteral("Orin"));
        QVERIFY(m_service->attributesForVoice(P + QStringLiteral("nobody")).isEmpty());
    }

    void preferredVoiceFollowsTheLocale_data()
    {
        QTest::addColumn<QString>("locale");
        QTest::addColumn<QString>("expected");
        QTest::newRow("exact, best quality")
            << QStringLiteral("de_DE") << P + QStringLiteral("liesel.premium");
        QTest::newRow("language only") << QStringLiteral("de_AT") << P + QStringLiteral("liesel.premium");
        QTest::newRow("country decides") << QStringLiteral("en_GB") << P + QStringLiteral("tobias.compact");
        QTest::newRow("no voice of the language") << QStringLiteral("fr_FR") << P + QStringLiteral("Orin");
    }
    void preferredVoiceFollowsTheLocale()
    {
        QFETCH(QString, locale);
        QFETCH(QString, expected);
        const QStringList all = m_service->voiceIdentifiersInGroups(
            {SpeechSynthesisService::DefaultVoiceGroup, SpeechSynthesisService::CompactVoiceGroup});
        QCOMPARE(m_service->preferredVoiceForLocale(all, locale), expected);
    }

    void preferredVoiceWithoutLocaleFollowsTheUsersLanguage()
    {
        m_locale->setPreferredLanguages({QStringLiteral("de_CH"), QStringLiteral("en_US")});
        QCOMPARE(m_service->preferredVoiceForLocale(m_service->availableVoices(), QString()),
            P + QStringLiteral("liesel.premium"));
        QVERIFY(m_service->preferredVoiceForLocale({}, QStringLiteral("en_US")).isEmpty());
    }

    void speechLanguageIsAbsentUntilChosen()
    {
        QVERIFY(!m_service->speechLanguageLocale());
        m_fixture->setSpeechLanguage(QStringLiteral("de_DE"));
        QCOMPARE(m_service->speechLanguageLocale().value_or(QString()), QStringLiteral("de_DE"));
        QCOMPARE(m_service->defaultVoice(), P + QStringLiteral("liesel.premium"));
    }

    void defaultVoiceIsTheSelectedVoiceInItsBestQuality()
    {
        PreferencesStore &preferences = Services::preferences();
        preferences.setValue(
            Cadenza::SpeechNames::SelectedVoiceCreatorKey, 77, Cadenza::SpeechNames::VoicePreferencesDomain);
        preferences.setValue(
            Cadenza::SpeechNames::SelectedVoiceIDKey, 2, Cadenza::SpeechNames::VoicePreferencesDomain);
        QVERIFY(preferences.synchronize(Cadenza::SpeechNames::VoicePreferencesDomain));
        QCOMPARE(m_service->defaultVoice(), P + QStringLiteral("maren.premium"));
    }

    void speakingFinishesEveryRequest()
    {
        QSignalSpy finished(m_service.get(), &SpeechSynthesisService::speakingFinished);
        const quint64 id = m_service->startSpeaking({QStringLiteral("Hello."), P + QStringLiteral("Orin")});
        QVERIFY(id != 0);
        QVERIFY(finished.wait(20000));
        QCOMPARE(finished.first().at(0).toULongLong(), id);
        QCOMPARE(finished.first().at(1).toBool(), true);
        QVERIFY(!m_service->isSpeaking());
    }

    void stoppingEndsTheRequestUncompleted()
    {
        QSignalSpy finished(m_service.get(), &SpeechSynthesisService::speakingFinished);
        const quint64 id = m_service->startSpeaking(
            {QStringLiteral("A long sentence that takes a while to say."), P + QStringLiteral("Orin")});
        QVERIFY(id != 0);
        m_service->stopSpeaking();
        QCOMPARE(finished.size(), 1);
        QCOMPARE(finished.first().at(1).toBool(), false);
        QTest::qWait(300);
        QCOMPARE(finished.size(), 1); // no late second report
    }

    void unknownVoicesSpeakNothing()
    {
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("No installed voice")));
        QSignalSpy finished(m_service.get(), &SpeechSynthesisService::speakingFinished);
        const quint64 id = m_service->startSpeaking({QStringLiteral("Hello."), P + QStringLiteral("nobody")});
        QCOMPARE(id, quint64(0));
        QTest::qWait(50);
        QCOMPARE(finished.size(), 0);
    }

    void renderingWritesAudibleSpeech()
    {
        const QString path = m_environment->path(QStringLiteral("out.wav"));
        QString error;
        QVERIFY2(m_service->renderToFile(
                     {QStringLiteral("Hello, this is a test."), P + QStringLiteral("maren.premium")}, path,
                     &error),
            qPrintable(error));
        const auto audio = WaveFile::read(path, &error);
        QVERIFY2(audio, qPrintable(error));
        QVERIFY2(audio->durationSeconds() > 0.3, qPrintable(QString::number(audio->durationSeconds())));
        QVERIFY2(audio->rootMeanSquare() > 300.0, qPrintable(QString::number(audio->rootMeanSquare())));
        QVERIFY(!QFile::exists(path + QStringLiteral(".part")));
    }

private:
    std::unique_ptr<ServiceFixture> m_fixture;
    std::unique_ptr<TestEnvironment> m_environment;
    std::shared_ptr<FakeUserLocaleService> m_locale;
    std::shared_ptr<SpeechSynthesisService> m_service;
};

bool copyFolder(const QString &source, const QString &target)
{
    QDirIterator it(source, QDir::Files, QDirIterator::Subdirectories);
    while (it.hasNext()) {
        const QString file = it.next();
        const QString destination = target + file.mid(source.size());
        if (!QDir().mkpath(QFileInfo(destination).absolutePath()) || !QFile::copy(file, destination)) {
            return false;
        }
    }
    return true;
}

/// What only the bundle service can show: folders and bundles on disk.
class BundleServiceTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void damagedBundlesAreSkippedWithOneLogLine()
    {
        TestEnvironment environment;
        const QString folder = Paths::systemVoicesFolder();
        TestEnvironment::writeVoiceBundle(folder, QStringLiteral("Good"),
            TestEnvironment::voiceAttributes(
                P + QStringLiteral("good"), QStringLiteral("Good"), QStringLiteral("en_US")));
        QDir().mkpath(folder + QStringLiteral("/Empty.SpeechVoice"));
        QDir().mkpath(folder + QStringLiteral("/Garbage.SpeechVoice"));
        QFile garbage(folder + QStringLiteral("/Garbage.SpeechVoice/Info.plist"));
        QVERIFY(garbage.open(QIODevice::WriteOnly));
        garbage.write(QByteArray("\x00\x01 not a plist", 15));
        garbage.close();
        TestEnvironment::writeVoiceBundle(folder, QStringLiteral("Nameless"),
            QVariantMap {{VoiceAttribute::Identifier, QString(P + QStringLiteral("nameless"))}});

        BundleSpeechSynthesisService service;
        QTest::ignoreMessage(
            QtWarningMsg, QRegularExpression(QStringLiteral("Skipping voice bundle .*Empty.SpeechVoice")));
        QTest::ignoreMessage(
            QtWarningMsg, QRegularExpression(QStringLiteral("Skipping voice bundle .*Garbage.SpeechVoice")));
        QTest::ignoreMessage(QtWarningMsg,
            QRegularExpression(
                QStringLiteral("Skipping voice bundle .*Nameless.SpeechVoice: no voice name")));
        const auto voices = service.installedVoices();
        QCOMPARE(voices.size(), 1);
        QCOMPARE(voices.first().identifier, P + QStringLiteral("good"));
        // Cached: asking again neither rescans nor logs again.
        QCOMPARE(service.installedVoices().size(), 1);
    }

    void missingFoldersHoldNoVoices()
    {
        TestEnvironment environment;
        BundleSpeechSynthesisService service;
        QVERIFY(service.installedVoices().isEmpty());
        QVERIFY(service.availableVoices().isEmpty());
        QVERIFY(service.defaultVoice().isEmpty());
    }

    void userFolderShadowsTheSystemFolder()
    {
        TestEnvironment environment;
        TestEnvironment::writeVoiceBundle(Paths::systemVoicesFolder(), QStringLiteral("Orin"),
            TestEnvironment::voiceAttributes(
                P + QStringLiteral("Orin"), QStringLiteral("System Orin"), QStringLiteral("en_US")));
        TestEnvironment::writeVoiceBundle(Paths::userVoicesFolder(), QStringLiteral("Orin"),
            TestEnvironment::voiceAttributes(
                P + QStringLiteral("Orin"), QStringLiteral("User Orin"), QStringLiteral("en_US")));
        BundleSpeechSynthesisService service;
        const auto voices = service.installedVoices();
        QCOMPARE(voices.size(), 1);
        QCOMPARE(
            voices.first().attributes.value(VoiceAttribute::Name).toString(), QStringLiteral("User Orin"));
        QVERIFY(voices.first().bundlePath.startsWith(Paths::userVoicesFolder()));
    }

    void installedBundlesAppearAndRemovedOnesGo()
    {
        TestEnvironment environment;
        const QString folder = Paths::localVoicesFolder();
        TestEnvironment::writeVoiceBundle(folder, QStringLiteral("One"),
            TestEnvironment::voiceAttributes(
                P + QStringLiteral("one"), QStringLiteral("One"), QStringLiteral("en_US")));
        BundleSpeechSynthesisService service;
        QCOMPARE(service.installedVoices().size(), 1);

        // Installers build the bundle aside and rename it in, which changes the folder.
        const QString staging = environment.path(QStringLiteral("staging"));
        const QString built = TestEnvironment::writeVoiceBundle(staging, QStringLiteral("Two"),
            TestEnvironment::voiceAttributes(
                P + QStringLiteral("two"), QStringLiteral("Two"), QStringLiteral("en_US")));
        QVERIFY(QDir().rename(built, folder + QStringLiteral("/Two.SpeechVoice")));
        QCOMPARE(service.installedVoices().size(), 2);

        QVERIFY(QDir(folder + QStringLiteral("/One.SpeechVoice")).removeRecursively());
        const auto voices = service.installedVoices();
        QCOMPARE(voices.size(), 1);
        QCOMPARE(voices.first().identifier, P + QStringLiteral("two"));
    }

    /// Every sample voice, installed or downloadable, must be heard: a voice that renders silence or
    /// nothing is as broken as a missing one.
    void everySampleVoiceSpeaksAudibly_data()
    {
        QTest::addColumn<QString>("folder");
        QTest::addColumn<QString>("bundle");
        for (const QString &folder : {QStringLiteral(CADENZA_SAMPLE_VOICES),
                 QStringLiteral(CADENZA_SAMPLE_REPOSITORY_BUNDLES "/voices")}) {
            const QStringList bundles = QDir(folder).entryList(
                {QStringLiteral("*.SpeechVoice")}, QDir::Dirs | QDir::NoDotAndDotDot, QDir::Name);
            QVERIFY(!bundles.isEmpty());
            for (const QString &bundle : bundles) {
                QTest::newRow(qPrintable(folder.section(QLatin1Char('/'), -1) + QLatin1Char('/') + bundle))
                    << folder << bundle;
            }
        }
    }

    void everySampleVoiceSpeaksAudibly()
    {
        QFETCH(QString, folder);
        QFETCH(QString, bundle);
        TestEnvironment environment;
        const auto voice = BundleSpeechSynthesisService::readBundle(folder + QLatin1Char('/') + bundle);
        QVERIFY(voice);
        QVERIFY(copyFolder(
            folder + QLatin1Char('/') + bundle, Paths::userVoicesFolder() + QLatin1Char('/') + bundle));

        BundleSpeechSynthesisService service;
        const QString path = environment.path(QStringLiteral("voice.wav"));
        QString error;
        QVERIFY2(service.renderToFile(
                     {voice->attributes.value(VoiceAttribute::DemoText).toString(), voice->identifier}, path,
                     &error),
            qPrintable(error));
        const auto audio = WaveFile::read(path, &error);
        QVERIFY2(audio, qPrintable(error));
        QVERIFY2(audio->durationSeconds() > 0.5, qPrintable(QString::number(audio->durationSeconds())));
        QVERIFY2(audio->rootMeanSquare() > 300.0, qPrintable(QString::number(audio->rootMeanSquare())));
    }

    /// espeak-ng knows "en-gb" only as a language; the variant must still reach the voice it finds.
    void languageVoicesKeepTheirVariant()
    {
        TestEnvironment environment;
        const QString folder = Paths::systemVoicesFolder();
        for (const auto &[name, variant] : {std::pair {QStringLiteral("Plain"), QString()},
                 std::pair {QStringLiteral("Whisper"), QStringLiteral("whisper")}}) {
            const QString bundle = TestEnvironment::writeVoiceBundle(folder, name,
                TestEnvironment::voiceAttributes(P + name.toLower(), name, QStringLiteral("en_GB")));
            QVariantMap engine {{QStringLiteral("Voice"), QStringLiteral("en-gb")}};
            if (!variant.isEmpty()) {
                engine.insert(QStringLiteral("Variant"), variant);
            }
            QString error;
            auto info = PropertyList::readFile(bundle + QStringLiteral("/Info.plist"), &error)->toMap();
            info.insert(QStringLiteral("Engine"), engine);
            QFile file(bundle + QStringLiteral("/Info.plist"));
            QVERIFY(file.open(QIODevice::WriteOnly | QIODevice::Truncate));
            file.write(PropertyList::serialize(info));
        }
        BundleSpeechSynthesisService service;
        std::vector<qint16> rendered[2];
        int index = 0;
        for (const QString &name : {QStringLiteral("plain"), QStringLiteral("whisper")}) {
            const QString path = environment.path(name + QStringLiteral(".wav"));
            QString error;
            QVERIFY2(service.renderToFile({QStringLiteral("Good morning."), P + name}, path, &error),
                qPrintable(error));
            const auto audio = WaveFile::read(path, &error);
            QVERIFY2(audio && audio->rootMeanSquare() > 300.0, qPrintable(error));
            rendered[index++] = audio->samples;
        }
        QVERIFY(rendered[0] != rendered[1]);
    }

    void wrongTypesInInfoAreTreatedAsAbsent()
    {
        TestEnvironment environment;
        QVariantMap attributes = TestEnvironment::voiceAttributes(
            P + QStringLiteral("odd"), QStringLiteral("Odd"), QStringLiteral("en_US"));
        attributes.insert(VoiceAttribute::Creator, QStringLiteral("not a number"));
        attributes.insert(VoiceAttribute::Groups, QStringLiteral("not a list"));
        TestEnvironment::writeVoiceBundle(Paths::systemVoicesFolder(), QStringLiteral("Odd"), attributes);
        BundleSpeechSynthesisService service;
        const auto voices = service.installedVoices();
        QCOMPARE(voices.size(), 1);
        QVERIFY(!voices.first().spec);
        QCOMPARE(voices.first().groups, QStringList {SpeechSynthesisService::DefaultVoiceGroup});
    }
};

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    int status = 0;
    SpeechSynthesisServiceContract fake(QStringLiteral("fake"), std::make_unique<FakeFixture>());
    SpeechSynthesisServiceContract bundle(QStringLiteral("bundle"), std::make_unique<BundleFixture>());
    BundleServiceTest bundleOnly;
    status |= QTest::qExec(&fake, argc, argv);
    status |= QTest::qExec(&bundle, argc, argv);
    status |= QTest::qExec(&bundleOnly, argc, argv);
    return status;
}

#include "tst_speechsynthesisservice.moc"
