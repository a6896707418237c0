// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "RequestCheck.h"

#include "protocol/InstallerProtocol.h"

#include <QRegularExpression>

namespace Quillond {

using namespace Cadenza::InstallerProtocol;

namespace {

bool isInteger(const QVariant &value)
{
    switch (value.typeId()) {
    case QMetaType::Int:
    case QMetaType::UInt:
    case QMetaType::LongLong:
    case QMetaType::ULongLong:
        return true;
    default:
        return false;
    }
}

// Why the string field @p key is wrong; empty when it is right (or absent and may be).
QString stringProblem(const QVariantMap &request, const QString &key, bool required)
{
    if (!request.contains(key)) {
        return required ? QStringLiteral("the request has no %1").arg(key) : QString();
    }
    const QVariant value = request.value(key);
    if (value.typeId() != QMetaType::QString) {
        return QStringLiteral("the request's %1 is not a string").arg(key);
    }
    const QString text = value.toString();
    if (required && text.isEmpty()) {
        return QStringLiteral("the request's %1 is empty").arg(key);
    }
    if (text.size() > MaximumFieldLength) {
        return QStringLiteral("the request's %1 is longer than %2 characters")
            .arg(key)
            .arg(MaximumFieldLength);
    }
    return {};
}

} // namespace

bool RequestCheck::isClientPortName(const QString &name)
{
    static const QRegularExpression pattern(
        QStringLiteral("^%1-([0-9]{1,5})$").arg(QRegularExpression::escape(ServicePortName)));
    const auto match = pattern.match(name);
    return match.hasMatch() && match.captured(1).toInt() <= 65535;
}

QVariant RequestCheck::echoable(const QVariant &value)
{
    return value.typeId() == QMetaType::QString ? value : QVariant();
}

QString RequestCheck::problemWith(const QVariantMap &request)
{
    for (const auto &[key, required] :
        {std::pair {TagNameKey, true}, std::pair {ItemNameKey, false}, std::pair {ObjectIDKey, false}}) {
        if (QString problem = stringProblem(request, key, required); !problem.isEmpty()) {
            return problem;
        }
    }
    if (!isClientPortName(request.value(ClientPortNameKey).toString())
        || request.value(ClientPortNameKey).typeId() != QMetaType::QString) {
        return QStringLiteral("the request's %1 is not a client port name").arg(ClientPortNameKey);
    }
    for (const QString &key :
        {ItemByteSizeKey, ClientProcessIDKey, UserInteractionModeKey, ItemDownloadStatusKey}) {
        if (request.contains(key) && !isInteger(request.value(key))) {
            return QStringLiteral("the request's %1 is not an integer").arg(key);
        }
    }
    const QVariant size = request.value(ItemByteSizeKey);
    if ((size.typeId() == QMetaType::Int || size.typeId() == QMetaType::LongLong) && size.toLongLong() < 0) {
        return QStringLiteral("the request's %1 is negative").arg(ItemByteSizeKey);
    }
    return {};
}

} // namespace Quillond
