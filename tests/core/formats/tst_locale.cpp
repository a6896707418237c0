// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "FakeUserLocaleService.h"
#include "core/formats/Locale.h"
#include "core/services/EnvironmentUserLocaleService.h"

#include <QTest>

using namespace Cadenza::Platform;

class LocaleTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void canonicalIdentifiers_data()
    {
        QTest::addColumn<QString>("input");
        QTest::addColumn<QString>("expected");
        QTest::newRow("identifier") << QStringLiteral("en_US") << QStringLiteral("en_US");
        QTest::newRow("language tag") << QStringLiteral("en-US") << QStringLiteral("en_US");
        QTest::newRow("lower-case tag") << QStringLiteral("en-us") << QStringLiteral("en_US");
        QTest::newRow("script tag") << QStringLiteral("zh-Hans-CN") << QStringLiteral("zh_Hans_CN");
        QTest::newRow("posix encoding") << QStringLiteral("de_DE.UTF-8") << QStringLiteral("de_DE");
        QTest::newRow("language only") << QStringLiteral("fr") << QStringLiteral("fr");
        QTest::newRow("empty") << QString() << QString();
        QTest::newRow("absurdly long") << QString(500, QLatin1Char('a')) << QString();
    }
    void canonicalIdentifiers()
    {
        QFETCH(QString, input);
        QFETCH(QString, expected);
        QCOMPARE(Locale::canonicalLocaleIdentifier(input), expected);
    }

    void componentsRoundTrip_data()
    {
        QTest::addColumn<QString>("identifier");
        QTest::addColumn<QString>("language");
        QTest::addColumn<QString>("script");
        QTest::addColumn<QString>("country");
        QTest::addColumn<QString>("variant");
        QTest::newRow("full") << QStringLiteral("zh_Hans_CN") << "zh"
                              << "Hans"
                              << "CN"
                              << "";
        QTest::newRow("language") << QStringLiteral("en") << "en"
                                  << ""
                                  << ""
                                  << "";
        QTest::newRow("variant without country") << QStringLiteral("en__POSIX") << "en"
                                                 << ""
                                                 << ""
                                                 << "POSIX";
        QTest::newRow("country only") << QStringLiteral("_US") << ""
                                      << ""
                                      << "US"
                                      << "";
    }
    void componentsRoundTrip()
    {
        QFETCH(QString, identifier);
        QFETCH(QString, language);
        QFETCH(QString, script);
        QFETCH(QString, country);
        QFETCH(QString, variant);
        const LocaleComponents parts = Locale::componentsFromLocaleIdentifier(identifier);
        QCOMPARE(parts.languageCode, language);
        QCOMPARE(parts.scriptCode, script);
        QCOMPARE(parts.countryCode, country);
        QCOMPARE(parts.variantCode, variant);
        QCOMPARE(Locale::localeIdentifierFromComponents(parts), identifier);
    }

    void plainDisplayNames()
    {
        const Locale english(QStringLiteral("en"));
        QCOMPARE(english.displayNameForKey(Locale::CountryCodeKey, QStringLiteral("DE")),
            QStringLiteral("Germany"));
        QCOMPARE(
            Locale(QStringLiteral("de")).displayNameForKey(Locale::LanguageCodeKey, QStringLiteral("fr")),
            QStringLiteral("Französisch"));
        QVERIFY(english.displayNameForKey(QStringLiteral("bogus"), QStringLiteral("DE")).isNull());
        QVERIFY(english.displayNameForKey(Locale::CountryCodeKey, QString()).isNull());
    }

    // Both user-locale services answer canonical identifiers.
    void userLocaleServicesAnswerCanonicalIdentifiers()
    {
        EnvironmentUserLocaleService environment;
        FakeUserLocaleService fake({QStringLiteral("de_DE")}, QStringLiteral("de_DE"));
        for (UserLocaleService *service :
            {static_cast<UserLocaleService *>(&environment), static_cast<UserLocaleService *>(&fake)}) {
            const QString current = service->currentLocaleIdentifier();
            QVERIFY(!current.isEmpty());
            QCOMPARE(Locale::canonicalLocaleIdentifier(current), current);
            for (const QString &language : service->preferredLanguages()) {
                QCOMPARE(Locale::canonicalLocaleIdentifier(language), language);
            }
        }
        // The suite runs with LANGUAGE=en_US.
        QCOMPARE(environment.preferredLanguages().value(0), QStringLiteral("en_US"));
    }
};

QTEST_GUILESS_MAIN(LocaleTest)
#include "tst_locale.moc"
