// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "VoiceIndex.h"

#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"

#include <QCborStreamReader>
#include <QCborStreamWriter>
#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QSaveFile>
#include <QtEndian>

#include <zlib.h>

#include <algorithm>
#include <cstring>

namespace Cadenza::Platform {

namespace {

// File layout: the magic, then (little-endian) the format version, the CRC-32 of the payload and
// the payload's length; the payload is a CBOR array of two parts, the string table (an array of text)
// and the entries (an array). Every text of the entries is an index into the string table, since the same
// keys and values recur in every voice and a table entry is decoded once.
constexpr char Magic[8] = {'C', 'Z', 'V', 'O', 'I', 'D', 'X', '\n'};
constexpr qsizetype HeaderSize = 8 + 4 + 4 + 8;
// Largest text or data value; values of an Info.plist are far shorter.
constexpr qint64 MaximumString = 1024 * 1024;
// Tags of our own (unassigned in the CBOR tag registry) mark the plist types other than text.
constexpr quint64 IntegerTag = 6;
constexpr quint64 DateTag = 7;
constexpr qsizetype EntryFields = 5;
constexpr qsizetype VoiceFields = 11;

class Encoder
{
public:
    QHash<QString, quint64> refs;
    QStringList table;

    quint64 ref(const QString &text)
    {
        const auto it = refs.constFind(text);
        if (it != refs.cend()) {
            return *it;
        }
        const quint64 index = quint64(table.size());
        refs.insert(text, index);
        table.append(text);
        return index;
    }

    /// Whether @p text, as UTF-8, is no longer than the decoder reads.
    static bool fits(const QString &text) { return text.size() <= MaximumString / 3; }

    /// Whether value() can write @p value: the types an Info.plist holds, nested no deeper than it may.
    static bool encodable(const QVariant &value, int depth)
    {
        if (depth > PropertyList::MaximumDepth) {
            return false;
        }
        switch (value.typeId()) {
        case QMetaType::QString:
            return fits(value.toString());
        case QMetaType::LongLong:
        case QMetaType::Int:
        case QMetaType::ULongLong:
        case QMetaType::Double:
        case QMetaType::Bool:
            return true;
        case QMetaType::QDateTime:
            return value.toDateTime().isValid();
        case QMetaType::QByteArray:
            return value.toByteArray().size() <= MaximumString;
        case QMetaType::QVariantList: {
            const QVariantList list = value.toList();
            return std::all_of(list.cbegin(), list.cend(),
                [depth](const QVariant &item) { return encodable(item, depth + 1); });
        }
        case QMetaType::QVariantMap: {
            const QVariantMap map = value.toMap();
            for (auto it = map.cbegin(); it != map.cend(); ++it) {
                if (!fits(it.key()) || !encodable(it.value(), depth + 1)) {
                    return false;
                }
            }
            return true;
        }
        default:
            return false;
        }
    }

    /// Writes @p value, which encodable() accepted.
    bool value(QCborStreamWriter &w, const QVariant &value, int depth)
    {
        switch (value.typeId()) {
        case QMetaType::QString:
            w.append(ref(value.toString()));
            return true;
        case QMetaType::LongLong:
        case QMetaType::Int:
            w.append(QCborTag(IntegerTag));
            w.append(value.toLongLong());
            return true;
        case QMetaType::ULongLong:
            w.append(QCborTag(IntegerTag));
            w.append(value.toULongLong());
            return true;
        case QMetaType::Double:
            w.append(value.toDouble());
            return true;
        case QMetaType::Bool:
            w.append(value.toBool());
            return true;
        case QMetaType::QDateTime: {
            const QDateTime date = value.toDateTime();
            if (!date.isValid()) {
                return false;
            }
            w.append(QCborTag(DateTag));
            w.append(date.toMSecsSinceEpoch());
            return true;
        }
        case QMetaType::QByteArray: {
            const QByteArray data = value.toByteArray();
            if (data.size() > MaximumString) {
                return false;
            }
            w.append(data);
            return true;
        }
        case QMetaType::QVariantList: {
            const QVariantList list = value.toList();
            w.startArray(quint64(list.size()));
            for (const QVariant &item : list) {
                if (!this->value(w, item, depth + 1)) {
                    return false;
                }
            }
            w.endArray();
            return true;
        }
        case QMetaType::QVariantMap:
            return map(w, value.toMap(), depth);
        default:
            return false;
        }
    }

    bool map(QCborStreamWriter &w, const QVariantMap &map, int depth)
    {
        w.startMap(quint64(map.size()));
        for (auto it = map.cbegin(); it != map.cend(); ++it) {
            w.append(ref(it.key()));
            if (!value(w, it.value(), depth + 1)) {
                return false;
            }
        }
        w.endMap();
        return true;
    }

    bool entry(QCborStreamWriter &w, const QString &path, const VoiceIndex::Entry &entry)
    {
        w.startArray(EntryFields);
        w.append(ref(path));
        w.append(entry.stamp.modifiedNs);
        w.append(entry.stamp.size);
        w.append(entry.stamp.inode);
        if (!entry.voice) {
            w.startArray(1);
            w.append(ref(entry.error));
            w.endArray();
            w.endArray();
            return true;
        }
        const VoiceDescription &voice = *entry.voice;
        w.startArray(VoiceFields);
        w.append(ref(voice.identifier));
        w.append(ref(voice.version));
        if (!map(w, voice.attributes, 0)) {
            return false;
        }
        w.startArray(quint64(voice.groups.size()));
        for (const QString &group : voice.groups) {
            w.append(ref(group));
        }
        w.endArray();
        if (voice.spec) {
            w.startArray(2);
            w.append(qint64(voice.spec->first));
            w.append(qint64(voice.spec->second));
            w.endArray();
        } else {
            w.append(nullptr);
        }
        w.append(ref(voice.engineName));
        w.append(ref(voice.engineVoice));
        w.append(ref(voice.engineVariant));
        w.append(qint64(voice.enginePitch));
        w.append(qint64(voice.engineRate));
        if (!map(w, voice.engineSettings, 0)) {
            return false;
        }
        w.endArray();
        w.endArray();
        return true;
    }
};

class Decoder
{
public:
    explicit Decoder(const QByteArray &payload)
        : m_reader(payload)
        , m_size(payload.size())
    { }

    QString error;

    std::optional<VoiceIndex::Entries> run()
    {
        qsizetype parts = 0;
        if (!enterArray(&parts) || parts != 2) {
            return fail(QStringLiteral("not two parts"));
        }
        if (!readTable()) {
            return fail(QStringLiteral("bad string table"));
        }
        qsizetype count = 0;
        if (!enterArray(&count)) {
            return fail(QStringLiteral("no entries"));
        }
        VoiceIndex::Entries entries;
        entries.reserve(count);
        for (qsizetype i = 0; i < count; ++i) {
            QString path;
            VoiceIndex::Entry entry;
            if (!readEntry(&path, &entry)) {
                return fail(error.isEmpty() ? QStringLiteral("bad entry %1").arg(i) : error);
            }
            if (entries.contains(path)) {
                return fail(QStringLiteral("bundle listed twice"));
            }
            entries.insert(path, entry);
        }
        if (!leave() || !leave() || m_reader.currentOffset() != m_size) {
            return fail(QStringLiteral("bytes after the entries"));
        }
        return entries;
    }

private:
    QCborStreamReader m_reader;
    qsizetype m_size;
    QStringList m_table;

    std::nullopt_t fail(const QString &why)
    {
        if (error.isEmpty()) {
            error = why;
        }
        return std::nullopt;
    }

    qsizetype remaining() const { return m_size - qsizetype(m_reader.currentOffset()); }

    /// Enters a definite-length array; its length is bounded by the bytes left (one at least each).
    bool enterArray(qsizetype *count)
    {
        if (!m_reader.isArray() || !m_reader.isLengthKnown() || m_reader.length() > quint64(remaining())) {
            return false;
        }
        *count = qsizetype(m_reader.length());
        return m_reader.enterContainer();
    }

    bool enterMap(qsizetype *count)
    {
        if (!m_reader.isMap() || !m_reader.isLengthKnown() || m_reader.length() > quint64(remaining()) / 2) {
            return false;
        }
        *count = qsizetype(m_reader.length());
        return m_reader.enterContainer();
    }

    bool leave()
    {
        return m_reader.lastError() == QCborError::NoError && !m_reader.hasNext()
            && m_reader.leaveContainer();
    }

    bool readTable()
    {
        qsizetype count = 0;
        if (!enterArray(&count)) {
            return false;
        }
        m_table.reserve(count);
        for (qsizetype i = 0; i < count; ++i) {
            if (!m_reader.isString() || !m_reader.isLengthKnown()
                || m_reader.length() > quint64(std::min<qint64>(MaximumString, remaining()))) {
                return false;
            }
            QString text;
            auto chunk = m_reader.readString();
            while (chunk.status == QCborStreamReader::Ok) {
                text += chunk.data;
                chunk = m_reader.readString();
            }
            if (chunk.status != QCborStreamReader::EndOfString) {
                return false;
            }
            m_table.append(text);
        }
        return leave();
    }

    bool readRef(QString *text)
    {
        if (!m_reader.isUnsignedInteger() || m_reader.toUnsignedInteger() >= quint64(m_table.size())) {
            return false;
        }
        *text = m_table.at(qsizetype(m_reader.toUnsignedInteger()));
        return m_reader.next();
    }

    bool readInteger(qint64 *value)
    {
        if (!m_reader.isInteger()) {
            return false;
        }
        if (m_reader.isUnsignedInteger() && m_reader.toUnsignedInteger() > quint64(INT64_MAX)) {
            return false;
        }
        if (m_reader.isNegativeInteger() && quint64(m_reader.toNegativeInteger()) > quint64(INT64_MAX)) {
            return false;
        }
        *value = m_reader.toInteger();
        return m_reader.next();
    }

    bool readUnsigned(quint64 *value)
    {
        if (!m_reader.isUnsignedInteger()) {
            return false;
        }
        *value = m_reader.toUnsignedInteger();
        return m_reader.next();
    }

    bool readValue(QVariant *value, int depth)
    {
        if (depth > PropertyList::MaximumDepth) {
            return false;
        }
        switch (m_reader.type()) {
        case QCborStreamReader::UnsignedInteger: {
            QString text;
            if (!readRef(&text)) {
                return false;
            }
            *value = text;
            return true;
        }
        case QCborStreamReader::Tag: {
            const quint64 tag = quint64(m_reader.toTag());
            if (!m_reader.next()) {
                return false;
            }
            if (tag == IntegerTag) {
                if (m_reader.isUnsignedInteger() && m_reader.toUnsignedInteger() > quint64(INT64_MAX)) {
                    *value = QVariant::fromValue(quint64(m_reader.toUnsignedInteger()));
                    return m_reader.next();
                }
                qint64 v = 0;
                if (!readInteger(&v)) {
                    return false;
                }
                *value = QVariant::fromValue(v);
                return true;
            }
            if (tag == DateTag) {
                qint64 ms = 0;
                if (!readInteger(&ms)) {
                    return false;
                }
                const QDateTime date = QDateTime::fromMSecsSinceEpoch(ms, Qt::UTC);
                if (!date.isValid()) {
                    return false;
                }
                *value = date;
                return true;
            }
            return false;
        }
        case QCborStreamReader::SimpleType:
            if (!m_reader.isBool()) {
                return false;
            }
            *value = m_reader.toBool();
            return m_reader.next();
        case QCborStreamReader::Double:
            *value = m_reader.toDouble();
            return m_reader.next();
        case QCborStreamReader::ByteArray: {
            if (!m_reader.isLengthKnown()
                || m_reader.length() > quint64(std::min<qint64>(MaximumString, remaining()))) {
                return false;
            }
            QByteArray data;
            auto chunk = m_reader.readByteArray();
            while (chunk.status == QCborStreamReader::Ok) {
                data += chunk.data;
                chunk = m_reader.readByteArray();
            }
            if (chunk.status != QCborStreamReader::EndOfString) {
                return false;
            }
            *value = data;
            return true;
        }
        case QCborStreamReader::Array: {
            qsizetype count = 0;
            if (!enterArray(&count)) {
                return false;
            }
            QVariantList list;
            list.reserve(count);
            for (qsizetype i = 0; i < count; ++i) {
                QVariant item;
                if (!readValue(&item, depth + 1)) {
                    return false;
                }
                list.append(item);
            }
            *value = list;
            return leave();
        }
        case QCborStreamReader::Map: {
            QVariantMap map;
            if (!readMap(&map, depth)) {
                return false;
            }
            *value = map;
            return true;
        }
        default:
            return false;
        }
    }

    bool readMap(QVariantMap *map, int depth)
    {
        qsizetype count = 0;
        if (!enterMap(&count)) {
            return false;
        }
        // Keys come in the map's own order: each is appended at the end without a search (a key out
        // of order still lands in its place). A key given twice leaves the map short.
        for (qsizetype i = 0; i < count; ++i) {
            QString key;
            QVariant value;
            if (!readRef(&key) || !readValue(&value, depth + 1)) {
                return false;
            }
            map->insert(map->cend(), key, value);
        }
        if (map->size() != count) {
            return false;
        }
        return leave();
    }

    bool readVoice(VoiceDescription *voice)
    {
        qsizetype groups = 0;
        if (!readRef(&voice->identifier) || !readRef(&voice->version) || !readMap(&voice->attributes, 0)
            || !enterArray(&groups)) {
            return false;
        }
        for (qsizetype i = 0; i < groups; ++i) {
            QString group;
            if (!readRef(&group)) {
                return false;
            }
            voice->groups.append(group);
        }
        if (!leave()) {
            return false;
        }
        if (m_reader.isNull()) {
            if (!m_reader.next()) {
                return false;
            }
        } else {
            qsizetype two = 0;
            qint64 creator = 0;
            qint64 id = 0;
            if (!enterArray(&two) || two != 2 || !readInteger(&creator) || !readInteger(&id) || !leave()
                || creator != qint32(creator) || id != qint32(id)) {
                return false;
            }
            voice->spec = std::pair<qint32, qint32>(qint32(creator), qint32(id));
        }
        qint64 pitch = 0;
        qint64 rate = 0;
        if (!readRef(&voice->engineName) || !readRef(&voice->engineVoice) || !readRef(&voice->engineVariant)
            || !readInteger(&pitch) || !readInteger(&rate) || !readMap(&voice->engineSettings, 0)) {
            return false;
        }
        voice->enginePitch = int(pitch);
        voice->engineRate = int(rate);
        // What every parsed voice holds; an index saying otherwise was not written by us.
        const QVariant name = voice->attributes.value(VoiceAttribute::Name);
        return !voice->identifier.isEmpty() && !voice->groups.isEmpty() && !voice->engineName.isEmpty()
            && pitch >= 0 && pitch <= 100 && rate >= 80 && rate <= 450
            && voice->attributes.value(VoiceAttribute::Identifier) == QVariant(voice->identifier)
            && name.typeId() == QMetaType::QString && !name.toString().isEmpty();
    }

    bool readEntry(QString *path, VoiceIndex::Entry *entry)
    {
        qsizetype fields = 0;
        quint64 size = 0;
        if (!enterArray(&fields) || fields != EntryFields || !readRef(path)
            || !path->startsWith(QLatin1Char('/')) || !readInteger(&entry->stamp.modifiedNs)
            || !readUnsigned(&size) || size > quint64(INT64_MAX) || !readUnsigned(&entry->stamp.inode)) {
            return false;
        }
        entry->stamp.size = qint64(size);
        qsizetype bodyFields = 0;
        if (!enterArray(&bodyFields)) {
            return false;
        }
        if (bodyFields == 1) {
            if (!readRef(&entry->error) || entry->error.isEmpty()) {
                return false;
            }
        } else if (bodyFields == VoiceFields) {
            VoiceDescription voice;
            if (!readVoice(&voice)) {
                return false;
            }
            voice.bundlePath = *path;
            entry->voice = std::move(voice);
        } else {
            return false;
        }
        return leave() && leave();
    }
};

} // namespace

QString VoiceIndex::defaultPath()
{
    return Paths::cacheFolder() + QStringLiteral("/voices.index");
}

VoiceIndex::VoiceIndex(const QString &path)
    : m_path(path)
{ }

bool VoiceIndex::load(QString *why)
{
    m_entries.clear();
    m_changed = false;
    QFile file(m_path);
    if (!file.open(QIODevice::ReadOnly)) {
        if (why) {
            *why = file.errorString();
        }
        return false;
    }
    if (file.size() > MaximumFileSize) {
        if (why) {
            *why = QStringLiteral("larger than %1 bytes").arg(MaximumFileSize);
        }
        return false;
    }
    QString error;
    auto entries = decode(file.readAll(), &error);
    if (!entries) {
        // Written anew on the next save, even when nothing else changes.
        m_changed = true;
        if (why) {
            *why = error;
        }
        return false;
    }
    m_entries = std::move(*entries);
    return true;
}

bool VoiceIndex::saveIfChanged(QString *error)
{
    if (!m_changed) {
        return true;
    }
    const QString folder = QFileInfo(m_path).absolutePath();
    if (!QDir().mkpath(folder)) {
        if (error) {
            *error = QStringLiteral("cannot make %1").arg(folder);
        }
        return false;
    }
    // A temporary file of its own, renamed over the index: readers see the old or the new file whole.
    QSaveFile file(m_path);
    if (!file.open(QIODevice::WriteOnly)) {
        if (error) {
            *error = file.errorString();
        }
        return false;
    }
    const QByteArray bytes = encode(m_entries);
    if (file.write(bytes) != bytes.size() || !file.commit()) {
        if (error) {
            *error = file.errorString();
        }
        return false;
    }
    m_changed = false;
    return true;
}

const VoiceIndex::Entry *VoiceIndex::find(const QString &bundlePath, const Stamp &stamp) const
{
    const auto it = m_entries.constFind(bundlePath);
    return it != m_entries.cend() && it->stamp == stamp ? &*it : nullptr;
}

void VoiceIndex::insert(const QString &bundlePath, const Entry &entry)
{
    m_entries.insert(bundlePath, entry);
    m_changed = true;
}

void VoiceIndex::retainInFolder(const QString &folder, const QSet<QString> &present)
{
    const QString prefix = folder + QLatin1Char('/');
    for (auto it = m_entries.begin(); it != m_entries.end();) {
        if (it.key().startsWith(prefix) && it.key().indexOf(QLatin1Char('/'), prefix.size()) < 0
            && !present.contains(it.key())) {
            it = m_entries.erase(it);
            m_changed = true;
        } else {
            ++it;
        }
    }
}

QByteArray VoiceIndex::encode(const Entries &entries)
{
    auto keepable = [](const Entry &entry) {
        return !entry.voice
            || (Encoder::fits(entry.voice->version)
                && Encoder::encodable(QVariant(entry.voice->attributes), 0)
                && Encoder::encodable(QVariant(entry.voice->engineSettings), 0));
    };
    quint64 count = 0;
    for (const Entry &entry : entries) {
        count += keepable(entry) ? 1 : 0;
    }
    Encoder encoder;
    QByteArray body;
    {
        QCborStreamWriter w(&body);
        w.startArray(count);
        for (auto it = entries.cbegin(); it != entries.cend(); ++it) {
            if (keepable(*it)) {
                encoder.entry(w, it.key(), *it);
            }
        }
        w.endArray();
    }
    // One array of the two parts; its head (0x82) is written by hand since the entries are
    // encoded before the table they refer to.
    QByteArray table;
    {
        QCborStreamWriter w(&table);
        w.startArray(quint64(encoder.table.size()));
        for (const QString &text : std::as_const(encoder.table)) {
            w.append(text);
        }
        w.endArray();
    }
    const QByteArray payload = QByteArray(1, char(0x82)) + table + body;

    QByteArray bytes(HeaderSize, Qt::Uninitialized);
    std::memcpy(bytes.data(), Magic, sizeof Magic);
    qToLittleEndian<quint32>(FormatVersion, bytes.data() + 8);
    const uLong crc = crc32(0L, reinterpret_cast<const Bytef *>(payload.constData()), uInt(payload.size()));
    qToLittleEndian<quint32>(quint32(crc), bytes.data() + 12);
    qToLittleEndian<quint64>(quint64(payload.size()), bytes.data() + 16);
    return bytes + payload;
}

std::optional<VoiceIndex::Entries> VoiceIndex::decode(const QByteArray &bytes, QString *error)
{
    auto fail = [error](const QString &why) -> std::optional<Entries> {
        if (error) {
            *error = why;
        }
        return std::nullopt;
    };
    if (bytes.size() < HeaderSize || std::memcmp(bytes.constData(), Magic, sizeof Magic) != 0) {
        return fail(QStringLiteral("not a voice index"));
    }
    const quint32 version = qFromLittleEndian<quint32>(bytes.constData() + 8);
    if (version != FormatVersion) {
        return fail(QStringLiteral("format version %1, not %2").arg(version).arg(FormatVersion));
    }
    const quint64 length = qFromLittleEndian<quint64>(bytes.constData() + 16);
    if (length != quint64(bytes.size() - HeaderSize)) {
        return fail(QStringLiteral("truncated or extended"));
    }
    const QByteArray payload
        = QByteArray::fromRawData(bytes.constData() + HeaderSize, bytes.size() - HeaderSize);
    const uLong crc = crc32(0L, reinterpret_cast<const Bytef *>(payload.constData()), uInt(payload.size()));
    if (quint32(crc) != qFromLittleEndian<quint32>(bytes.constData() + 12)) {
        return fail(QStringLiteral("checksum mismatch"));
    }
    Decoder decoder(payload);
    auto entries = decoder.run();
    if (!entries) {
        return fail(decoder.error);
    }
    return entries;
}

} // namespace Cadenza::Platform
