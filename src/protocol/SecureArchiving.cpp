// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "SecureArchiving.h"

#include "cadenzaprotocol_logging.h"
#include "protocol/KeyedArchive.h"

#include <QCborStreamReader>

namespace Cadenza {

using Platform::ArchiveClass;
using Platform::ArchiveClasses;
using Platform::KeyedArchive;

QByteArray CZEncodeSecureObject(const QVariant &object)
{
    QString error;
    const auto archived = KeyedArchive::encode(object, &error);
    if (!archived) {
        qCWarning(lcArchiving, "%s", qPrintable(error));
        return {};
    }
    return *archived;
}

namespace {

// The items of an archived array that decode on their own, when the array as a whole does not: one
// record that is too deep or of a class not allowed must not hide the others. Each item's bytes are
// found by walking the array, and decoded as an archive of their own under the same rules.
std::optional<QVariantList> decodeItemsOneByOne(const QByteArray &data, ArchiveClasses allowed)
{
    const std::optional<QByteArray> empty = KeyedArchive::encode(QString());
    const std::optional<QByteArray> emptyItem = KeyedArchive::encodeItem(QString());
    if (!empty || !emptyItem) {
        return std::nullopt;
    }
    const QByteArray head = empty->left(empty->size() - emptyItem->size());
    if (!data.startsWith(head)) {
        return std::nullopt;
    }
    QCborStreamReader reader(data);
    reader.enterContainer(); // the map of the root
    reader.next(); // its key
    if (reader.lastError() != QCborError::NoError || !reader.isArray() || !reader.enterContainer()) {
        return std::nullopt;
    }
    QVariantList items;
    qsizetype skipped = 0;
    while (reader.lastError() == QCborError::NoError && reader.hasNext()) {
        const qint64 start = reader.currentOffset();
        if (!reader.next()) {
            break;
        }
        QString error;
        const auto item
            = KeyedArchive::decode(head + data.mid(start, reader.currentOffset() - start), allowed, &error);
        if (item && item->typeId() == QMetaType::QVariantMap) {
            items.append(*item);
        } else {
            ++skipped;
        }
    }
    if (reader.lastError() != QCborError::NoError) {
        return std::nullopt;
    }
    qCWarning(
        lcArchiving, "Left out %lld records that could not be decoded", static_cast<long long>(skipped));
    return items;
}

} // namespace

std::optional<QVariantList> CZDecodeSecureArray(const QByteArray &data)
{
    QString error;
    const ArchiveClasses allowed
        = ArchiveClasses(ArchiveClass::Array) | ArchiveClass::Dictionary | Platform::PropertyListLeaves;
    const auto decoded = KeyedArchive::decode(data, allowed, &error);
    if (!decoded) {
        qCWarning(lcArchiving, "%s", qPrintable(error));
        return decodeItemsOneByOne(data, allowed);
    }
    if (decoded->typeId() != QMetaType::QVariantList) {
        return std::nullopt;
    }
    return decoded->toList();
}

std::optional<QVariantMap> CZDecodeSecureDictionary(const QByteArray &data)
{
    QString error;
    const auto decoded = KeyedArchive::decode(
        data, ArchiveClasses(ArchiveClass::Dictionary) | Platform::PropertyListLeaves, &error);
    if (!decoded) {
        qCWarning(lcArchiving, "%s", qPrintable(error));
        return std::nullopt;
    }
    return decoded->toMap();
}

} // namespace Cadenza
