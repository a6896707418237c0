// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeAdministratorService.h"
#include "FakeInstallerDaemon.h"
#include "FakePowerSourcesInfo.h"
#include "FakeRecognitionService.h"
#include "TestEnvironment.h"

#include "FakeMessagePortService.h"
#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "InProcessNotificationCenter.h"
#include "MemoryPreferencesStore.h"
#include "core/SpeechNames.h"
#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/services/AdministratorService.h"
#include "core/services/PowerSourcesInfo.h"
#include "core/services/RecognitionService.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "core/voices/DownloadableVoice.h"
#include "protocol/InstallerProtocol.h"
#include "protocol/SecureArchiving.h"

#include <QDateTime>
#include <QDir>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::InstallerProtocol;
using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString P = QStringLiteral("com.vendra.speech.synthesis.voice.");
const QString Orin = P + QStringLiteral("Orin");
const QString VoiceDomain = Cadenza::SpeechNames::VoicePreferencesDomain;
const QString RecognitionDomain = Cadenza::SpeechNames::RecognitionPreferencesDomain;

QVariantMap downloadable(
    const QString &name, qint64 desirability, const QString &version = QStringLiteral("1.0"))
{
    return {{QStringLiteral("VoiceAttributes"),
                QVariantMap {{QStringLiteral("VoiceName"), name},
                    {QStringLiteral("VoiceLocaleIdentifier"), QStringLiteral("en_US")},
                    {QStringLiteral("VoiceRelativeDesirability"), desirability}}},
        {QStringLiteral("VoiceByteSize"), qint64(1000)}, {QStringLiteral("VoiceVersion"), version},
        {QStringLiteral("VoiceTag"), QString(QStringLiteral("VOICEID:") + name)},
        {QStringLiteral("FullSizeByteSize"), qint64(5000)},
        {QStringLiteral("FullSizeTagName"), QString(QStringLiteral("VOICEID:full.") + name)},
        {QStringLiteral("FullSizeBundleIdentifier"), QString()},
        {QStringLiteral("FullSizeVersion"), version}};
}

} // namespace

class InstallationManagerTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_speech = std::make_shared<FakeSpeechSynthesisService>();
        m_preferences = std::make_shared<MemoryPreferencesStore>();
        m_ports = std::make_shared<FakeMessagePortService>();
        m_power = std::make_shared<FakePowerSourcesInfo>();
        m_administrator = std::make_shared<FakeAdministratorService>();
        m_recognition = std::make_shared<FakeRecognitionService>();
        Services::setSpeechSynthesis(m_speech);
        Services::setPreferences(m_preferences);
        Services::setMessagePorts(m_ports);
        Services::setPowerSources(m_power);
        Services::setAdministrator(m_administrator);
        Services::setRecognition(m_recognition);
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>());
        Services::setNotifications(std::make_shared<InProcessNotificationCenter>());
        m_daemon = std::make_unique<Testing::FakeInstallerDaemon>(*m_ports);
        m_manager = std::make_unique<CZSpeechInstallationManager>();
        SpeechItemPrivate::setInstallationDictionary(QVariantMap {
            {QStringLiteral("DownloadableVoices"),
                QVariantMap {
                    {P + QStringLiteral("maren.premium"), downloadable(QStringLiteral("Maren Premium"), 8)},
                    {P + QStringLiteral("new.premium"), downloadable(QStringLiteral("New Premium"), 8)},
                    {P + QStringLiteral("have.premium"), downloadable(QStringLiteral("Have Premium"), 8)},
                    {Orin, downloadable(QStringLiteral("Orin"), 10, QStringLiteral("1.3"))}}},
            {QStringLiteral("DownloadableSRLanguages"),
                QVariantMap {{QStringLiteral("r.de"),
                                 QVariantMap {{QStringLiteral("LocaleIdentifier"), QStringLiteral("de_DE")},
                                     {QStringLiteral("Tag"), QStringLiteral("SRCLANGID:de_DE")},
                                     {QStringLiteral("ByteSize"), qint64(300)}}},
                    {QStringLiteral("r.fr"),
                        QVariantMap {{QStringLiteral("LocaleIdentifier"), QStringLiteral("fr_FR")},
                            {QStringLiteral("Tag"), QStringLiteral("SRCLANGID:fr_FR")}}}}}});
        installVoice(QStringLiteral("maren.compact"), QStringLiteral("Maren Compact"), 5);
        installVoice(QStringLiteral("have.premium"), QStringLiteral("Have Premium"), 8);
        installVoice(QStringLiteral("Orin"), QStringLiteral("Orin"), 10, QStringLiteral("1.2"));
    }
    void cleanup()
    {
        SpeechItemPrivate::setInstallationDictionary(std::nullopt);
        m_manager.reset();
        m_daemon.reset();
        m_environment.reset();
    }

    void downloadableVoicesAndTheirStatus()
    {
        m_daemon->setActiveRecords({QVariantMap {{ObjectIDKey, QString(P + QStringLiteral("new.premium"))},
            {ItemDownloadStatusKey, qint64(InstallerProtocol::DownloadingStatus)},
            {ItemPercentCompleteKey, 42.0}}});
        const auto voices = byIdentifier(m_manager->downloadableVoices());
        QVERIFY(!voices.contains(P + QStringLiteral("have.premium"))); // installed
        QCOMPARE(voices.value(P + QStringLiteral("maren.premium"))->downloadStatus(),
            qint64(UpgradeAvailableStatus)); // compact twin installed
        QCOMPARE(
            voices.value(P + QStringLiteral("new.premium"))->downloadStatus(), qint64(DownloadingStatus));
        QCOMPARE(voices.value(P + QStringLiteral("new.premium"))->downloadPercentComplete(), 42.0);
        // The default voice: installed 1.2, catalogue 1.3: an upgrade, always at full size.
        QCOMPARE(voices.value(Orin)->downloadStatus(), qint64(UpgradeAvailableStatus));
        QVERIFY(voices.value(Orin)->downloadFullSize());
        m_daemon->setActiveRecords({});
        QCOMPARE(byIdentifier(m_manager->downloadableVoices())
                     .value(P + QStringLiteral("new.premium"))
                     ->downloadStatus(),
            2);
    }

    void aPlainBaseVoiceMakesThePremiumAnUpgrade()
    {
        // The base voice of "X.premium" is installed when "X" or "X.compact" is: both make an upgrade.
        QCOMPARE(byIdentifier(m_manager->downloadableVoices())
                     .value(P + QStringLiteral("new.premium"))
                     ->downloadStatus(),
            2);
        installVoice(QStringLiteral("new"), QStringLiteral("New"), 5);
        const auto voices = m_manager->downloadableVoices();
        QCOMPARE(byIdentifier(voices).value(P + QStringLiteral("new.premium"))->downloadStatus(),
            qint64(UpgradeAvailableStatus));
        const auto plain = CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("new"));
        QCOMPARE(m_manager->downloadableVoiceUpgradeForVoice(*plain, voices)->identifier(),
            P + QStringLiteral("new.premium"));
        // A voice whose identifier merely begins with the base is another voice, not its twin.
        installVoice(QStringLiteral("newer.compact"), QStringLiteral("Newer Compact"), 5);
        const auto other = CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("newer.compact"));
        QVERIFY(!m_manager->downloadableVoiceUpgradeForVoice(*other, voices));
    }

    void theDefaultVoiceIsListedOnlyWhileOlder()
    {
        installVoice(QStringLiteral("Orin"), QStringLiteral("Orin"), 10, QStringLiteral("1.3"));
        QVERIFY(!byIdentifier(m_manager->downloadableVoices()).contains(Orin));
        installVoice(QStringLiteral("Orin"), QStringLiteral("Orin"), 10, QStringLiteral("1.10"));
        QVERIFY(!byIdentifier(m_manager->downloadableVoices()).contains(Orin)); // 1.10 is newer than 1.3
        installVoice(QStringLiteral("Orin"), QStringLiteral("Orin"), 10, QString()); // version unreadable
        QVERIFY(!byIdentifier(m_manager->downloadableVoices()).contains(Orin));
        m_speech->removeVoice(Orin);
        const auto voices = byIdentifier(m_manager->downloadableVoices());
        QCOMPARE(voices.value(Orin)->downloadStatus(), qint64(NotInstalledStatus));
        QVERIFY(voices.value(Orin)->downloadFullSize());
    }

    void requestsAndTheirGate()
    {
        const auto voices = byIdentifier(m_manager->downloadableVoices());
        const QList<DownloadableVoicePtr> two {
            voices.value(P + QStringLiteral("maren.premium")), voices.value(Orin)};
        QVERIFY(m_manager->startInstallingDownloadableVoices(two, true, 0));
        QCOMPARE(m_daemon->installRequests().size(), 2);
        QCOMPARE(m_daemon->installRequests().at(0).value(ItemNameKey).toString(), QStringLiteral("Maren"));
        QCOMPARE(m_daemon->installRequests().at(0).value(TagNameKey).toString(),
            QStringLiteral("VOICEID:Maren Premium"));
        QCOMPARE(m_daemon->installRequests().at(1).value(TagNameKey).toString(),
            QStringLiteral("VOICEID:full.Orin"));
        QCOMPARE(m_daemon->installRequests().at(1).value(ItemByteSizeKey).toULongLong(), 5000u);
        QVERIFY(m_daemon->installRequests().at(0).value(ClientPortNameKey)
            != m_daemon->installRequests().at(1).value(ClientPortNameKey));
        // The gate lives in the recognition domain, and a zero blocks.
        m_preferences->setValue(QStringLiteral("DoNotDownloadVoices"), 1, RecognitionDomain);
        QVERIFY(m_manager->startInstallingDownloadableVoices(two, false, 0));
        QCOMPARE(m_daemon->installRequests().size(), 4);
        QCOMPARE(
            m_daemon->installRequests().at(2).value(ItemNameKey).toString(), QStringLiteral("Maren Premium"));
        m_preferences->setValue(QStringLiteral("DoNotDownloadVoices"), 0, RecognitionDomain);
        QVERIFY(!m_manager->startInstallingDownloadableVoices(two, false, 0));
        QCOMPARE(m_daemon->installRequests().size(), 4);
        m_preferences->setValue(
            QStringLiteral("DoNotDownloadVoices"), 256, VoiceDomain); // the wrong domain: no effect
    }

    void recognitionLanguages()
    {
        m_recognition->setInstalledLanguages(QStringList {QStringLiteral("fr_FR")});
        m_daemon->setActiveRecords({QVariantMap {{ObjectIDKey, QStringLiteral("de-de")},
            {ItemDownloadStatusKey, qint64(InstallerProtocol::WaitingStatus)}}});
        const auto items = m_manager->downloadableSRLanguageItems();
        QCOMPARE(items.size(), 1);
        QCOMPARE(items.first()->localeIdentifier(), QStringLiteral("de_DE"));
        QCOMPARE(items.first()->downloadStatus(), qint64(WaitingStatus));
        items.first()->setShowCountryInDisplayTitle(true);
        QVERIFY(m_manager->startInstallingDownloadableSpeechItems(items, 1));
        QCOMPARE(m_daemon->installRequests().last().value(ItemNameKey).toString(),
            QStringLiteral("German (Germany)"));
        QCOMPARE(m_daemon->installRequests().last().value(ObjectIDKey).toString(), QStringLiteral("de_DE"));
        QVERIFY(!items.first()->showCountryInDisplayTitle()); // switched off, not restored
        m_preferences->setValue(QStringLiteral("DoNotDownloadLanguages"), false, RecognitionDomain);
        QVERIFY(!m_manager->startInstallingDownloadableSpeechItems(items, 1));
        QVERIFY(!m_manager->downloadableSpeechItemUpgradeForExistingSpeechItem(items.first(), items));
    }

    void upgrades()
    {
        const auto voices = m_manager->downloadableVoices();
        const auto compact = CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("maren.compact"));
        QCOMPARE(m_manager->downloadableVoiceUpgradeForVoice(*compact, voices)->identifier(),
            P + QStringLiteral("maren.premium"));
        const auto orin = CZVoiceObject::initWithVoiceIdentifier(Orin);
        QCOMPARE(m_manager->downloadableVoiceUpgradeForVoice(*orin, voices)->identifier(), Orin);
        installVoice(
            QStringLiteral("maren.compact"), QStringLiteral("Maren Compact"), 8); // as desirable: no upgrade
        QVERIFY(!m_manager->downloadableVoiceUpgradeForVoice(
            *CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("maren.compact")), voices));
    }

    void removalWithRightsLogsTheDate()
    {
        const QString bundle = bundleOf(P + QStringLiteral("have.premium"));
        QVERIFY(QFileInfo(bundle).isDir());
        const double before = double(QDateTime::currentSecsSinceEpoch()) - ReferenceDateOffset - 1;
        m_manager->startRemovingDownloadedSpeechItems(
            {CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("have.premium"))});
        QVERIFY(QFileInfo(bundle).isDir()); // later, on the main thread
        QTRY_VERIFY(!QFileInfo(bundle).exists());
        QCOMPARE(m_administrator->flags(), 3);
        const auto entry
            = m_manager->installationLogEntryForTag(QStringLiteral("VOICEID:Have Premium"), VoiceDomain);
        QVERIFY(entry);
        QVERIFY(entry->value(QStringLiteral("RemovalDate")).toDouble() >= before);
        QVERIFY(!m_manager->installationLogEntryForTag(
            QStringLiteral("VOICEID:Have Premium"))); // the recognition domain
    }

    /// A voice fetched at full size is catalogued as the full size of its compact entry, not under its
    /// own identifier: it is removable all the same, and the log names the full-size tag.
    void aVoiceDownloadedAtFullSizeIsRemovable()
    {
        QVariantMap sized = downloadable(QStringLiteral("Sized Compact"), 4);
        sized.insert(
            QStringLiteral("FullSizeBundleIdentifier"), QString(P + QStringLiteral("sized.premium")));
        SpeechItemPrivate::setInstallationDictionary(QVariantMap {{QStringLiteral("DownloadableVoices"),
            QVariantMap {{P + QStringLiteral("sized.compact"), sized}}}});
        installVoice(QStringLiteral("sized.premium"), QStringLiteral("Sized Premium"), 8);
        const QString bundle = bundleOf(P + QStringLiteral("sized.premium"));
        QVERIFY(QFileInfo(bundle).isDir());
        QString tag;
        QVERIFY(m_manager->bundleForRemovableVoice(
            *CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("sized.premium")), &tag));
        QCOMPARE(tag, QStringLiteral("VOICEID:full.Sized Compact"));
        m_manager->startRemovingDownloadedSpeechItems(
            {CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("sized.premium"))});
        QTRY_VERIFY(!QFileInfo(bundle).exists());
        const auto entry = m_manager->installationLogEntryForTag(
            QStringLiteral("VOICEID:full.Sized Compact"), VoiceDomain);
        QVERIFY(entry && entry->contains(QStringLiteral("RemovalDate")));
        // An identifier that no entry names, not even as a full size, stays unremovable.
        QVERIFY(!m_manager->bundleForRemovableVoice(
            *CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("other.premium")), nullptr));
    }

    void refusedRightsEndTheRemovalSilently()
    {
        m_administrator->setGrants(false);
        const QString bundle = bundleOf(P + QStringLiteral("have.premium"));
        m_manager->startRemovingDownloadedSpeechItems(
            {CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("have.premium"))});
        QTest::qWait(50);
        QVERIFY(QFileInfo(bundle).isDir());
        QVERIFY(!m_manager->installationLogEntryForTag(QStringLiteral("VOICEID:Have Premium"), VoiceDomain));
    }

    void removableBundles()
    {
        QString tag;
        // Not premium, or not in the catalogue: not removable.
        QVERIFY(!m_manager->bundleForRemovableVoice(
            *CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("maren.compact")), &tag));
        // The default voice is removable only when it is at least the catalogue's version.
        QVERIFY(!m_manager->bundleForRemovableVoice(*CZVoiceObject::initWithVoiceIdentifier(Orin), &tag));
        installVoice(QStringLiteral("Orin"), QStringLiteral("Orin"), 10, QStringLiteral("1.3"));
        QVERIFY(m_manager->bundleForRemovableVoice(*CZVoiceObject::initWithVoiceIdentifier(Orin), &tag));
        QCOMPARE(tag, QStringLiteral("VOICEID:Orin"));
        // A recognition language with a fallback is looked up under the fallback's name.
        const QString recognizer
            = Paths::userRecognizersFolder() + QStringLiteral("/en_US.SpeechRecognition");
        QDir().mkpath(recognizer);
        m_recognition->addBundle(recognizer, QStringLiteral("r.us"), QStringLiteral("en_US"));
        auto item = CZSRLanguageItem::initWithLocaleIdentifier(QStringLiteral("en_IN"));
        QVERIFY(!m_manager->bundleForRemovableLanguage(*item, nullptr));
        item->setFallbackLocaleIdentifier(QStringLiteral("en_US"));
        QCOMPARE(
            m_manager->bundleForRemovableLanguage(*item, nullptr).value_or(SpeechBundle()).path, recognizer);
        QVERIFY(m_manager->onDiskVersionForBundlePath(QStringLiteral("/nonexistent")).isNull());
    }

    void backgroundDownloadRules()
    {
        const QString compact = P + QStringLiteral("maren.compact");
        const QString tag = QStringLiteral("VOICEID:Maren Premium");
        m_power->setState(PowerSourcesInfo::BatteryPower);
        QVERIFY(!m_manager->startDownloadingHighestQualityIfNecessaryForVoiceIdentifier(compact));
        QCOMPARE(
            m_manager->highestQualityVoiceIdentifierForRootVoiceIdentifier(P + QStringLiteral("maren"), true),
            compact);
        QVERIFY(m_daemon->installRequests().isEmpty());

        m_power->setPowerSources(std::nullopt); // no information: mains
        QVERIFY(m_manager->isRunningOnACPower());
        QVERIFY(m_manager->startDownloadingHighestQualityIfNecessaryForVoiceIdentifier(
            P + QStringLiteral("x.premium")));
        QVERIFY(m_daemon->installRequests().isEmpty());

        setLog(tag, {{QStringLiteral("BackgroundAttempts"), 4}});
        QVERIFY(!m_manager->startDownloadingHighestQualityIfNecessaryForVoiceIdentifier(compact));
        setLog(tag, {{QStringLiteral("LastBackgroundAttemptDate"), now() - 94 * 3600.0}});
        QVERIFY(!m_manager->startDownloadingHighestQualityIfNecessaryForVoiceIdentifier(compact));
        setLog(tag, {{QStringLiteral("RemovalDate"), now()}});
        QVERIFY(!m_manager->startDownloadingHighestQualityIfNecessaryForVoiceIdentifier(compact));
        setLog(tag, {{QStringLiteral("AutoAttemptProhibited"), true}});
        QVERIFY(!m_manager->startDownloadingHighestQualityIfNecessaryForVoiceIdentifier(compact));
        QVERIFY(m_daemon->installRequests().isEmpty());

        setLog(tag,
            {{QStringLiteral("BackgroundAttempts"), 3},
                {QStringLiteral("LastBackgroundAttemptDate"), now() - 342000.0 - 5},
                {QStringLiteral("AutoAttemptProhibited"), QStringLiteral("yes")}});
        QVERIFY(m_manager->startDownloadingHighestQualityIfNecessaryForVoiceIdentifier(compact));
        QCOMPARE(m_daemon->installRequests().size(), 1);
        QCOMPARE(m_daemon->installRequests().first().value(UserInteractionModeKey).toLongLong(), 1);
        QCOMPARE(m_daemon->installRequests().first().value(ItemNameKey).toString(), QStringLiteral("Maren"));

        // Already running: no second request.
        m_daemon->setActiveRecords({QVariantMap {{ObjectIDKey, QString(P + QStringLiteral("maren.premium"))},
            {ItemDownloadStatusKey, qint64(InstallerProtocol::DownloadingStatus)}}});
        QVERIFY(m_manager->startDownloadingHighestQualityIfNecessaryForVoiceIdentifier(compact));
        QCOMPARE(m_daemon->installRequests().size(), 1);
    }

    void prohibitionFlag()
    {
        const auto voice
            = byIdentifier(m_manager->downloadableVoices()).value(P + QStringLiteral("maren.premium"));
        QVERIFY(!m_manager->isAutoDownloadProhibitedForDownloadableVoiceObject(*voice));
        m_manager->markDownloadableVoiceObject(*voice, true);
        QVERIFY(m_manager->isAutoDownloadProhibitedForDownloadableVoiceObject(*voice));
        QVERIFY(!m_manager->startDownloadingHighestQualityIfNecessaryForVoiceIdentifier(
            P + QStringLiteral("maren.compact")));
        m_manager->markDownloadableVoiceObject(*voice, false);
        QVERIFY(!m_manager->isAutoDownloadProhibitedForDownloadableVoiceObject(*voice));
    }

    void highestQualityStartsTheUpgradeOnMains()
    {
        QCOMPARE(
            m_manager->highestQualityVoiceIdentifierForRootVoiceIdentifier(P + QStringLiteral("maren"), true),
            P + QStringLiteral("maren.compact"));
        QCOMPARE(m_daemon->installRequests().size(), 1);
        QVERIFY(m_manager->highestQualityVoiceIdentifierForRootVoiceIdentifier(QString(), true).isNull());
        QCOMPARE(
            m_manager->highestQualityVoiceIdentifierForRootVoiceIdentifier(P + QStringLiteral("have"), false),
            P + QStringLiteral("have.premium"));
    }

    void languageDataNeeds()
    {
        m_recognition->setInstalledLanguages(QStringList {QStringLiteral("fr_FR")});
        m_daemon->setActiveRecords({QVariantMap {{ObjectIDKey, QStringLiteral("de_DE")}}});
        QVERIFY(!m_manager->doesLanguageDataNeedToBeDownloadedForLocaleIdentifier(QStringLiteral("fr-fr")));
        QVERIFY(!m_manager->doesLanguageDataNeedToBeDownloadedForLocaleIdentifier(QStringLiteral("de_DE")));
        QVERIFY(m_manager->doesLanguageDataNeedToBeDownloadedForLocaleIdentifier(QStringLiteral("ja_JP")));
    }

private:
    void installVoice(const QString &suffix, const QString &name, qint64 desirability,
        const QString &version = QStringLiteral("1.0"))
    {
        const QString identifier = P + suffix;
        QVariantMap attributes = TestEnvironment::voiceAttributes(identifier, name, QStringLiteral("en_US"));
        attributes.insert(QStringLiteral("VoiceRelativeDesirability"), desirability);
        const QString bundle = TestEnvironment::writeVoiceBundle(
            Paths::userVoicesFolder(), QString(name).remove(QLatin1Char(' ')), attributes);
        QFile info(bundle + QStringLiteral("/Info.plist"));
        QVERIFY(info.open(QIODevice::WriteOnly));
        QVariantMap plist {{QStringLiteral("VoiceAttributes"), attributes}};
        if (!version.isNull()) {
            plist.insert(QStringLiteral("BundleVersion"), version);
        }
        info.write(PropertyList::serialize(plist));
        info.close();
        QString error;
        auto voice = VoiceDescription::fromInfo(plist, &error);
        voice->bundlePath = bundle;
        m_speech->addVoice(*voice);
    }
    QString bundleOf(const QString &identifier) { return m_speech->voice(identifier)->bundlePath; }
    static QHash<QString, DownloadableVoicePtr> byIdentifier(const QList<DownloadableVoicePtr> &voices)
    {
        QHash<QString, DownloadableVoicePtr> map;
        for (const auto &v : voices) {
            map.insert(v->identifier(), v);
        }
        return map;
    }
    void setLog(const QString &tag, const QVariantMap &entry)
    {
        m_preferences->setValue(
            QStringLiteral("SpeechDataInstallationLog"), QVariantMap {{tag, entry}}, VoiceDomain);
    }
    static double now() { return double(QDateTime::currentMSecsSinceEpoch()) / 1000.0 - ReferenceDateOffset; }

    std::unique_ptr<TestEnvironment> m_environment;
    std::shared_ptr<FakeSpeechSynthesisService> m_speech;
    std::shared_ptr<MemoryPreferencesStore> m_preferences;
    std::shared_ptr<FakeMessagePortService> m_ports;
    std::shared_ptr<FakePowerSourcesInfo> m_power;
    std::shared_ptr<FakeAdministratorService> m_administrator;
    std::shared_ptr<FakeRecognitionService> m_recognition;
    std::unique_ptr<Testing::FakeInstallerDaemon> m_daemon;
    std::unique_ptr<CZSpeechInstallationManager> m_manager;
};

QTEST_GUILESS_MAIN(InstallationManagerTest)
#include "tst_installationmanager.moc"
