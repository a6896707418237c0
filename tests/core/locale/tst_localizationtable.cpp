// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "FakeUserLocaleService.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/Services.h"

#include <QFile>
#include <QRegularExpression>
#include <QTest>

using namespace Cadenza::Platform;

namespace {
// Every key the shipped tables are read by; English and German must both hold each.
QStringList tableKeys()
{
    QFile file(QStringLiteral(CADENZA_SOURCE_DIR "/data/translations/cadenza_en.ts"));
    if (!file.open(QIODevice::ReadOnly)) {
        return {};
    }
    QStringList keys;
    static const QRegularExpression id(QStringLiteral("<message id=\"([^\"]+)\""));
    auto it = id.globalMatch(QString::fromUtf8(file.readAll()));
    while (it.hasNext()) {
        keys.append(it.next().captured(1).replace(QStringLiteral("&quot;"), QStringLiteral("\"")));
    }
    return keys;
}
} // namespace

class LocalizationTableTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void everyKeyHasATextInEveryLanguage()
    {
        const QStringList keys = tableKeys();
        QVERIFY(keys.size() >= 40);
        for (const QString &language : LocalizationTable::shippedLanguages()) {
            LocalizationTable table(language);
            for (const QString &key : keys) {
                QVERIFY2(!table.text(key).isEmpty(), qPrintable(language + QLatin1Char('/') + key));
            }
        }
    }

    void textsDifferByLanguage()
    {
        QCOMPARE(
            LocalizationTable(QStringLiteral("en")).text(QStringLiteral("Female")), QStringLiteral("Female"));
        QCOMPARE(LocalizationTable(QStringLiteral("de")).text(QStringLiteral("Female")),
            QStringLiteral("Weiblich"));
    }

    void unknownKeysGiveTheEmptyString()
    {
        const LocalizationTable table(QStringLiteral("de"));
        QVERIFY(table.text(QStringLiteral("NoSuchKey")).isEmpty());
        QVERIFY(table.text(QString()).isEmpty());
    }

    void unknownLanguagesFallBackToEnglish()
    {
        QCOMPARE(LocalizationTable(QStringLiteral("tlh")).language(), QStringLiteral("en"));
    }

    void hostLocalizationIsTheFirstShippedUserLanguage()
    {
        Cadenza::Testing::TestEnvironment environment;
        auto locale = std::make_shared<FakeUserLocaleService>();
        Services::setUserLocale(locale);
        locale->setPreferredLanguages(
            {QStringLiteral("fr_FR"), QStringLiteral("de_AT"), QStringLiteral("en_US")});
        QCOMPARE(LocalizationTable::hostPreferredLocalization(), QStringLiteral("de"));
        locale->setPreferredLanguages({QStringLiteral("ja_JP")});
        QCOMPARE(LocalizationTable::hostPreferredLocalization(), QStringLiteral("en"));
        locale->setPreferredLanguages({});
        QCOMPARE(LocalizationTable::hostPreferredLocalization(), QStringLiteral("en"));

        locale->setPreferredLanguages({QStringLiteral("de_DE")});
        LocalizationTable::resetShared();
        QCOMPARE(LocalizationTable::shared().language(), QStringLiteral("de"));
    }

    void fillTakesNumberedAndSequentialArguments_data()
    {
        QTest::addColumn<QString>("pattern");
        QTest::addColumn<QString>("expected");
        QTest::newRow("numbered") << QStringLiteral("%1 (%2)") << QStringLiteral("A (B)");
        QTest::newRow("reordered") << QStringLiteral("%2, %1") << QStringLiteral("B, A");
        QTest::newRow("sequential") << QStringLiteral("%@ (%@)") << QStringLiteral("A (B)");
        QTest::newRow("positional") << QStringLiteral("%2$@ %1$@") << QStringLiteral("B A");
        QTest::newRow("percent") << QStringLiteral("%1 %%") << QStringLiteral("A %");
        QTest::newRow("missing argument") << QStringLiteral("%3") << QString();
        QTest::newRow("trailing percent") << QStringLiteral("100%") << QStringLiteral("100%");
        QTest::newRow("argument holding a marker") << QStringLiteral("%1") << QStringLiteral("A");
    }
    void fillTakesNumberedAndSequentialArguments()
    {
        QFETCH(QString, pattern);
        QFETCH(QString, expected);
        QCOMPARE(LocalizationTable::fill(pattern, {QStringLiteral("A"), QStringLiteral("B")}), expected);
    }

    void argumentsAreNotReinterpreted()
    {
        QCOMPARE(
            LocalizationTable::fill(QStringLiteral("%1 and %2"), {QStringLiteral("%2"), QStringLiteral("x")}),
            QStringLiteral("%2 and x"));
    }
};

QTEST_GUILESS_MAIN(LocalizationTableTest)
#include "tst_localizationtable.moc"
