#include "platform/KeyedArchive.h"
#include "platform/MessageFrame.h"

#include <QCborStreamWriter>
#include <QDateTime>
#include <QTest>

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
