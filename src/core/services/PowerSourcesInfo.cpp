// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "PowerSourcesInfo.h"

#include "core/files/Paths.h"

#include <QDir>
#include <QFile>

namespace Cadenza::Platform {

const QString PowerSourcesInfo::StateKey = QStringLiteral("Power Source State");
const QString PowerSourcesInfo::ACPower = QStringLiteral("AC Power");
const QString PowerSourcesInfo::BatteryPower = QStringLiteral("Battery Power");
const QString PowerSourcesInfo::OffLine = QStringLiteral("Off Line");

PowerSourcesInfo::~PowerSourcesInfo() = default;

namespace {
QString readLine(const QString &path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        return {};
    }
    return QString::fromLatin1(file.read(256)).trimmed();
}
} // namespace

std::optional<QList<QVariantMap>> SysfsPowerSourcesInfo::powerSources()
{
    const QDir folder(Paths::root() + QStringLiteral("/sys/class/power_supply"));
    if (!folder.exists()) {
        return std::nullopt;
    }
    QList<QVariantMap> sources;
    const QStringList supplies
        = folder.entryList(QDir::Dirs | QDir::NoDotAndDotDot | QDir::System, QDir::Name);
    for (const QString &supply : supplies) {
        const QString base = folder.filePath(supply);
        const QString type = readLine(base + QStringLiteral("/type"));
        QString state;
        if (type == u"Mains" || type == u"USB") {
            state = readLine(base + QStringLiteral("/online")) == u"1" ? ACPower : OffLine;
        } else if (type == u"Battery") {
            // Mice and headsets have batteries too ("scope" Device, often without a status): not ours.
            const QString status = readLine(base + QStringLiteral("/status"));
            if (status.isEmpty() || readLine(base + QStringLiteral("/scope")) == u"Device") {
                continue;
            }
            state = status == u"Discharging" ? BatteryPower : ACPower;
        } else {
            continue; // peripherals' batteries say nothing about this machine
        }
        sources.append({{QStringLiteral("Name"), supply}, {StateKey, state}, {QStringLiteral("Type"), type}});
    }
    return sources;
}

} // namespace Cadenza::Platform
