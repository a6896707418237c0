// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "core/formats/PropertyList.h"

#include <QDateTime>
#include <QTest>
#include <QTimeZone>

#include <cmath>
#include <limits>

using Cadenza::Platform::PropertyList;

class PropertyListTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void roundTripKeepsTypesApart()
    {
        const QVariantMap original {
            {QStringLiteral("integer"), QVariant::fromValue<qint64>(-42)},
            {QStringLiteral("big"), QVariant::fromValue<quint64>(18446744073709551615ULL)},
            {QStringLiteral("real"), 2.5},
            {QStringLiteral("yes"), true},
            {QStringLiteral("no"), false},
            {QStringLiteral("date"), QDateTime(QDate(2026, 11, 21), QTime(12, 30, 5), Qt::UTC)},
            {QStringLiteral("data"), QByteArray("\x00\x01\xfe\xff", 4)},
            {QStringLiteral("text"), QStringLiteral("Amélie <&> \"quoted\"")},
            {QStringLiteral("list"),
                QVariantList {1, QStringLiteral("two"), QVariantMap {{QStringLiteral("k"), 3.0}}}},
        };
        const auto parsed = PropertyList::parse(PropertyList::serialize(original));
        QVERIFY(parsed);
        const QVariantMap back = parsed->toMap();
        QCOMPARE(back.value(QStringLiteral("integer")).typeId(), int(QMetaType::LongLong));
        QCOMPARE(back.value(QStringLiteral("integer")).toLongLong(), -42);
        QCOMPARE(back.value(QStringLiteral("big")).toULongLong(), 18446744073709551615ULL);
        QCOMPARE(back.value(QStringLiteral("real")).typeId(), int(QMetaType::Double));
        QCOMPARE(back.value(QStringLiteral("yes")).typeId(), int(QMetaType::Bool));
        QCOMPARE(back.value(QStringLiteral("no")).toBool(), false);
        QCOMPARE(back.value(QStringLiteral("date")).toDateTime(),
            original.value(QStringLiteral("date")).toDateTime());
        QCOMPARE(back.value(QStringLiteral("data")).toByteArray(), QByteArray("\x00\x01\xfe\xff", 4));
        QCOMPARE(
            back.value(QStringLiteral("text")).toString(), original.value(QStringLiteral("text")).toString());
        const QVariantList list = back.value(QStringLiteral("list")).toList();
        QCOMPARE(list.size(), 3);
        QCOMPARE(list.at(1).toString(), QStringLiteral("two"));
        QCOMPARE(list.at(2).toMap().value(QStringLiteral("k")).toDouble(), 3.0);
    }

    void valuesSurviveEveryTrip()
    {
        const QVariantMap original {
            {QStringLiteral("milliseconds"), QDateTime::fromMSecsSinceEpoch(1763800000123, QTimeZone::utc())},
            {QStringLiteral("before the epoch"), QDateTime::fromMSecsSinceEpoch(-1001, QTimeZone::utc())},
            {QStringLiteral("first date"), QDateTime::fromMSecsSinceEpoch(-62135596800000, QTimeZone::utc())},
            {QStringLiteral("last date"), QDateTime::fromMSecsSinceEpoch(253402300799999, QTimeZone::utc())},
            {QStringLiteral("smallest"), QVariant::fromValue(std::numeric_limits<qint64>::min())},
            {QStringLiteral("largest"), QVariant::fromValue(std::numeric_limits<qint64>::max())},
            {QStringLiteral("beyond signed"),
                QVariant::fromValue(quint64(std::numeric_limits<qint64>::max()) + 1)},
            {QStringLiteral("tenth"), 0.1},
            {QStringLiteral("negative zero"), -0.0},
            {QStringLiteral("subnormal"), 1e-310},
            {QStringLiteral("largest real"), std::numeric_limits<double>::max()},
            {QStringLiteral("infinity"), std::numeric_limits<double>::infinity()},
            {QStringLiteral("returns"), QStringLiteral("\r\nline\rline\r")},
            {QStringLiteral("spaces"), QStringLiteral("  \t padded \n ")},
            {QStringLiteral("markup"), QStringLiteral("]]> <!-- &amp; <key>")},
            {QStringLiteral("\rkey with a return"), QStringLiteral("\U0001F600 \u202E\uFEFF")},
        };
        QVariant value = original;
        QByteArray first;
        for (int trip = 0; trip < 5; ++trip) {
            const QByteArray bytes = PropertyList::serialize(value);
            if (trip == 0) {
                first = bytes;
            }
            QCOMPARE(bytes, first);
            QString error;
            const auto parsed = PropertyList::parse(bytes, &error);
            QVERIFY2(parsed, qPrintable(error));
            value = *parsed;
        }
        const QVariantMap back = value.toMap();
        QCOMPARE(back.keys(), original.keys());
        for (auto it = original.cbegin(); it != original.cend(); ++it) {
            const QVariant &got = back.value(it.key());
            QCOMPARE(got.typeId() == QMetaType::QDateTime, it->typeId() == QMetaType::QDateTime);
            if (it->typeId() == QMetaType::QDateTime) {
                QCOMPARE(got.toDateTime().toMSecsSinceEpoch(), it->toDateTime().toMSecsSinceEpoch());
            } else if (it->typeId() == QMetaType::Double) {
                QCOMPARE(got.toDouble(), it->toDouble());
                QCOMPARE(std::signbit(got.toDouble()), std::signbit(it->toDouble()));
            } else {
                QCOMPARE(got.toString(), it->toString());
            }
        }
        // Whole seconds stay written as whole seconds.
        QVERIFY(PropertyList::serialize(QDateTime(QDate(2026, 11, 21), QTime(12, 30, 5), QTimeZone::utc()))
                    .contains("<date>2026-11-21T12:30:05Z</date>"));
    }

    void charactersXmlCannotCarryBecomeReplacements()
    {
        // Once replaced, the text stays as it is; the document around it stays readable.
        const QString text
            = QStringLiteral("a") + QChar(1) + QChar(0xFFFE) + QChar(0xD800) + QStringLiteral("b");
        const QString replaced = QStringLiteral("a\uFFFD\uFFFD\uFFFDb");
        const auto parsed = PropertyList::parse(PropertyList::serialize(QVariantMap {{text, text}}));
        QVERIFY(parsed);
        QCOMPARE(parsed->toMap(), (QVariantMap {{replaced, replaced}}));
        QCOMPARE(PropertyList::serialize(*parsed), PropertyList::serialize(QVariantMap {{text, text}}));
    }

    void datesRoundToTheMillisecondAndStayInTheYears_data()
    {
        QTest::addColumn<QString>("text");
        QTest::addColumn<qint64>("milliseconds"); // 0: refused
        QTest::newRow("fraction") << "2020-01-01T00:00:00.1234Z" << qint64(1577836800123);
        QTest::newRow("fraction rounds up") << "2020-01-01T00:00:00.9996Z" << qint64(1577836801000);
        QTest::newRow("last date") << "9999-12-31T23:59:59.999Z" << qint64(253402300799999);
        QTest::newRow("rounds into 10000") << "9999-12-31T23:59:59.9999Z" << qint64(0);
        QTest::newRow("24:00 of the last day") << "9999-12-31T24:00:00Z" << qint64(0);
        QTest::newRow("year 0") << "0000-01-01T00:00:00Z" << qint64(0);
        QTest::newRow("first date") << "0001-01-01T00:00:00Z" << qint64(-62135596800000);
    }
    void datesRoundToTheMillisecondAndStayInTheYears()
    {
        QFETCH(QString, text);
        QFETCH(qint64, milliseconds);
        const QByteArray document = "<plist version=\"1.0\"><date>" + text.toUtf8() + "</date></plist>";
        QString error;
        const auto parsed = PropertyList::parse(document, &error);
        if (milliseconds == 0) {
            QVERIFY(!parsed);
            QVERIFY(error.contains(QStringLiteral("bad date")));
            return;
        }
        QVERIFY2(parsed, qPrintable(error));
        QCOMPARE(parsed->toDateTime().toMSecsSinceEpoch(), milliseconds);
        const auto again = PropertyList::parse(PropertyList::serialize(*parsed));
        QVERIFY(again);
        QCOMPARE(again->toDateTime().toMSecsSinceEpoch(), milliseconds);
    }

    void refusesDamagedDocuments_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::newRow("empty") << QByteArray();
        QTest::newRow("not xml") << QByteArray("\x89PNG\r\n");
        QTest::newRow("wrong root") << QByteArray("<dict><key>a</key><string>b</string></dict>");
        QTest::newRow("no value") << QByteArray("<plist></plist>");
        QTest::newRow("two values") << QByteArray("<plist><true/><false/></plist>");
        QTest::newRow("key without value") << QByteArray("<plist><dict><key>a</key></dict></plist>");
        QTest::newRow("value without key") << QByteArray("<plist><dict><string>a</string></dict></plist>");
        QTest::newRow("bad integer") << QByteArray("<plist><integer>12a</integer></plist>");
        QTest::newRow("bad real") << QByteArray("<plist><real>1.2.3</real></plist>");
        QTest::newRow("bad date") << QByteArray("<plist><date>yesterday</date></plist>");
        QTest::newRow("bad data") << QByteArray("<plist><data>!!!</data></plist>");
        QTest::newRow("unknown element") << QByteArray("<plist><set/></plist>");
        QTest::newRow("truncated") << QByteArray("<plist><dict><key>a</key><array><string>x</string>");
        QTest::newRow("trailing element") << QByteArray("<plist><true/></plist><plist/>");
        QTest::newRow("entities") << QByteArray(
            "<!DOCTYPE plist [<!ENTITY a \"aaaa\">]><plist><string>&a;</string></plist>");
        QByteArray deep = "<plist>";
        for (int i = 0; i < PropertyList::MaximumDepth + 2; ++i) {
            deep += "<array>";
        }
        QTest::newRow("too deep") << deep;
    }

    void refusesDamagedDocuments()
    {
        QFETCH(QByteArray, bytes);
        QString error;
        QVERIFY(!PropertyList::parse(bytes, &error));
        QVERIFY2(!error.isEmpty(), "a refusal must say why");
    }

    void acceptsNestingUpToTheLimit()
    {
        QByteArray doc = "<plist>";
        for (int i = 0; i < PropertyList::MaximumDepth; ++i) {
            doc += "<array>";
        }
        for (int i = 0; i < PropertyList::MaximumDepth; ++i) {
            doc += "</array>";
        }
        doc += "</plist>";
        QString error;
        QVERIFY2(PropertyList::parse(doc, &error), qPrintable(error));
    }

    void readsMissingFileAsAnError()
    {
        QString error;
        QVERIFY(!PropertyList::readFile(QStringLiteral("/nonexistent/Info.plist"), &error));
        QVERIFY(!error.isEmpty());
    }
};

QTEST_GUILESS_MAIN(PropertyListTest)
#include "tst_propertylist.moc"
