// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "FakeUserLocaleService.h"
#include "core/Assertion.h"
#include "core/locale/LocaleDisplayName.h"
#include "core/locale/LocaleDisplayName_p.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/Services.h"

#include <QTest>

#include <unicode/uldnames.h>

using namespace Cadenza;
using Cadenza::Platform::AssertionFailure;
using Cadenza::Platform::Locale;

namespace {
QString name(const QString &in, const QVariant &key, const QString &value, quint64 options = 1)
{
    return displayNameForKey(Locale(in), key, value, options);
}
} // namespace

class LocaleDisplayNameTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init() { m_environment = std::make_unique<Testing::TestEnvironment>(); }
    void cleanup() { m_environment.reset(); }

    void languageNamesCarryTheirQualifiers()
    {
        QCOMPARE(name(QStringLiteral("en"), Locale::LanguageCodeKey, QStringLiteral("en_US")),
            QStringLiteral("English (United States)"));
        QCOMPARE(name(QStringLiteral("en"), Locale::LanguageCodeKey, QStringLiteral("fr")),
            QStringLiteral("French"));
        QCOMPARE(name(QStringLiteral("de"), Locale::LanguageCodeKey, QStringLiteral("en_US")),
            QStringLiteral("Englisch (Vereinigte Staaten)"));
    }

    void qualifiersComeCountryScriptVariant()
    {
        const Locale english(QStringLiteral("en"));
        const QString country = english.displayNameForKey(Locale::CountryCodeKey, QStringLiteral("CN"));
        const QString script = english.displayNameForKey(Locale::ScriptCodeKey, QStringLiteral("Hans"));
        const QString language = name(QStringLiteral("en"), Locale::LanguageCodeKey, QStringLiteral("zh"));
        QCOMPARE(name(QStringLiteral("en"), Locale::LanguageCodeKey, QStringLiteral("zh_Hans_CN")),
            QStringLiteral("%1 (%2, %3)").arg(language, country, script));
    }

    void otherKeysNameTheirCode()
    {
        QCOMPARE(name(QStringLiteral("en"), Locale::CountryCodeKey, QStringLiteral("GB")),
            QStringLiteral("United Kingdom"));
        QCOMPARE(name(QStringLiteral("en"), Locale::ScriptCodeKey, QStringLiteral("Cyrl")),
            QStringLiteral("Cyrillic"));
        QCOMPARE(name(QStringLiteral("en"), Locale::IdentifierKey, QStringLiteral("de_AT")),
            QStringLiteral("German (Austria)"));
        QVERIFY(!name(QStringLiteral("en"), Locale::CollationIdentifierKey, QStringLiteral("phonebook"))
                     .isEmpty());
    }

    void capitalisationFollowsTheOptions()
    {
        // French writes language names in lower case inside a sentence and capitalises them in menus.
        QCOMPARE(name(QStringLiteral("fr"), Locale::LanguageCodeKey, QStringLiteral("de"), 0),
            QStringLiteral("allemand"));
        QCOMPARE(name(QStringLiteral("fr"), Locale::LanguageCodeKey, QStringLiteral("de"), 1),
            QStringLiteral("Allemand"));
        QCOMPARE(name(QStringLiteral("fr"), Locale::LanguageCodeKey, QStringLiteral("de"), 3),
            QStringLiteral("Allemand"));
        QCOMPARE(name(QStringLiteral("fr"), Locale::LanguageCodeKey, QStringLiteral("de"), 4),
            QStringLiteral("allemand"));
    }

    void invalidCapitalisationsAreMisuse_data()
    {
        QTest::addColumn<quint64>("options");
        QTest::newRow("5") << quint64(5);
        QTest::newRow("dialect bit alone") << quint64(8);
        QTest::newRow("dialect and menu") << quint64(9);
        QTest::newRow("15") << quint64(15);
    }
    void invalidCapitalisationsAreMisuse()
    {
        QFETCH(quint64, options);
        QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Invalid capitalization")));
        try {
            (void)name(QStringLiteral("en"), Locale::LanguageCodeKey, QStringLiteral("en"), options);
            QFAIL("no assertion raised");
        } catch (const AssertionFailure &failure) {
            QCOMPARE(failure.line(), 104);
            QCOMPARE(failure.file(), QStringLiteral("SpeechDataInstallation/Locale_DisplayName_Priv"));
            QCOMPARE(failure.message(),
                QStringLiteral("Invalid capitalization LocaleDisplayNameOptions %1").arg(options & 15));
        }
    }

    void keysThatAreNotStringsAreMisuse()
    {
        QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Invalid key type int")));
        try {
            (void)name(QStringLiteral("en"), QVariant(42), QStringLiteral("en"));
            QFAIL("no assertion raised");
        } catch (const AssertionFailure &failure) {
            QCOMPARE(failure.line(), 70);
            QCOMPARE(failure.message(), QStringLiteral("Invalid key type int"));
        }
    }

    void unsupportedKeysAreMisuse()
    {
        QTest::ignoreMessage(
            QtCriticalMsg, QRegularExpression(QStringLiteral("Unsupported key type calendar")));
        try {
            (void)name(QStringLiteral("en"), QStringLiteral("calendar"), QStringLiteral("gregorian"));
            QFAIL("no assertion raised");
        } catch (const AssertionFailure &failure) {
            QCOMPARE(failure.line(), 32);
            QCOMPARE(failure.function(), QStringLiteral("_icuDisplayName"));
        }
    }

    void valuesWithoutALanguageAreMisuse()
    {
        QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Could not get language for")));
        try {
            (void)name(QStringLiteral("en"), Locale::LanguageCodeKey, QStringLiteral("_US"));
            QFAIL("no assertion raised");
        } catch (const AssertionFailure &failure) {
            QCOMPARE(failure.line(), 119);
            QCOMPARE(failure.message(), QStringLiteral("Could not get language for \u2018_US\u2019"));
        }
    }

    void nullValuesGiveNull()
    {
        QVERIFY(name(QStringLiteral("en"), Locale::LanguageCodeKey, QString()).isNull());
        // A null value is answered before the options are looked at.
        QVERIFY(name(QStringLiteral("en"), Locale::LanguageCodeKey, QString(), 9).isNull());
        UErrorCode status = U_ZERO_ERROR;
        ULocaleDisplayNames *names = uldn_open("en", ULDN_STANDARD_NAMES, &status);
        QVERIFY(U_SUCCESS(status));
        QVERIFY(_icuDisplayName(names, Locale::CountryCodeKey, QString()).isNull());
        QVERIFY(_icuDisplayName(names, Locale::CountryCodeKey, QStringLiteral("")).isNull()); // empty name
        QCOMPARE(
            _icuDisplayName(names, Locale::CountryCodeKey, QStringLiteral("FR")), QStringLiteral("France"));
        uldn_close(names);
    }

    void unknownCodesFallBackToThePlainNameWithALogLine()
    {
        QTest::ignoreMessage(QtInfoMsg,
            QRegularExpression(
                QStringLiteral("failed to get display name for \u2018locale:countryCode/QQ\u2019")));
        QCOMPARE(
            name(QStringLiteral("en"), Locale::CountryCodeKey, QStringLiteral("QQ")), QStringLiteral("QQ"));
    }

    void cachedAndFreshHandlesAnswerAlike()
    {
        const QStringList values {QStringLiteral("en_US"), QStringLiteral("de"), QStringLiteral("zh_Hant_TW"),
            QStringLiteral("pt_BR"), QStringLiteral("sr_Latn_RS")};
        auto ask = [&] {
            QStringList answers;
            for (const QString &value : values) {
                answers.append(name(QStringLiteral("de"), Locale::LanguageCodeKey, value));
                answers.append(name(QStringLiteral("fr"), Locale::LanguageCodeKey, value, 0));
            }
            return answers;
        };
        const QStringList cached = ask();
        QCOMPARE(ask(), cached); // the second round comes from the kept answers
        LocaleDisplayNamePrivate::setHandleCacheEnabled(false);
        const QStringList fresh = ask();
        LocaleDisplayNamePrivate::setHandleCacheEnabled(true);
        QCOMPARE(cached, fresh);
    }

    void qualifiedTemplateComesFromTheLocalizationTable()
    {
        // The German table spells the template "%1 (%2)": the result must not show a raw marker.
        auto locale
            = std::make_shared<Platform::FakeUserLocaleService>(QStringList {QStringLiteral("de_DE")});
        Platform::Services::setUserLocale(locale);
        Platform::LocalizationTable::resetShared();
        LocaleDisplayNamePrivate::resetQualifiedTemplate();
        QCOMPARE(name(QStringLiteral("de"), Locale::LanguageCodeKey, QStringLiteral("de_CH")),
            QStringLiteral("Deutsch (Schweiz)"));
    }

private:
    std::unique_ptr<Testing::TestEnvironment> m_environment;
};

QTEST_GUILESS_MAIN(LocaleDisplayNameTest)
#include "tst_localedisplayname.moc"
