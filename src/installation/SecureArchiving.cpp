#include "SecureArchiving.h"

#include "platform/KeyedArchive.h"
#include "platform/Logging.h"

namespace Cadenza {

using Platform::ArchiveClass;
using Platform::ArchiveClasses;
using Platform::KeyedArchive;

QByteArray CZEncodeSecureObject(const QVariant &object)
{
    QString error;
    const auto archived = KeyedArchive::encode(object, &error);
    if (!archived) {
        qCWarning(Platform::lcInstallation, "%s", qPrintable(error));
        return {};
    }
    return *archived;
}

std::optional<QVariantList> CZDecodeSecureArray(const QByteArray &data)
{
    QString error;
    const auto decoded = KeyedArchive::decode(data,
        ArchiveClasses(ArchiveClass::Array) | ArchiveClass::Dictionary | Platform::PropertyListLeaves,
        &error);
    if (!decoded) {
        qCWarning(Platform::lcInstallation, "%s", qPrintable(error));
        return std::nullopt;
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
        qCWarning(Platform::lcInstallation, "%s", qPrintable(error));
        return std::nullopt;
    }
    return decoded->toMap();
}

} // namespace Cadenza
