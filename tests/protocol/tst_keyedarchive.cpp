// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "protocol/KeyedArchive.h"
#include "protocol/MessageFrame.h"

#include <QCborStreamWriter>
#include <QDateTime>
#include <QTest>
#include <QTimeZone>

#include <cmath>
#include <limits>

using namespace Cadenza::Platform;

namespace {
const ArchiveClasses Everything
    = ArchiveClasses(ArchiveClass::Array) | ArchiveClass::Dictionary | PropertyListLeaves;

QByteArray rawArchive(const std::function<void(QCborStreamWriter &)> &writeRoot)
{
    QByteArray bytes;
    QCborStreamWriter cbor(&bytes);
    cbor.startMap(1);
    cbor.append(QStringLiteral("root"));
    writeRoot(cbor);
    cbor.endMap();
    return bytes;
}
} // namespace

class KeyedArchiveTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void roundTripKeepsEveryKind()
    {
        const QVariantMap record {{QStringLiteral("QLNDTagName"), QStringLiteral("VOICEID:x")},
            {QStringLiteral("QLNDItemByteSize"), QVariant::fromValue<quint64>(18446744073709551615ULL)},
            {QStringLiteral("QLNDClientProcessID"), QVariant::fromValue<qint64>(-12)},
            {QStringLiteral("QLNDItemPercentComplete"), 42.5}, {QStringLiteral("flag"), true},
            {QStringLiteral("data"), QByteArray("\0\1", 2)},
            {QStringLiteral("when"), QDateTime::fromMSecsSinceEpoch(1700000000123, Qt::UTC)},
            {QStringLiteral("list"), QVariantList {1, QStringLiteral("two")}}};
        const auto bytes = KeyedArchive::encode(record);
        QVERIFY(bytes);
        QString error;
        const auto back = KeyedArchive::decode(*bytes, Everything, &error);
        QVERIFY2(back, qPrintable(error));
        const QVariantMap map = back->toMap();
        QCOMPARE(map.value(QStringLiteral("QLNDItemByteSize")).toULongLong(), 18446744073709551615ULL);
        QCOMPARE(map.value(QStringLiteral("QLNDClientProcessID")).toLongLong(), -12);
        QCOMPARE(map.value(QStringLiteral("QLNDItemPercentComplete")).toDouble(), 42.5);
        QCOMPARE(map.value(QStringLiteral("flag")).typeId(), int(QMetaType::Bool));
        QCOMPARE(map.value(QStringLiteral("data")).toByteArray(), QByteArray("\0\1", 2));
        QCOMPARE(map.value(QStringLiteral("when")).toDateTime().toMSecsSinceEpoch(), 1700000000123);
        QCOMPARE(map.value(QStringLiteral("list")).toList().size(), 2);
    }

    void unarchivableValuesAreRefused()
    {
        QString error;
        QVERIFY(!KeyedArchive::encode(QVariant::fromValue(QPoint(1, 2)), &error));
        QVERIFY(error.contains(QStringLiteral("QPoint")));
        QVERIFY(!KeyedArchive::encode(QVariantMap {{QStringLiteral("x"), QVariant()}}, &error));
    }

    void classesNotAllowedAreRefused()
    {
        const auto array = KeyedArchive::encode(QVariantList {1, 2});
        const auto nested = KeyedArchive::encode(QVariantMap {{QStringLiteral("a"), QVariantList {1}}});
        QString error;
        QVERIFY(
            KeyedArchive::decode(*array, ArchiveClasses(ArchiveClass::Array) | PropertyListLeaves, &error));
        QVERIFY(!KeyedArchive::decode(
            *array, ArchiveClasses(ArchiveClass::Dictionary) | PropertyListLeaves, &error));
        QVERIFY(error.contains(QStringLiteral("'array' is not allowed")));
        error.clear();
        QVERIFY(!KeyedArchive::decode(
            *nested, ArchiveClasses(ArchiveClass::Dictionary) | PropertyListLeaves, &error));
        QVERIFY(!KeyedArchive::decode(
            *array, ArchiveClasses(ArchiveClass::Array), &error)); // numbers not allowed
    }

    void damagedArchivesAreRefused_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::newRow("empty") << QByteArray();
        QTest::newRow("not cbor") << QByteArray("hello world");
        QTest::newRow("not a map") << QByteArray("\x83\x01\x02\x03", 4);
        QTest::newRow("no root") << rawArchive([](QCborStreamWriter &) {}).replace("root", "ruut");
        QTest::newRow("truncated") << rawArchive([](QCborStreamWriter &c) {
            c.append(QStringLiteral("abcdef"));
        }).chopped(3);
        QTest::newRow("null root") << rawArchive([](QCborStreamWriter &c) { c.append(nullptr); });
        QTest::newRow("undefined") << rawArchive(
            [](QCborStreamWriter &c) { c.append(QCborSimpleType::Undefined); });
        QTest::newRow("foreign tag") << rawArchive([](QCborStreamWriter &c) {
            c.append(QCborTag(32));
            c.append(QStringLiteral("http://x"));
        });
        QTest::newRow("integer key") << rawArchive([](QCborStreamWriter &c) {
            c.startMap(1);
            c.append(1);
            c.append(2);
            c.endMap();
        });
        // A header promising four billion elements must be refused before anything is reserved.
        QTest::newRow("huge array header") << QByteArray("\xa1\x64root\x9a\xff\xff\xff\xff", 11);
        QTest::newRow("huge string header") << QByteArray("\xa1\x64root\x7a\x7f\xff\xff\xff", 11);
        QTest::newRow("huge map header") << QByteArray("\xa1\x64root\xba\x7f\xff\xff\xff", 11);
        QByteArray deep = QByteArray("\xa1\x64root", 6);
        for (int i = 0; i < 100; ++i) {
            deep += '\x81';
        }
        deep += '\x01';
        QTest::newRow("too deep") << deep;
        QTest::newRow("negative overflow")
            << QByteArray("\xa1\x64root\x3b\xff\xff\xff\xff\xff\xff\xff\xff", 14);
    }
    void damagedArchivesAreRefused()
    {
        QFETCH(QByteArray, bytes);
        QString error;
        QVERIFY(!KeyedArchive::decode(bytes, Everything, &error));
        QVERIFY2(!error.isEmpty(), "a refusal must say why");
    }

    void aRelayedDateKeepsItsValue()
    {
        // An installation request as a fuzzer found it: its "t" is 1.0012207031... seconds, which
        // decoded to 1001 ms; archived again as 1.001 s, that came back as 1000 ms when truncated.
        const QByteArray found = QByteArray::fromHex(
            "a164726f6f7482a87251544e44436c69656e74506f72744e616d65781c636f6d2e76656e6472612e737065656368"
            "2e7175696c6c6f6e642d3173514c4e44436c69656e7450726f6365737349440570514c4e444974656d4279746553"
            "697a650c76514c4e444974656d446f776e6c6f6164537461747573046c514c4e444974656d4e616d6561586c514c"
            "4e444f626a656374494461786b514c4e445461674e616d6569564f49434549443a7877514c4e4455736572496e74"
            "6572616374696f6e4d6f642c00a361644261626170fb40040000000000006174c1fb3ff0050000000000");
        QString error;
        const auto decoded = KeyedArchive::decode(found, Everything, &error);
        QVERIFY2(decoded, qPrintable(error));
        const QVariantMap interaction = decoded->toList().at(1).toMap();
        QCOMPARE(interaction.value(QStringLiteral("t")).toDateTime().toMSecsSinceEpoch(), 1001);
        QByteArray archive = *KeyedArchive::encode(*decoded);
        for (int relay = 0; relay < 5; ++relay) {
            const auto again = KeyedArchive::decode(archive, Everything, &error);
            QVERIFY2(again, qPrintable(error));
            QCOMPARE(
                again->toList().at(1).toMap().value(QStringLiteral("t")).toDateTime().toMSecsSinceEpoch(),
                1001);
            const QByteArray next = *KeyedArchive::encode(*again);
            QCOMPARE(next, archive);
            archive = next;
        }
    }

    void datesSurviveEveryTrip_data()
    {
        QTest::addColumn<qint64>("milliseconds");
        QTest::newRow("epoch") << qint64(0);
        QTest::newRow("1 ms") << qint64(1);
        QTest::newRow("-1 ms") << qint64(-1);
        QTest::newRow("1.001 s") << qint64(1001);
        QTest::newRow("-1.001 s") << qint64(-1001);
        QTest::newRow("-0.999 s") << qint64(-999);
        QTest::newRow("now-ish") << qint64(1763800000123);
        QTest::newRow("before the epoch") << qint64(-1234567890987);
        QTest::newRow("first of year 1") << qint64(-62135596800000);
        QTest::newRow("last of year 9999") << qint64(253402300799999);
    }
    void datesSurviveEveryTrip()
    {
        QFETCH(qint64, milliseconds);
        QVariant value = QDateTime::fromMSecsSinceEpoch(milliseconds, QTimeZone::utc());
        QString error;
        for (int trip = 0; trip < 10; ++trip) {
            const auto bytes = KeyedArchive::encode(value, &error);
            QVERIFY2(bytes, qPrintable(error));
            const auto back = KeyedArchive::decode(*bytes, Everything, &error);
            QVERIFY2(back, qPrintable(error));
            QCOMPARE(back->toDateTime().toMSecsSinceEpoch(), milliseconds);
            value = *back;
        }
    }

    void datesRoundToTheNearestMillisecond_data()
    {
        QTest::addColumn<double>("seconds");
        QTest::addColumn<qint64>("milliseconds");
        QTest::newRow("just below 1.001 s") << 1.0009999 << qint64(1001);
        QTest::newRow("just above 1.001 s") << 1.0010001 << qint64(1001);
        QTest::newRow("just below -1.001 s") << -1.0010001 << qint64(-1001);
        QTest::newRow("just above -1.001 s") << -1.0009999 << qint64(-1001);
        QTest::newRow("a hair below zero") << -0.0001 << qint64(0);
        QTest::newRow("integer seconds") << 2.0 << qint64(2000);
        QTest::newRow("rounds onto the last date") << 253402300799.9994 << qint64(253402300799999);
        QTest::newRow("rounds onto the first date") << -62135596800.0004 << qint64(-62135596800000);
    }
    void datesRoundToTheNearestMillisecond()
    {
        QFETCH(double, seconds);
        QFETCH(qint64, milliseconds);
        const QByteArray bytes = rawArchive([&](QCborStreamWriter &cbor) {
            cbor.append(QCborTag(1));
            cbor.append(seconds);
        });
        QString error;
        const auto back = KeyedArchive::decode(bytes, Everything, &error);
        QVERIFY2(back, qPrintable(error));
        QCOMPARE(back->toDateTime().toMSecsSinceEpoch(), milliseconds);
    }

    void datesOutsideTheYearsAreRefused_data()
    {
        QTest::addColumn<double>("seconds");
        QTest::newRow("rounds past 9999") << 253402300799.9996;
        QTest::newRow("rounds before year 1") << -62135596800.0006;
        QTest::newRow("huge") << 1e300;
        QTest::newRow("infinity") << std::numeric_limits<double>::infinity();
        QTest::newRow("minus infinity") << -std::numeric_limits<double>::infinity();
        QTest::newRow("NaN") << std::numeric_limits<double>::quiet_NaN();
    }
    void datesOutsideTheYearsAreRefused()
    {
        QFETCH(double, seconds);
        const QByteArray bytes = rawArchive([&](QCborStreamWriter &cbor) {
            cbor.append(QCborTag(1));
            cbor.append(seconds);
        });
        QString error;
        QVERIFY(!KeyedArchive::decode(bytes, Everything, &error));
        QVERIFY(error.contains(QStringLiteral("out of range")));
        // Nor is such a date archived: no reader could take it back.
        error.clear();
        QVERIFY(!KeyedArchive::encode(QDateTime(QDate(10000, 1, 1), QTime(0, 0), QTimeZone::utc()), &error));
        QVERIFY(!error.isEmpty());
    }

    void otherValuesSurviveEveryTrip()
    {
        const QVariantList values {QVariant::fromValue(std::numeric_limits<qint64>::min()),
            QVariant::fromValue(std::numeric_limits<qint64>::max()),
            QVariant::fromValue(std::numeric_limits<quint64>::max()),
            QVariant::fromValue(quint64(std::numeric_limits<qint64>::max()) + 1), 0.1, -0.0, 1e-310,
            std::numeric_limits<double>::max(), std::numeric_limits<double>::infinity(),
            -std::numeric_limits<double>::infinity(),
            QString(QString(QChar(0)) + QStringLiteral("\r\n\t\u0001\uFFFE\uFEFF\u202E") + QChar(0xDBFF)
                + QChar(0xDFFF))};
        QVariant value = values;
        QString error;
        QByteArray first;
        for (int trip = 0; trip < 5; ++trip) {
            const auto bytes = KeyedArchive::encode(value, &error);
            QVERIFY2(bytes, qPrintable(error));
            if (trip == 0) {
                first = *bytes;
            }
            QCOMPARE(*bytes, first);
            const auto back = KeyedArchive::decode(*bytes, Everything, &error);
            QVERIFY2(back, qPrintable(error));
            value = *back;
        }
        const QVariantList back = value.toList();
        QCOMPARE(back.size(), values.size());
        QCOMPARE(back.at(0).toLongLong(), std::numeric_limits<qint64>::min());
        QCOMPARE(back.at(1).toLongLong(), std::numeric_limits<qint64>::max());
        QCOMPARE(back.at(2).toULongLong(), std::numeric_limits<quint64>::max());
        QCOMPARE(back.at(3).toULongLong(), quint64(std::numeric_limits<qint64>::max()) + 1);
        QCOMPARE(back.at(4).toDouble(), 0.1);
        QVERIFY(std::signbit(back.at(5).toDouble()));
        QCOMPARE(back.at(6).toDouble(), 1e-310);
        QCOMPARE(back.at(7).toDouble(), std::numeric_limits<double>::max());
        QCOMPARE(back.at(8).toDouble(), std::numeric_limits<double>::infinity());
        QCOMPARE(back.at(9).toDouble(), -std::numeric_limits<double>::infinity());
        QCOMPARE(back.at(10).toString(), values.at(10).toString());
    }

    void stringsKeepEveryCharacter()
    {
        // Short strings and keys take a faster path than long ones; both must give the same text.
        const QString accented
            = QStringLiteral("Am\u00e9lie \u0928\u092e\u0938\u094d\u0924\u0947 \U0001F600");
        const QString longText = accented.repeated(40);
        const QVariantMap record {{accented, longText}, {longText, accented}, {QString(), QString()}};
        QString error;
        const auto back
            = KeyedArchive::decode(*KeyedArchive::encode(QVariantList {record, record}), Everything, &error);
        QVERIFY2(back, qPrintable(error));
        QCOMPARE(back->toList(), (QVariantList {record, record}));
    }

    void brokenUtf8IsRefused_data()
    {
        QTest::addColumn<QByteArray>("bytes");
        QTest::newRow("short value") << QByteArray("\xa1\x64root\x62\xc3\x28", 9);
        QTest::newRow("short key") << QByteArray("\xa1\x64root\xa1\x61\xff\x01", 10);
        QTest::newRow("lone surrogate") << QByteArray("\xa1\x64root\x63\xed\xa0\x80", 10);
        QByteArray longValue("\xa1\x64root\x79\x01\x2c", 9);
        longValue += QByteArray(299, 'a') + "\xff";
        QTest::newRow("long value") << longValue;
    }
    void brokenUtf8IsRefused()
    {
        QFETCH(QByteArray, bytes);
        QString error;
        QVERIFY(!KeyedArchive::decode(bytes, Everything, &error));
        QVERIFY2(!error.isEmpty(), "a refusal must say why");
    }

    void archivedItemsJoinIntoTheSameArchive_data()
    {
        // Each count crosses a boundary of how an array states its length.
        QTest::addColumn<int>("count");
        for (const int count : {0, 1, 23, 24, 255, 256, 65535, 65536}) {
            QTest::newRow(qPrintable(QString::number(count))) << count;
        }
    }
    void archivedItemsJoinIntoTheSameArchive()
    {
        QFETCH(int, count);
        QVariantList records;
        QList<QByteArray> items;
        for (int i = 0; i < count; ++i) {
            const QVariant record = i % 2 ? QVariant(QVariantMap {{QStringLiteral("QLNDTagName"), i}})
                                          : QVariant(QStringLiteral("item %1").arg(i));
            records.append(record);
            items.append(*KeyedArchive::encodeItem(record));
        }
        const QByteArray joined = KeyedArchive::encodeArray(items);
        QCOMPARE(joined, *KeyedArchive::encode(records));
        ArchiveLimits roomy;
        roomy.maximumItems = 4 * 65536;
        QString error;
        const auto back = KeyedArchive::decode(joined, Everything, &error, roomy);
        QVERIFY2(back, qPrintable(error));
        QCOMPARE(back->toList(), records);
    }

    void limitsAreKept()
    {
        ArchiveLimits limits;
        limits.maximumItems = 10;
        limits.maximumStringBytes = 8;
        QString error;
        QVERIFY(
            !KeyedArchive::decode(*KeyedArchive::encode(QVariantList(20, 1)), Everything, &error, limits));
        QVERIFY(!KeyedArchive::decode(
            *KeyedArchive::encode(QString(9, QLatin1Char('x'))), Everything, &error, limits));
        QVERIFY(KeyedArchive::decode(
            *KeyedArchive::encode(QString(8, QLatin1Char('x'))), Everything, &error, limits));
        // Chunked strings are counted as they arrive.
        const QByteArray indefinite = QByteArray("\xa1\x64root\x7f\x65xxxxx\x65xxxxx\xff", 20);
        error.clear();
        QVERIFY(!KeyedArchive::decode(indefinite, Everything, &error, limits));
        QVERIFY(error.contains(QStringLiteral("longer than 8 bytes")));
        limits.maximumStringBytes = 100;
        error.clear();
        const auto joined = KeyedArchive::decode(indefinite, Everything, &error, limits);
        QVERIFY2(joined, qPrintable(error));
        QCOMPARE(joined->toString(), QStringLiteral("xxxxxxxxxx"));
    }
};

class MessageFrameTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void framesSurviveAnySplitting()
    {
        QByteArray stream;
        for (int i = 0; i < 5; ++i) {
            stream
                += MessageFrame {i, MessageFrame::ReplyWanted, QByteArray(i * 1000, char('a' + i))}.encode();
        }
        for (int step : {1, 7, 12, 13, 4096, int(stream.size())}) {
            MessageFrameReader reader;
            QList<MessageFrame> frames;
            for (qsizetype at = 0; at < stream.size(); at += step) {
                QVERIFY(reader.append(stream.mid(at, step)));
                while (auto frame = reader.next()) {
                    frames.append(*frame);
                }
            }
            QCOMPARE(frames.size(), 5);
            for (int i = 0; i < 5; ++i) {
                QCOMPARE(frames.at(i).messageId, i);
                QCOMPARE(frames.at(i).flags, quint32(MessageFrame::ReplyWanted));
                QCOMPARE(frames.at(i).payload, QByteArray(i * 1000, char('a' + i)));
            }
            QCOMPARE(reader.pendingBytes(), 0);
        }
    }

    void oversizedFramesBreakTheStream()
    {
        MessageFrameReader reader(1024);
        QVERIFY(reader.append(MessageFrame {1, 0, QByteArray(1024, 'x')}.encode()));
        QVERIFY(reader.next());
        // Refused from the header alone, before the payload arrives.
        QVERIFY(!reader.append(MessageFrame {1, 0, QByteArray(1025, 'x')}.encode().left(12)));
        QVERIFY(reader.isBroken());
        QVERIFY(!reader.next());
        QVERIFY(!reader.append(QByteArray("more")));
    }

    void unknownFlagsBreakTheStream()
    {
        MessageFrameReader reader;
        QVERIFY(!reader.append(MessageFrame {1, 0x80, QByteArray()}.encode()));
    }

    void negativeIdsPassThrough()
    {
        MessageFrameReader reader;
        QVERIFY(reader.append(MessageFrame {-7, MessageFrame::IsReply, QByteArray()}.encode()));
        const auto frame = reader.next();
        QVERIFY(frame);
        QCOMPARE(frame->messageId, -7);
        QVERIFY(frame->payload.isEmpty());
    }
};

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    KeyedArchiveTest archive;
    MessageFrameTest frames;
    return QTest::qExec(&archive, argc, argv) | QTest::qExec(&frames, argc, argv);
}

#include "tst_keyedarchive.moc"
