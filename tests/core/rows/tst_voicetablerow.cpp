// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "InProcessNotificationCenter.h"
#include "MemoryPreferencesStore.h"
#include "core/locale/LocalizationTable.h"
#include "core/rows/VoiceTableRow.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "core/voices/DownloadableVoice.h"
#include "protocol/InstallerProtocol.h"

#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString P = QStringLiteral("v.");

QStringList titles(const QList<VoiceTableRowPtr> &rows)
{
    QStringList out;
    for (const auto &row : rows) {
        out.append(row->isGroupRow() ? QStringLiteral("# ") + row->title() : row->title());
    }
    return out;
}
} // namespace

class VoiceTableRowTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_speech = std::make_shared<FakeSpeechSynthesisService>();
        m_locale = std::make_shared<FakeUserLocaleService>(QStringList {QStringLiteral("en_US")});
        Services::setSpeechSynthesis(m_speech);
        Services::setUserLocale(m_locale);
        Services::setPreferences(std::make_shared<MemoryPreferencesStore>());
        Services::setNotifications(std::make_shared<InProcessNotificationCenter>());
        SpeechItemPrivate::resetConversionLocale();
    }
    void cleanup()
    {
        SpeechItemPrivate::resetConversionLocale();
        m_environment.reset();
    }

    void titlesLoseTheirQuality_data()
    {
        QTest::addColumn<QString>("title");
        QTest::addColumn<QString>("expected");
        QTest::newRow("compact") << "Maren Compact"
                                 << "Maren";
        QTest::newRow("premium") << "Maren Premium"
                                 << "Maren";
        QTest::newRow("lower case stays") << "Maren premium"
                                          << "Maren premium";
        QTest::newRow("other") << "Maren (Enhanced)"
                               << "Maren (Enhanced)";
        QTest::newRow("short") << "Premium"
                               << "";
    }
    void titlesLoseTheirQuality()
    {
        QFETCH(QString, title);
        QFETCH(QString, expected);
        QCOMPARE(VoiceTableRow::initWithTitle(title, nullptr)->title(), expected);
    }

    void emptyInEmptyOut()
    {
        QVERIFY(VoiceTableRow::arrangedRowsFromVoiceObjects({}, false, false, true, true).isEmpty());
    }

    void oneLanguageAndCountry()
    {
        const auto voices = make({{"a", "Zoe", "en_US", "F"}, {"b", "Amy", "en_US", "F"},
            {"c", "Bob", "en_US", "M"}, {"d", "Voice 10", "en_US", "F"}, {"e", "Voice 9", "en_US", "M"}});
        // 3 women and 2 men: split by gender; no language heading in a menu of one language.
        QCOMPARE(titles(VoiceTableRow::arrangedRowsFromVoiceObjects(voices, false, true, false, false)),
            QStringList({"# Female", "Amy", "Voice 10", "Zoe", "# Male", "Bob", "Voice 9"}));
        // The sheet names language and country in every heading.
        QCOMPARE(titles(VoiceTableRow::arrangedRowsFromVoiceObjects(voices, false, false, true, false)),
            QStringList({"# English (United States) — Female", "Amy", "Voice 10", "Zoe",
                "# English (United States) — Male", "Bob", "Voice 9"}));
        // 2 and 2: no split, no heading, sorted digit-aware.
        const auto four = make({{"a", "Zoe", "en_US", "F"}, {"b", "Amy", "en_US", "F"},
            {"c", "Voice 10", "en_US", "M"}, {"d", "Voice 9", "en_US", "M"}});
        QCOMPARE(titles(VoiceTableRow::arrangedRowsFromVoiceObjects(four, false, false, false, false)),
            QStringList({"Amy", "Voice 9", "Voice 10", "Zoe"}));
        QCOMPARE(titles(VoiceTableRow::arrangedRowsFromVoiceObjects(four, false, false, true, false)),
            QStringList({"# English (United States)", "Amy", "Voice 9", "Voice 10", "Zoe"}));
    }

    void countriesAndLanguages()
    {
        const auto voices = make({{"a", "Amy", "en_US", "F"}, {"b", "Ben", "en_GB", "M"}});
        // One language, two countries: a heading per country, the country alone.
        QCOMPARE(titles(VoiceTableRow::arrangedRowsFromVoiceObjects(voices, false, false, false, false)),
            QStringList({"# United Kingdom", "Ben", "# United States", "Amy"}));
        const auto mixed = make({{"a", "Amy", "en_US", "F"}, {"c", "Chloé", "fr_FR", "F"}});
        QCOMPARE(titles(VoiceTableRow::arrangedRowsFromVoiceObjects(mixed, false, false, false, false)),
            QStringList({"# English", "Amy", "# French", "Chloé"}));
    }

    void theUsersLocaleComesFirst()
    {
        m_speech->setSpeechLanguageLocale(QStringLiteral("fr_FR"));
        const auto voices
            = make({{"a", "Amy", "en_US", "F"}, {"c", "Chloé", "fr_FR", "F"}, {"d", "Denis", "fr_CA", "M"}});
        QCOMPARE(titles(VoiceTableRow::arrangedRowsFromVoiceObjects(voices, false, false, true, true)),
            QStringList({"# French (France)", "Chloé", "# English (United States)", "Amy",
                "# French (Canada)", "Denis"}));
        // Without an exact match, the groups of the language come first.
        m_speech->setSpeechLanguageLocale(QStringLiteral("fr_BE"));
        QCOMPARE(titles(VoiceTableRow::arrangedRowsFromVoiceObjects(voices, true, false, true, true)),
            QStringList({"# French (Canada)", "Denis", "# French (France)", "Chloé",
                "# English (United States)", "Amy"}));
    }

    void initialTicks()
    {
        m_speech->setSpeechLanguageLocale(QStringLiteral("en_US"));
        m_speech->addVoice(TestEnvironment::voiceAttributes(
            P + QStringLiteral("amy"), QStringLiteral("Amy"), QStringLiteral("en_US")));
        auto amy = CZVoiceObject::initWithVoiceIdentifier(P + QStringLiteral("amy"));
        auto premium = downloadable(
            QStringLiteral("amy.premium"), QStringLiteral("Amy Premium"), QStringLiteral("en_US"));
        auto lonely = downloadable(
            QStringLiteral("new.premium"), QStringLiteral("New Premium"), QStringLiteral("en_US"));
        auto german = downloadable(
            QStringLiteral("de.premium"), QStringLiteral("De Premium"), QStringLiteral("de_DE"));
        auto hidden
            = downloadable(QStringLiteral("hidden"), QStringLiteral("Hidden"), QStringLiteral("en_US"));
        hidden->setVisibility(0);
        hidden->setDownloadStatus(InstallerProtocol::WaitingStatus);
        auto chosen
            = downloadable(QStringLiteral("chosen"), QStringLiteral("Chosen"), QStringLiteral("de_DE"));
        chosen->setVisibility(1);
        // Our own compact voices end in ".compact": they are the base voice of their premium form too.
        m_speech->addVoice(TestEnvironment::voiceAttributes(
            P + QStringLiteral("maren.compact"), QStringLiteral("Maren Compact"), QStringLiteral("en_US")));
        auto maren = downloadable(
            QStringLiteral("maren.premium"), QStringLiteral("Maren Premium"), QStringLiteral("en_US"));
        const auto rows = VoiceTableRow::arrangedRowsFromVoiceObjects(
            {amy, premium, lonely, german, hidden, chosen, maren}, false, false, true, false);
        QHash<QString, bool> ticked;
        for (const auto &row : rows) {
            if (!row->isGroupRow()) {
                ticked.insert(row->voiceObject()->identifier(), row->isSelected());
            }
        }
        QVERIFY(ticked.value(P + QStringLiteral("amy")));
        QVERIFY(ticked.value(P + QStringLiteral("amy.premium"))); // its base voice is installed
        QVERIFY(!ticked.value(P + QStringLiteral("new.premium"))); // no base voice
        QVERIFY(ticked.value(P + QStringLiteral("maren.premium"))); // its compact base voice is installed
        QVERIFY(!ticked.value(P + QStringLiteral("de.premium"))); // another locale
        QVERIFY(ticked.value(P + QStringLiteral("hidden"))); // being fetched: shown
        QCOMPARE(hidden->visibility(), 1);
        QVERIFY(ticked.value(P + QStringLiteral("chosen"))); // the user's choice stands
        // Ticking writes through to the voice.
        const auto row = VoiceTableRow::initWithTitle(QStringLiteral("x"), german);
        row->setSelected(true);
        QCOMPARE(german->visibility(), 1);
        row->setSelected(false);
        QCOMPARE(german->visibility(), 0);
    }

    void groupFormatsInGerman()
    {
        m_locale->setPreferredLanguages({QStringLiteral("de_DE")});
        LocalizationTable::resetShared();
        SpeechItemPrivate::resetConversionLocale();
        const auto voices = make({{"a", "A", "de_DE", "F"}, {"b", "B", "de_DE", "F"},
            {"c", "C", "de_DE", "F"}, {"d", "D", "de_DE", "M"}});
        QCOMPARE(titles(VoiceTableRow::arrangedRowsFromVoiceObjects(voices, false, false, true, false)),
            QStringList({"# Deutsch (Deutschland) – Männlich", "D", "# Deutsch (Deutschland) – Weiblich", "A",
                "B", "C"}));
    }

private:
    struct Spec
    {
        const char *id;
        const char *name;
        const char *locale;
        const char *gender;
    };
    QList<CZVoiceObjectPtr> make(const QList<Spec> &specs)
    {
        QList<CZVoiceObjectPtr> voices;
        for (const Spec &s : specs) {
            const QString gender
                = QString::fromLatin1(s.gender) == u"F" ? VoiceGender::Female : VoiceGender::Male;
            m_speech->addVoice(TestEnvironment::voiceAttributes(P + QString::fromLatin1(s.id),
                QString::fromUtf8(s.name), QString::fromLatin1(s.locale), gender));
            voices.append(CZVoiceObject::initWithVoiceIdentifier(P + QString::fromLatin1(s.id)));
        }
        return voices;
    }
    CZVoiceObjectPtr downloadable(const QString &id, const QString &name, const QString &locale)
    {
        return DownloadableVoice::initWithVoiceID(P + id,
            QVariantMap {
                {QStringLiteral("VoiceAttributes"), TestEnvironment::voiceAttributes(P + id, name, locale)}});
    }

    std::unique_ptr<TestEnvironment> m_environment;
    std::shared_ptr<FakeSpeechSynthesisService> m_speech;
    std::shared_ptr<FakeUserLocaleService> m_locale;
};

QTEST_GUILESS_MAIN(VoiceTableRowTest)
#include "tst_voicetablerow.moc"
