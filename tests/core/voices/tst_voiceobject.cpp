// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "InProcessNotificationCenter.h"
#include "MemoryPreferencesStore.h"
#include "core/SpeechNames.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "core/voices/CZVoiceObject.h"
#include "core/voices/DownloadableVoice.h"

#include <QProcess>
#include <QSignalSpy>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString P = QStringLiteral("com.vendra.speech.synthesis.voice.");

QStringList identifiers(const QList<CZVoiceObjectPtr> &voices)
{
    QStringList out;
    for (const auto &v : voices) {
        out.append(v->identifier().mid(P.size()));
    }
    return out;
}
} // namespace

class VoiceObjectTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_locale = std::make_shared<FakeUserLocaleService>(
            QStringList {QStringLiteral("en_US")}, QStringLiteral("en_US"));
        m_speech = std::make_shared<FakeSpeechSynthesisService>();
        m_preferences = std::make_shared<MemoryPreferencesStore>();
        m_notifications = std::make_shared<InProcessNotificationCenter>();
        Services::setUserLocale(m_locale);
        Services::setSpeechSynthesis(m_speech);
        Services::setPreferences(m_preferences);
        Services::setNotifications(m_notifications);
        SpeechItemPrivate::resetConversionLocale();
    }
    void cleanup()
    {
        SpeechItemPrivate::resetConversionLocale();
        m_environment.reset();
    }

    void rootNames_data()
    {
        QTest::addColumn<QString>("name");
        QTest::addColumn<QString>("root");
        QTest::addColumn<QString>("expected");
        QTest::newRow("compact") << "Orin Compact" << QString() << "Orin";
        QTest::newRow("premium") << "Maren Premium" << QString() << "Maren";
        QTest::newRow("other") << "Tobias (Enhanced)" << QString() << "Tobias (Enhanced)";
        QTest::newRow("given root") << "Orin Compact"
                                    << "Orin the Voice"
                                    << "Orin the Voice";
        QTest::newRow("shorter than the cut") << "Premium" << QString() << "";
        QTest::newRow("no blank") << "XPremium" << QString() << "";
    }
    void rootNames()
    {
        QFETCH(QString, name);
        QFETCH(QString, root);
        QFETCH(QString, expected);
        QVariantMap attributes
            = TestEnvironment::voiceAttributes(P + QStringLiteral("v"), name, QStringLiteral("en_US"));
        if (!root.isNull()) {
            attributes.insert(QStringLiteral("VoiceNameRoot"), root);
        }
        m_speech->addVoice(attributes);
        QCOMPARE(
            CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("v"))->displayNameRoot(), expected);
    }

    void compactVoicesInheritThePremiumChoice()
    {
        addVoice(QStringLiteral("maren"), QStringLiteral("Maren"), QStringLiteral("en_US"));
        addVoice(QStringLiteral("maren.compact"), QStringLiteral("Maren Compact"), QStringLiteral("en_US"));
        addVoice(QStringLiteral("maren.premium"), QStringLiteral("Maren Premium"), QStringLiteral("en_US"));
        CZVoiceObject::setVisibleVoicesTable(
            {{P + QStringLiteral("maren.premium"), 0}, {P + QStringLiteral("x"), QStringLiteral("1")}});
        // An identifier with neither ending takes the premium entry; one with an ending never does.
        QCOMPARE(CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("maren"))->visibility(), 0);
        QCOMPARE(
            CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("maren.compact"))->visibility(), 2);
        QCOMPARE(
            CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("maren.premium"))->visibility(), 0);
        CZVoiceObject::setVisibleVoicesTable({{P + QStringLiteral("maren"), QStringLiteral("1")}});
        QCOMPARE(CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("maren"))->visibility(),
            2); // not a number
    }

    void theTableIsWrittenSynchronisedAndAnnounced()
    {
        QVERIFY(!CZVoiceObject::visibleVoicesTable());
        QSignalSpy posted(m_notifications.get(), &DistributedNotificationCenter::notificationPosted);
        const int before = m_preferences->synchronizeCount();
        CZVoiceObject::setVisibleVoicesTable({{P + QStringLiteral("a"), 1}});
        QVERIFY(m_preferences->synchronizeCount() > before);
        QCOMPARE(m_preferences->backing()
                     ->value(Cadenza::SpeechNames::VoicePreferencesDomain)
                     .value(QStringLiteral("VisibleIdentifiers"))
                     .toMap()
                     .size(),
            1);
        QVERIFY(posted.wait(1000));
        QCOMPARE(posted.first().at(0).toString(), Cadenza::SpeechNames::DefaultVoiceChangedNotification);
        QVERIFY(posted.first().at(1).toString().isEmpty());
    }

    void anotherProcessSeesTheTable()
    {
        Services::setPreferences(nullptr); // the real files of this test's private world
        QProcess writer;
        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        environment.insert(QStringLiteral("CADENZA_TEST_WRITE_TABLE"), P + QStringLiteral("shown"));
        writer.setProcessEnvironment(environment);
        writer.start(QCoreApplication::applicationFilePath(), {});
        QVERIFY(writer.waitForFinished(30000));
        QCOMPARE(writer.exitCode(), 0);
        const auto table = CZVoiceObject::visibleVoicesTable();
        QVERIFY(table);
        QCOMPARE(table->value(P + QStringLiteral("shown")).toInt(), 1);
    }

    void localeRules()
    {
        addVoice(QStringLiteral("plain"), QStringLiteral("Plain"), QStringLiteral("en"));
        const auto voice = CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("plain"));
        QVERIFY(CZVoiceObject::isSameLocaleIdentifier(voice->localeIdentifier(), QStringLiteral("en")));
        QVERIFY(!CZVoiceObject::isSameLocaleIdentifier(voice->localeIdentifier(), QStringLiteral("en_US")));
        QVERIFY(CZVoiceObject::isSameLangaugeFromLocaleIdentifier(
            voice->localeIdentifier(), QStringLiteral("en_US")));
        QCOMPARE(voice->countryDisplayString(), QStringLiteral("English")); // no country: the language's name
        QVERIFY(voice->countryIdentifier().isNull());
        // Without a locale attribute, the language attribute; without both, en_US.
        m_speech->addVoice(
            QVariantMap {{QStringLiteral("VoiceIdentifier"), QString(P + QStringLiteral("lang"))},
                {QStringLiteral("VoiceName"), QStringLiteral("Lang")},
                {QStringLiteral("VoiceLanguage"), QStringLiteral("de")}});
        m_speech->addVoice(
            QVariantMap {{QStringLiteral("VoiceIdentifier"), QString(P + QStringLiteral("none"))},
                {QStringLiteral("VoiceName"), QStringLiteral("None")}});
        QCOMPARE(CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("lang"))->localeIdentifier(),
            QStringLiteral("de"));
        QCOMPARE(CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("none"))->localeIdentifier(),
            QStringLiteral("en_US"));
    }

    void systemLocale()
    {
        m_locale->setPreferredLanguages({QStringLiteral("fr"), QStringLiteral("en_US")});
        m_locale->setCurrentLocaleIdentifier(QStringLiteral("de_CH"));
        QCOMPARE(CZVoiceObject::systemLocaleIdentifier(), QStringLiteral("fr_CH"));
        m_locale->setPreferredLanguages({QStringLiteral("fr_BE")});
        QCOMPARE(CZVoiceObject::systemLocaleIdentifier(), QStringLiteral("fr_BE"));
        m_speech->setSpeechLanguageLocale(QStringLiteral("ja_JP"));
        QCOMPARE(CZVoiceObject::systemLocaleIdentifier(), QStringLiteral("ja_JP"));
    }

    void theMenuFilterFallsBackToEnglish()
    {
        // The user speaks Japanese; no voice does. The default voice is listed whatever the rules say.
        m_locale->setPreferredLanguages({QStringLiteral("ja_JP")});
        QVariantMap us = TestEnvironment::voiceAttributes(
            P + QStringLiteral("us"), QStringLiteral("Us"), QStringLiteral("en_US"));
        us.insert(QStringLiteral("VoiceCreator"), 3);
        us.insert(QStringLiteral("VoiceID"), 4);
        m_speech->addVoice(us);
        m_preferences->setValue(
            Cadenza::SpeechNames::SelectedVoiceCreatorKey, 3, Cadenza::SpeechNames::VoicePreferencesDomain);
        m_preferences->setValue(
            Cadenza::SpeechNames::SelectedVoiceIDKey, 4, Cadenza::SpeechNames::VoicePreferencesDomain);
        addVoice(QStringLiteral("gb"), QStringLiteral("Gb"), QStringLiteral("en_GB"));
        addVoice(QStringLiteral("de"), QStringLiteral("De"), QStringLiteral("de_DE"));
        QCOMPARE(
            identifiers(CZVoiceObject::visibleVoicesForLocaleIdentifier(QStringLiteral("ja_JP"), {}, false)),
            QStringList {QStringLiteral("us")});
        // One voice of the language, of another country: the language's voices, and no English stand-in.
        m_locale->setPreferredLanguages({QStringLiteral("de_AT")});
        addVoice(QStringLiteral("at2"), QStringLiteral("At2"), QStringLiteral("de_CH"));
        QCOMPARE(
            identifiers(CZVoiceObject::visibleVoicesForLocaleIdentifier(QStringLiteral("de_AT"), {}, false)),
            QStringList({QStringLiteral("at2"), QStringLiteral("de"), QStringLiteral("us")}));
        // With an exact match, only voices of exactly the system locale are automatic.
        QCOMPARE(
            identifiers(CZVoiceObject::visibleVoicesForLocaleIdentifier(QStringLiteral("de_CH"), {}, false)),
            QStringList {QStringLiteral("us")});
    }

    void theMenuFilterKeepsChoicesDefaultsAndRequests()
    {
        m_locale->setPreferredLanguages({QStringLiteral("en_US")});
        addVoice(QStringLiteral("Orin"), QStringLiteral("Orin"), QStringLiteral("en_US"));
        addVoice(QStringLiteral("us"), QStringLiteral("Us"), QStringLiteral("en_US"));
        addVoice(QStringLiteral("full"), QStringLiteral("Full"), QStringLiteral("en_US"), true);
        addVoice(QStringLiteral("fr"), QStringLiteral("Fr"), QStringLiteral("fr_FR"));
        addVoice(QStringLiteral("it"), QStringLiteral("It"), QStringLiteral("it_IT"));
        CZVoiceObject::setVisibleVoicesTable(
            {{P + QStringLiteral("Orin"), 0}, {P + QStringLiteral("fr"), 1}, {P + QStringLiteral("us"), 0}});
        // Orin is hidden but is the default; "it" is required; "full" is automatic but full-list only.
        QCOMPARE(identifiers(CZVoiceObject::visibleVoicesForLocaleIdentifier(
                     QStringLiteral("en_US"), {P + QStringLiteral("it")}, false)),
            QStringList({QStringLiteral("Orin"), QStringLiteral("fr"), QStringLiteral("it")}));
    }

    void search()
    {
        addVoice(QStringLiteral("f"), QStringLiteral("Maren"), QStringLiteral("en_US"));
        const auto voice = CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("f"));
        QVERIFY(voice->matchesSearchString(QStringLiteral("fem en")));
        QVERIFY(voice->matchesSearchString(QStringLiteral("mar  united")));
        QVERIFY(!voice->matchesSearchString(QStringLiteral("fem de")));
        QVERIFY(!voice->matchesSearchString(QStringLiteral("male"))); // "male" sits inside "Female"
        QVERIFY(voice->matchesSearchString(QString()));
        QVERIFY(voice->matchesSearchString(QStringLiteral("   ")));
    }

    void textsAndOrder()
    {
        addVoice(QStringLiteral("v2"), QStringLiteral("Voice 2"), QStringLiteral("en_GB"));
        addVoice(QStringLiteral("v10"), QStringLiteral("voice 10"), QStringLiteral("en_GB"));
        const auto two = CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("v2"));
        const auto ten = CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("v10"));
        QVERIFY(two->compare(*ten) < 0);
        QCOMPARE(two->genderDisplayString(), QStringLiteral("Female"));
        QCOMPARE(two->description(),
            QStringLiteral(
                "Name: Voice 2, Identifier: %1v2, Locale: en_GB, Language: English, Country: United Kingdom, "
                "Gender: Female, Download: 0 (0.000000)")
                .arg(P));
        m_speech->addVoice(
            QVariantMap {{QStringLiteral("VoiceIdentifier"), QString(P + QStringLiteral("odd"))},
                {QStringLiteral("VoiceName"), QStringLiteral("Odd")},
                {QStringLiteral("VoiceGender"), QStringLiteral("Robot")},
                {QStringLiteral("VoiceRelativeDesirability"), QStringLiteral("9")}});
        const auto odd = CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("odd"));
        QVERIFY(odd->genderDisplayString().isNull());
        QCOMPARE(odd->relativeDesirability(), 0);
        QVERIFY(!odd->showsInFullListOnly());
    }

    void downloadableVoicesComeFromTheCatalogue()
    {
        CZVoiceObject::setVisibleVoicesTable(
            {{P + QStringLiteral("new.premium"), 1}, {P + QStringLiteral("twin.premium"), 0}});
        const QVariantMap entry {
            {QStringLiteral("VoiceAttributes"),
                QVariantMap {{QStringLiteral("VoiceIdentifier"), QStringLiteral("wrong")},
                    {QStringLiteral("VoiceName"), QStringLiteral("New Premium")},
                    {QStringLiteral("VoiceLocaleIdentifier"), QStringLiteral("sv_SE")}}},
            {QStringLiteral("VoiceByteSize"), qint64(1500000)},
            {QStringLiteral("VoiceVersion"), QStringLiteral("1.0")},
            {QStringLiteral("VoiceTag"), QStringLiteral("VOICEID:new")},
            {QStringLiteral("FullSizeByteSize"), QStringLiteral("big")},
            {QStringLiteral("FullSizeTagName"), QStringLiteral("VOICEID:new.full")}};
        const auto voice = DownloadableVoice::initWithVoiceID(P + QStringLiteral("new.premium"), entry);
        QVERIFY(voice);
        QVERIFY(voice->isDownloadable());
        QCOMPARE(voice->identifier(), P + QStringLiteral("new.premium"));
        QCOMPARE(voice->visibility(), 1);
        QCOMPARE(voice->byteSize(), 1500000u);
        QCOMPARE(voice->displayedSize(), QStringLiteral("2 MB"));
        QCOMPARE(voice->fullSizeByteSize(), 0u);
        QCOMPARE(voice->tagName(), QStringLiteral("VOICEID:new"));
        QVERIFY(voice->variant().isNull());
        QCOMPARE(voice->displayNameRoot(), QStringLiteral("New"));
        // No premium fallback for a compact download.
        QCOMPARE(DownloadableVoice::initWithVoiceID(P + QStringLiteral("twin"), entry)->visibility(), 2);
        QVERIFY(
            !DownloadableVoice::initWithVoiceID(P + QStringLiteral("x"), QStringLiteral("not a dictionary")));
    }

private:
    void addVoice(
        const QString &suffix, const QString &name, const QString &locale, bool fullListOnly = false)
    {
        QVariantMap attributes = TestEnvironment::voiceAttributes(P + suffix, name, locale);
        if (fullListOnly) {
            attributes.insert(QStringLiteral("VoiceShowInFullListOnly"), true);
        }
        m_speech->addVoice(attributes);
    }

    std::unique_ptr<TestEnvironment> m_environment;
    std::shared_ptr<FakeUserLocaleService> m_locale;
    std::shared_ptr<FakeSpeechSynthesisService> m_speech;
    std::shared_ptr<MemoryPreferencesStore> m_preferences;
    std::shared_ptr<InProcessNotificationCenter> m_notifications;
};

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const QString writeTable = qEnvironmentVariable("CADENZA_TEST_WRITE_TABLE");
    if (!writeTable.isEmpty()) {
        // The second process of anotherProcessSeesTheTable(): the real preference files.
        Services::setNotifications(std::make_shared<InProcessNotificationCenter>());
        CZVoiceObject::setVisibleVoicesTable({{writeTable, 1}});
        return 0;
    }
    VoiceObjectTest test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_voiceobject.moc"
