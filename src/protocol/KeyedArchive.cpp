// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "KeyedArchive.h"

#include <QCborStreamReader>

#include <QCborStreamWriter>
#include <QDateTime>
#include <QStringDecoder>
#include <QTimeZone>
#include <QVarLengthArray>
#include <algorithm>
#include <cmath>
#include <cstring>

namespace Cadenza::Platform {

const QString KeyedArchive::RootKey = QStringLiteral("root");

namespace {

constexpr quint64 EpochDateTag = 1;

// Dates travel as seconds since the epoch in a double, and are kept as whole milliseconds. The
// nearest millisecond, not the truncated one: seconds * 1000 of a date that was archived once lies
// a hair below or above its millisecond, and truncating moved it by one on every relay. Rounding
// is exact for every millisecond of the range below, so a date survives any number of trips.
// The range is the years 1 to 9999, which every property list can write down as well.
constexpr qint64 EarliestDate = -62135596800000; // 0001-01-01T00:00:00.000Z
constexpr qint64 LatestDate = 253402300799999; // 9999-12-31T23:59:59.999Z

std::optional<qint64> dateMilliseconds(double seconds)
{
    const double milliseconds = std::round(seconds * 1000.0);
    // Also false for NaN.
    if (!(milliseconds >= double(EarliestDate) && milliseconds <= double(LatestDate))) {
        return std::nullopt;
    }
    return qint64(milliseconds);
}

class Writer
{
public:
    explicit Writer(QByteArray *out)
        : m_cbor(out)
    { }

    bool write(const QVariant &value, QString *error, int depth = 0)
    {
        if (depth > 64) {
            *error = QStringLiteral("value nested too deeply to archive");
            return false;
        }
        switch (value.typeId()) {
        case QMetaType::Bool:
            m_cbor.append(value.toBool());
            return true;
        case QMetaType::Int:
        case QMetaType::LongLong:
        case QMetaType::Long:
        case QMetaType::Short:
            m_cbor.append(qint64(value.toLongLong()));
            return true;
        case QMetaType::UInt:
        case QMetaType::ULongLong:
        case QMetaType::ULong:
        case QMetaType::UShort:
            m_cbor.append(quint64(value.toULongLong()));
            return true;
        case QMetaType::Double:
        case QMetaType::Float:
            m_cbor.append(value.toDouble());
            return true;
        case QMetaType::QString:
            m_cbor.append(value.toString());
            return true;
        case QMetaType::QByteArray:
            m_cbor.append(value.toByteArray());
            return true;
        case QMetaType::QDateTime: {
            const QDateTime date = value.toDateTime();
            const qint64 milliseconds = date.toMSecsSinceEpoch();
            if (!date.isValid() || milliseconds < EarliestDate || milliseconds > LatestDate) {
                *error = QStringLiteral("a date outside the years 1 to 9999 cannot be archived");
                return false;
            }
            m_cbor.append(QCborTag(EpochDateTag));
            m_cbor.append(double(milliseconds) / 1000.0);
            return true;
        }
        case QMetaType::QStringList:
        case QMetaType::QVariantList: {
            const QVariantList list = value.toList();
            m_cbor.startArray(quint64(list.size()));
            for (const QVariant &item : list) {
                if (!write(item, error, depth + 1)) {
                    return false;
                }
            }
            m_cbor.endArray();
            return true;
        }
        case QMetaType::QVariantMap:
        case QMetaType::QVariantHash: {
            const QVariantMap map = value.toMap();
            m_cbor.startMap(quint64(map.size()));
            for (auto it = map.cbegin(); it != map.cend(); ++it) {
                m_cbor.append(it.key());
                if (!write(it.value(), error, depth + 1)) {
                    return false;
                }
            }
            m_cbor.endMap();
            return true;
        }
        default:
            *error
                = QStringLiteral("cannot archive a value of type %1")
                      .arg(value.isValid() ? QString::fromLatin1(value.typeName()) : QStringLiteral("null"));
            return false;
        }
    }

private:
    QCborStreamWriter m_cbor;
};

class Reader
{
public:
    Reader(const QByteArray &bytes, ArchiveClasses allowed, const KeyedArchive::Limits &limits)
        : m_cbor(bytes)
        , m_allowed(allowed)
        , m_limits(limits)
    { }

    std::optional<QVariant> document(QString *error)
    {
        std::optional<QVariant> root;
        if (m_cbor.type() != QCborStreamReader::Map) {
            return fail(error, QStringLiteral("the archive is not a keyed archive"));
        }
        if (m_cbor.isLengthKnown() && m_cbor.length() > 16) {
            return fail(error, QStringLiteral("the archive has too many top-level keys"));
        }
        m_cbor.enterContainer();
        while (m_cbor.lastError() == QCborError::NoError && m_cbor.hasNext()) {
            const auto key = readText(error);
            if (!key) {
                return std::nullopt;
            }
            if (*key == KeyedArchive::RootKey && !root) {
                root = value(1, error);
                if (!root) {
                    return std::nullopt;
                }
            } else if (!skip(error)) {
                return std::nullopt;
            }
        }
        if (m_cbor.lastError() != QCborError::NoError) {
            return fail(error, m_cbor.lastError().toString());
        }
        m_cbor.leaveContainer();
        if (m_cbor.lastError() != QCborError::NoError) {
            return fail(error, m_cbor.lastError().toString());
        }
        if (!root) {
            return fail(error, QStringLiteral("the archive has no root object"));
        }
        return root;
    }

private:
    std::optional<QVariant> fail(QString *error, const QString &message)
    {
        m_failed = true;
        if (error && error->isEmpty()) {
            *error = message;
        }
        return std::nullopt;
    }

    bool count(QString *error)
    {
        if (++m_items > m_limits.maximumItems) {
            fail(error, QStringLiteral("the archive holds more than %1 values").arg(m_limits.maximumItems));
            return false;
        }
        return true;
    }

    bool allowed(ArchiveClass kind, const char *name, QString *error)
    {
        if (!m_allowed.testFlag(kind)) {
            fail(error, QStringLiteral("value of class '%1' is not allowed").arg(QLatin1String(name)));
            return false;
        }
        return true;
    }

    // Reads a text or byte string in chunks, refusing it as soon as it grows past the limit.
    template<typename Result, typename ReadChunk>
    std::optional<Result> readChunks(ReadChunk readChunk, QString *error)
    {
        if (m_cbor.isLengthKnown() && m_cbor.length() > quint64(m_limits.maximumStringBytes)) {
            fail(error, QStringLiteral("a string is longer than %1 bytes").arg(m_limits.maximumStringBytes));
            return std::nullopt;
        }
        Result result;
        auto chunk = readChunk();
        while (chunk.status == QCborStreamReader::Ok) {
            result += chunk.data;
            if (result.size() > m_limits.maximumStringBytes) {
                fail(error,
                    QStringLiteral("a string is longer than %1 bytes").arg(m_limits.maximumStringBytes));
                return std::nullopt;
            }
            chunk = readChunk();
        }
        if (chunk.status == QCborStreamReader::Error) {
            fail(error, m_cbor.lastError().toString());
            return std::nullopt;
        }
        return result;
    }

    enum class Intern : bool { No, Yes };

    std::optional<QString> readText(QString *error, Intern intern = Intern::No)
    {
        if (m_cbor.type() != QCborStreamReader::String) {
            fail(error, QStringLiteral("a dictionary key is not a string"));
            return std::nullopt;
        }
        if (auto small = readShortText(error, intern)) {
            return small;
        }
        if (m_failed) {
            return std::nullopt;
        }
        return readChunks<QString>([this] { return m_cbor.readString(); }, error);
    }

    // Status records and property lists are mostly short ASCII strings, a few dozen distinct keys
    // repeated in every record: reading those through a stack buffer and handing out one shared
    // QString per key spares two allocations and a UTF-8 decoding per key. Nothing, with no error,
    // when the string is not of that kind and must be read in chunks.
    std::optional<QString> readShortText(QString *error, Intern intern)
    {
        // Longer strings, and any string over the limit, take the chunked path, which refuses them.
        if (!m_cbor.isLengthKnown()
            || m_cbor.length() > quint64(qMin(ShortText, m_limits.maximumStringBytes))) {
            return std::nullopt;
        }
        char bytes[ShortText];
        const auto chunk = m_cbor.readStringChunk(bytes, ShortText);
        if (chunk.status == QCborStreamReader::Error) {
            fail(error, m_cbor.lastError().toString());
            return std::nullopt;
        }
        const qsizetype size = chunk.status == QCborStreamReader::Ok ? chunk.data : 0;
        if (chunk.status == QCborStreamReader::Ok) {
            // A definite-length string is one chunk; this moves past its end.
            const auto end = m_cbor.readStringChunk(nullptr, 0);
            if (end.status != QCborStreamReader::EndOfString) {
                fail(error, m_cbor.lastError().toString());
                return std::nullopt;
            }
        }
        const QByteArrayView utf8(bytes, size);
        const bool internable = intern == Intern::Yes && size <= InternedText::MaximumSize;
        if (internable) {
            for (const InternedText &known : m_interned) {
                if (known.size == size && std::memcmp(known.bytes, bytes, size_t(size)) == 0) {
                    return known.text;
                }
            }
        }
        QString text;
        if (std::all_of(utf8.begin(), utf8.end(), [](char c) { return uchar(c) < 0x80; })) {
            text = QString::fromLatin1(utf8);
        } else {
            QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless);
            text = decoder.decode(utf8);
            if (decoder.hasError()) {
                fail(error, QStringLiteral("a string is not valid UTF-8"));
                return std::nullopt;
            }
        }
        if (internable && m_interned.size() < MaximumInterned) {
            InternedText known;
            std::memcpy(known.bytes, bytes, size_t(size));
            known.size = size;
            known.text = text;
            m_interned.append(known);
        }
        return text;
    }

    bool skip(QString *error)
    {
        // Unknown top-level entries are checked like the root, then dropped.
        return value(1, error).has_value();
    }

    std::optional<QVariant> value(int depth, QString *error)
    {
        if (depth > m_limits.maximumDepth) {
            return fail(
                error, QStringLiteral("the archive is nested deeper than %1").arg(m_limits.maximumDepth));
        }
        if (!count(error)) {
            return std::nullopt;
        }
        switch (m_cbor.type()) {
        case QCborStreamReader::UnsignedInteger: {
            if (!allowed(ArchiveClass::Number, "number", error)) {
                return std::nullopt;
            }
            const quint64 v = m_cbor.toUnsignedInteger();
            m_cbor.next();
            if (v <= quint64(std::numeric_limits<qint64>::max())) {
                return QVariant::fromValue(qint64(v));
            }
            return QVariant::fromValue(v);
        }
        case QCborStreamReader::NegativeInteger: {
            if (!allowed(ArchiveClass::Number, "number", error)) {
                return std::nullopt;
            }
            const quint64 magnitude = quint64(m_cbor.toNegativeInteger());
            m_cbor.next();
            if (magnitude == 0 || magnitude > quint64(std::numeric_limits<qint64>::max()) + 1) {
                return fail(error, QStringLiteral("an integer is out of range"));
            }
            return QVariant::fromValue(qint64(0 - magnitude));
        }
        case QCborStreamReader::Float16:
        case QCborStreamReader::Float:
        case QCborStreamReader::Double: {
            if (!allowed(ArchiveClass::Number, "number", error)) {
                return std::nullopt;
            }
            double v = 0;
            if (m_cbor.isFloat16()) {
                v = double(float(m_cbor.toFloat16()));
            } else if (m_cbor.isFloat()) {
                v = double(m_cbor.toFloat());
            } else {
                v = m_cbor.toDouble();
            }
            m_cbor.next();
            return v;
        }
        case QCborStreamReader::SimpleType: {
            const QCborSimpleType simple = m_cbor.toSimpleType();
            if (simple != QCborSimpleType::True && simple != QCborSimpleType::False) {
                return fail(error, QStringLiteral("null and undefined values are not allowed"));
            }
            if (!allowed(ArchiveClass::Number, "number", error)) {
                return std::nullopt;
            }
            m_cbor.next();
            return simple == QCborSimpleType::True;
        }
        case QCborStreamReader::String: {
            if (!allowed(ArchiveClass::String, "string", error)) {
                return std::nullopt;
            }
            auto s = readText(error);
            return s ? std::optional<QVariant>(*s) : std::nullopt;
        }
        case QCborStreamReader::ByteArray: {
            if (!allowed(ArchiveClass::Data, "data", error)) {
                return std::nullopt;
            }
            auto d = readChunks<QByteArray>([this] { return m_cbor.readByteArray(); }, error);
            return d ? std::optional<QVariant>(*d) : std::nullopt;
        }
        case QCborStreamReader::Tag: {
            if (quint64(m_cbor.toTag()) != EpochDateTag) {
                return fail(error, QStringLiteral("tagged values other than dates are not allowed"));
            }
            if (!allowed(ArchiveClass::Date, "date", error)) {
                return std::nullopt;
            }
            m_cbor.next();
            double seconds = 0;
            if (m_cbor.isDouble()) {
                seconds = m_cbor.toDouble();
            } else if (m_cbor.isUnsignedInteger()) {
                seconds = double(m_cbor.toUnsignedInteger());
            } else {
                return fail(error, QStringLiteral("a date is not a number of seconds"));
            }
            m_cbor.next();
            const auto milliseconds = dateMilliseconds(seconds);
            if (!milliseconds) {
                return fail(error, QStringLiteral("a date is out of range"));
            }
            return QDateTime::fromMSecsSinceEpoch(*milliseconds, QTimeZone::utc());
        }
        case QCborStreamReader::Array: {
            if (!allowed(ArchiveClass::Array, "array", error)) {
                return std::nullopt;
            }
            if (m_cbor.isLengthKnown() && m_cbor.length() > quint64(m_limits.maximumItems)) {
                return fail(error, QStringLiteral("an array is longer than %1").arg(m_limits.maximumItems));
            }
            QVariantList list;
            if (m_cbor.isLengthKnown()) {
                list.reserve(qsizetype(qMin<quint64>(m_cbor.length(), 1024)));
            }
            if (!m_cbor.enterContainer()) {
                return fail(error, m_cbor.lastError().toString());
            }
            while (m_cbor.lastError() == QCborError::NoError && m_cbor.hasNext()) {
                auto item = value(depth + 1, error);
                if (!item) {
                    return std::nullopt;
                }
                list.append(*item);
            }
            if (m_cbor.lastError() != QCborError::NoError || !m_cbor.leaveContainer()) {
                return fail(error, m_cbor.lastError().toString());
            }
            return list;
        }
        case QCborStreamReader::Map: {
            if (!allowed(ArchiveClass::Dictionary, "dictionary", error)) {
                return std::nullopt;
            }
            if (m_cbor.isLengthKnown() && m_cbor.length() > quint64(m_limits.maximumItems)) {
                return fail(
                    error, QStringLiteral("a dictionary is larger than %1").arg(m_limits.maximumItems));
            }
            QVariantMap map;
            if (!m_cbor.enterContainer()) {
                return fail(error, m_cbor.lastError().toString());
            }
            while (m_cbor.lastError() == QCborError::NoError && m_cbor.hasNext()) {
                if (!count(error)) {
                    return std::nullopt;
                }
                auto key = readText(error, Intern::Yes);
                if (!key) {
                    return std::nullopt;
                }
                auto item = value(depth + 1, error);
                if (!item) {
                    return std::nullopt;
                }
                // Archives written here list keys in order; the hint makes each insertion constant.
                map.insert(map.cend(), *key, *item);
            }
            if (m_cbor.lastError() != QCborError::NoError || !m_cbor.leaveContainer()) {
                return fail(error, m_cbor.lastError().toString());
            }
            return map;
        }
        case QCborStreamReader::Invalid:
            return fail(error,
                m_cbor.lastError() == QCborError::NoError ? QStringLiteral("the archive ends early")
                                                          : m_cbor.lastError().toString());
        }
        return fail(error, QStringLiteral("unknown value in the archive"));
    }

    static constexpr qsizetype ShortText = 256;
    static constexpr qsizetype MaximumInterned = 64;
    struct InternedText
    {
        static constexpr qsizetype MaximumSize = 48;
        char bytes[MaximumSize];
        qsizetype size;
        QString text;
    };

    QCborStreamReader m_cbor;
    QVarLengthArray<InternedText, 32> m_interned;
    ArchiveClasses m_allowed;
    KeyedArchive::Limits m_limits;
    qsizetype m_items = 0;
    bool m_failed = false;
};

// What precedes the root value in every archive: a map of one entry, and its key. Written by hand
// so that a root archived on its own can follow it as it is.
const QByteArray &archiveHead()
{
    static const QByteArray head = [] {
        QByteArray key;
        {
            QCborStreamWriter writer(&key); // writes from the start of its array, so a fresh one
            writer.append(KeyedArchive::RootKey);
        }
        constexpr char MapOfOneEntry = char(0xA1);
        QByteArray bytes(1, MapOfOneEntry);
        bytes += key;
        return bytes;
    }();
    return head;
}

} // namespace

std::optional<QByteArray> KeyedArchive::encode(const QVariant &root, QString *error)
{
    const auto item = encodeItem(root, error);
    if (!item) {
        return std::nullopt;
    }
    QByteArray archive;
    archive.reserve(archiveHead().size() + item->size());
    archive += archiveHead();
    archive += *item;
    return archive;
}

std::optional<QByteArray> KeyedArchive::encodeItem(const QVariant &value, QString *error)
{
    QByteArray out;
    QString message;
    {
        Writer writer(&out);
        if (!writer.write(value, &message)) {
            if (error) {
                *error = message;
            }
            return std::nullopt;
        }
    }
    return out;
}

QByteArray KeyedArchive::encodeArray(const QList<QByteArray> &archivedItems)
{
    // The array's head by hand: the stream writer cannot take items that are already archived.
    QByteArray head = archiveHead();
    constexpr char ArrayMajorType = char(4 << 5);
    const quint64 count = quint64(archivedItems.size());
    if (count < 24) {
        head.append(char(ArrayMajorType | char(count)));
    } else if (count <= 0xFF) {
        head.append(char(ArrayMajorType | 24));
        head.append(char(count));
    } else if (count <= 0xFFFF) {
        head.append(char(ArrayMajorType | 25));
        head.append(char(count >> 8)).append(char(count));
    } else {
        head.append(char(ArrayMajorType | 26));
        for (int shift = 24; shift >= 0; shift -= 8) {
            head.append(char(count >> shift));
        }
    }
    qsizetype size = head.size();
    for (const QByteArray &item : archivedItems) {
        size += item.size();
    }
    head.reserve(size);
    for (const QByteArray &item : archivedItems) {
        head.append(item);
    }
    return head;
}

std::optional<QVariant> KeyedArchive::decode(
    const QByteArray &bytes, ArchiveClasses allowed, QString *error, const Limits &limits)
{
    if (bytes.isEmpty()) {
        if (error) {
            *error = QStringLiteral("the archive is empty");
        }
        return std::nullopt;
    }
    Reader reader(bytes, allowed, limits);
    return reader.document(error);
}

} // namespace Cadenza::Platform
