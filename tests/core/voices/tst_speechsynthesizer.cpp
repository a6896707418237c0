// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "MemoryPreferencesStore.h"
#include "core/SpeechNames.h"
#include "core/services/Services.h"
#include "core/voices/SpeechSynthesizer.h"

#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString P = QStringLiteral("com.vendra.speech.synthesis.voice.");
const QString Domain = Cadenza::SpeechNames::VoicePreferencesDomain;
// 40 characters: long enough for prefix matching.
const QString X = QStringLiteral("com.vendra.speech.synthesis.voice.x12345");
} // namespace

class SpeechSynthesizerTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_service = std::make_shared<FakeSpeechSynthesisService>();
        m_preferences = std::make_shared<MemoryPreferencesStore>();
        m_locale = std::make_shared<FakeUserLocaleService>();
        Services::setSpeechSynthesis(m_service);
        Services::setPreferences(m_preferences);
        Services::setUserLocale(m_locale);
        auto add = [&](const QString &suffix, const QString &name, const QString &locale, int id) {
            QVariantMap attributes = TestEnvironment::voiceAttributes(P + suffix, name, locale);
            attributes.insert(QStringLiteral("VoiceCreator"), 5);
            attributes.insert(QStringLiteral("VoiceID"), id);
            m_service->addVoice(attributes);
        };
        add(QStringLiteral("Orin"), QStringLiteral("Orin"), QStringLiteral("en_US"), 1);
        add(QStringLiteral("maren.compact"), QStringLiteral("Maren Compact"), QStringLiteral("en_US"), 2);
        add(QStringLiteral("maren.premium"), QStringLiteral("Maren Premium"), QStringLiteral("en_US"), 3);
        add(QStringLiteral("liesel.compact"), QStringLiteral("Liesel Compact"), QStringLiteral("de_DE"), 4);
    }
    void cleanup() { m_environment.reset(); }

    void enumeration()
    {
        QCOMPARE(SpeechSynthesizer::allVoices(),
            QStringList({P + QStringLiteral("Orin"), P + QStringLiteral("liesel.compact"),
                P + QStringLiteral("maren.compact"), P + QStringLiteral("maren.premium")}));
        QCOMPARE(SpeechSynthesizer::avaliableMainstreamVoices(),
            QStringList({P + QStringLiteral("Orin"), P + QStringLiteral("liesel.compact"),
                P + QStringLiteral("maren.premium")}));
    }

    void defaultVoiceFollowsTheStoredSpec()
    {
        m_preferences->setValue(Cadenza::SpeechNames::SelectedVoiceCreatorKey, 5, Domain);
        m_preferences->setValue(Cadenza::SpeechNames::SelectedVoiceIDKey, 2, Domain);
        QVERIFY(m_preferences->synchronize(Domain));
        QCOMPARE(SpeechSynthesizer::defaultVoiceFromAllVoices(), P + QStringLiteral("maren.compact"));
        // The ordinary default names the same voice in its best quality.
        QCOMPARE(SpeechSynthesizer::defaultVoiceFromMainstreamVoices(), P + QStringLiteral("maren.premium"));
    }

    void absentVoiceIdCountsAsZero()
    {
        QVariantMap attributes = TestEnvironment::voiceAttributes(
            P + QStringLiteral("zero"), QStringLiteral("Zero"), QStringLiteral("en_US"));
        attributes.insert(QStringLiteral("VoiceCreator"), 9);
        attributes.insert(QStringLiteral("VoiceID"), 0);
        m_service->addVoice(attributes);
        m_preferences->setValue(Cadenza::SpeechNames::SelectedVoiceCreatorKey, 9, Domain);
        QVERIFY(m_preferences->synchronize(Domain));
        QCOMPARE(SpeechSynthesizer::defaultVoiceFromAllVoices(), P + QStringLiteral("zero"));
    }

    void withoutAStoredSpecTheSpeechLanguageDecides()
    {
        m_service->setSpeechLanguageLocale(QStringLiteral("de_DE"));
        QCOMPARE(SpeechSynthesizer::defaultVoiceFromAllVoices(), P + QStringLiteral("liesel.compact"));
        m_service->setSpeechLanguageLocale(std::nullopt);
        m_locale->setPreferredLanguages({QStringLiteral("en_US")});
        QCOMPARE(SpeechSynthesizer::defaultVoiceFromAllVoices(), P + QStringLiteral("maren.premium"));
    }

    void defaultVoiceFollowsEveryChange()
    {
        // Each question is asked twice: the second answer is the remembered one, and must agree.
        auto ask = [] {
            const QString first = SpeechSynthesizer::defaultVoiceFromAllVoices();
            const QString again = SpeechSynthesizer::defaultVoiceFromAllVoices();
            return first == again ? first : QStringLiteral("differs: %1 %2").arg(first, again);
        };
        m_service->setSpeechLanguageLocale(QStringLiteral("de_DE"));
        QCOMPARE(ask(), P + QStringLiteral("liesel.compact"));
        // A preference change is a new question.
        m_preferences->setValue(QStringLiteral("SelectedVoiceCreator"), 5, Domain);
        m_preferences->setValue(QStringLiteral("SelectedVoiceID"), 2, Domain);
        QVERIFY(m_preferences->synchronize(Domain));
        QCOMPARE(ask(), P + QStringLiteral("maren.compact"));
        m_preferences->setValue(QStringLiteral("SelectedVoiceID"), 3, Domain);
        QVERIFY(m_preferences->synchronize(Domain));
        QCOMPARE(ask(), P + QStringLiteral("maren.premium"));
        m_preferences->setValue(QStringLiteral("SelectedVoiceCreator"), QVariant(), Domain);
        QVERIFY(m_preferences->synchronize(Domain));
        QCOMPARE(ask(), P + QStringLiteral("liesel.compact"));
        // So is another speech language, or with none, another first language of the user.
        m_service->setSpeechLanguageLocale(std::nullopt);
        m_locale->setPreferredLanguages({QStringLiteral("de_DE")});
        QCOMPARE(ask(), P + QStringLiteral("liesel.compact"));
        m_locale->setPreferredLanguages({QStringLiteral("en_US")});
        QCOMPARE(ask(), P + QStringLiteral("maren.premium"));
        // A change of the installed voices forgets the answers.
        QVariantMap attributes = TestEnvironment::voiceAttributes(
            P + QStringLiteral("Ava.premium"), QStringLiteral("Ava"), QStringLiteral("en_US"));
        attributes.insert(VoiceAttribute::RelativeDesirability, 9000);
        m_service->addVoice(attributes);
        QCOMPARE(ask(), P + QStringLiteral("Ava.premium"));
        m_service->removeVoice(P + QStringLiteral("Ava.premium"));
        QCOMPARE(ask(), P + QStringLiteral("maren.premium"));
    }

    void storedSpecOfNoVoiceFallsThrough()
    {
        m_preferences->setValue(Cadenza::SpeechNames::SelectedVoiceCreatorKey, 5, Domain);
        m_preferences->setValue(Cadenza::SpeechNames::SelectedVoiceIDKey, 99, Domain);
        QVERIFY(m_preferences->synchronize(Domain));
        m_service->setSpeechLanguageLocale(QStringLiteral("de_DE"));
        QCOMPARE(SpeechSynthesizer::defaultVoiceFromAllVoices(), P + QStringLiteral("liesel.compact"));
    }

    void storedSpecOfTheWrongTypeIsIgnored()
    {
        m_preferences->setValue(Cadenza::SpeechNames::SelectedVoiceCreatorKey, QStringLiteral("5"), Domain);
        m_preferences->setValue(Cadenza::SpeechNames::SelectedVoiceIDKey, 2, Domain);
        QVERIFY(m_preferences->synchronize(Domain));
        m_service->setSpeechLanguageLocale(QStringLiteral("de_DE"));
        QCOMPARE(SpeechSynthesizer::defaultVoiceFromAllVoices(), P + QStringLiteral("liesel.compact"));
    }

    void resolution_data()
    {
        QTest::addColumn<QString>("identifier");
        QTest::addColumn<QStringList>("voices");
        QTest::addColumn<QString>("expected");
        const QString compact = X + QStringLiteral(".compact");
        const QString premium = X + QStringLiteral(".premium");
        const QString other = X + QStringLiteral(".other");
        QTest::newRow("exact beats longer") << X << QStringList {premium, X, compact} << X;
        QTest::newRow("second premium") << X << QStringList {compact, premium} << premium;
        QTest::newRow("premium first") << X << QStringList {premium, compact} << premium;
        QTest::newRow("second not premium") << X << QStringList {compact, other} << compact;
        QTest::newRow("third premium ignored") << X << QStringList {compact, other, premium} << compact;
        QTest::newRow("single prefix") << X << QStringList {other} << other;
        QTest::newRow("none") << X << QStringList {P + QStringLiteral("Orin")} << QString();
        QTest::newRow("short prefix")
            << QStringLiteral("com.vendra.speech.s") << QStringList {compact, premium} << QString();
        QTest::newRow("35 characters") << X.left(35) << QStringList {compact} << QString();
        QTest::newRow("36 characters") << X.left(36) << QStringList {compact} << compact;
        QTest::newRow("null") << QString() << QStringList {compact} << QString();
        QTest::newRow("empty list") << X << QStringList {} << QString();
    }
    void resolution()
    {
        QFETCH(QString, identifier);
        QFETCH(QStringList, voices);
        QFETCH(QString, expected);
        const QString resolved = SpeechSynthesizer::resolveVoiceIdentifier(identifier, voices);
        QCOMPARE(resolved, expected);
        QCOMPARE(resolved.isNull(), expected.isNull());
    }

private:
    std::unique_ptr<TestEnvironment> m_environment;
    std::shared_ptr<FakeSpeechSynthesisService> m_service;
    std::shared_ptr<MemoryPreferencesStore> m_preferences;
    std::shared_ptr<FakeUserLocaleService> m_locale;
};

QTEST_GUILESS_MAIN(SpeechSynthesizerTest)
#include "tst_speechsynthesizer.moc"
