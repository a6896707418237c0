#include "platform/PropertyList.h"

#include <QDateTime>
#include <QTest>

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
