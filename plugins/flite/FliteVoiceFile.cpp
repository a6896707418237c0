// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FliteVoiceFile.h"

#include <QCryptographicHash>
#include <QFile>

#include <cstring>

namespace Cadenza::Engines {

namespace {

constexpr char Magic[] = "CMU_FLITE_CG_VOXDATA-v2.0"; // written with its terminating NUL
constexpr qint32 NativeOrder = 1; // the writer's 1 reads as 1 only in the writer's byte order
constexpr qint32 LongestString = 4096;
constexpr int MostFeatures = 512;
const QByteArray EndOfFeatures = QByteArrayLiteral("end_of_features");

/// A reader that never steps past the end of its data.
class Cursor
{
public:
    explicit Cursor(QByteArrayView data)
        : m_data(data)
    { }

    bool readInt(qint32 *value)
    {
        if (m_data.size() - m_offset < qsizetype(sizeof(qint32))) {
            return false;
        }
        std::memcpy(value, m_data.data() + m_offset, sizeof(qint32));
        m_offset += sizeof(qint32);
        return true;
    }
    /// A length-prefixed string that must end in its one NUL.
    bool readString(QByteArray *value, QString *error)
    {
        qint32 length = 0;
        if (!readInt(&length)) {
            *error = QStringLiteral("it ends inside its header");
            return false;
        }
        if (length < 1 || length > LongestString || length > m_data.size() - m_offset) {
            *error = QStringLiteral("a header string has the impossible length %1").arg(length);
            return false;
        }
        const QByteArrayView bytes = m_data.sliced(m_offset, length);
        m_offset += length;
        if (bytes.back() != '\0' || bytes.first(length - 1).contains('\0')) {
            *error = QStringLiteral("a header string is not terminated where its length says");
            return false;
        }
        *value = bytes.first(length - 1).toByteArray();
        return true;
    }
    qsizetype offset() const { return m_offset; }
    void skip(qsizetype count) { m_offset += count; }

private:
    QByteArrayView m_data;
    qsizetype m_offset = 0;
};

} // namespace

std::optional<FliteVoiceFile::Header> FliteVoiceFile::readHeader(QByteArrayView data, QString *error)
{
    QString reason;
    const auto fail = [&](const QString &why) {
        if (error) {
            *error = QStringLiteral("not a usable flite voice file: ") + why;
        }
        return std::nullopt;
    };
    if (data.size() < qsizetype(sizeof(Magic)) || std::memcmp(data.data(), Magic, sizeof(Magic)) != 0) {
        return fail(QStringLiteral("it does not start with the flite voice file header"));
    }
    Cursor cursor(data);
    cursor.skip(sizeof(Magic));
    qint32 order = 0;
    if (!cursor.readInt(&order)) {
        return fail(QStringLiteral("it ends inside its header"));
    }
    if (order != NativeOrder) {
        return fail(QStringLiteral("it was written in another byte order"));
    }
    Header header;
    for (int count = 0;; ++count) {
        if (count == MostFeatures) {
            return fail(QStringLiteral("its feature list does not end"));
        }
        QByteArray name;
        if (!cursor.readString(&name, &reason)) {
            return fail(reason);
        }
        if (name == EndOfFeatures) {
            break;
        }
        QByteArray value;
        if (!cursor.readString(&value, &reason)) {
            return fail(reason);
        }
        header.features.insert(name, value);
    }
    // A second, empty list follows, then the voice's name.
    QByteArray marker;
    if (!cursor.readString(&marker, &reason)) {
        return fail(reason);
    }
    if (marker != EndOfFeatures) {
        return fail(QStringLiteral("its feature lists are not where the format puts them"));
    }
    if (!cursor.readString(&header.voiceName, &reason)) {
        return fail(reason);
    }
    const QByteArray language = header.features.value(QByteArrayLiteral("language"));
    if (language != "eng" && language != "usenglish") {
        return fail(QStringLiteral("it needs the language '%1', which this engine does not speak")
                        .arg(QString::fromUtf8(language)));
    }
    if (cursor.offset() == data.size()) {
        return fail(QStringLiteral("it holds no voice data"));
    }
    return header;
}

std::optional<FliteVoiceFile::Header> FliteVoiceFile::check(
    const QString &path, qint64 expectedSize, const QByteArray &expectedSha256, QString *error)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        if (error) {
            *error = QStringLiteral("cannot read the voice file %1: %2").arg(path, file.errorString());
        }
        return std::nullopt;
    }
    if (expectedSize <= 0 || expectedSha256.size() != 64) {
        if (error) {
            *error = QStringLiteral("the bundle does not state the size and SHA-256 of its voice file");
        }
        return std::nullopt;
    }
    if (file.size() != expectedSize) {
        if (error) {
            *error = QStringLiteral("the voice file %1 is damaged: %2 bytes where the bundle says %3")
                         .arg(path)
                         .arg(file.size())
                         .arg(expectedSize);
        }
        return std::nullopt;
    }
    const QByteArray data = file.readAll();
    if (data.size() != expectedSize
        || QCryptographicHash::hash(data, QCryptographicHash::Sha256).toHex() != expectedSha256.toLower()) {
        if (error) {
            *error = QStringLiteral("the voice file %1 is damaged: its SHA-256 differs from the bundle's")
                         .arg(path);
        }
        return std::nullopt;
    }
    QString reason;
    auto header = readHeader(data, &reason);
    if (!header && error) {
        *error = path + QStringLiteral(" is ") + reason;
    }
    return header;
}

} // namespace Cadenza::Engines
