// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "AdministratorService.h"

#include "BundleRemoval.h"
#include "cadenzacore_logging.h"

#include "cadenza-config.h"

#include <QDir>
#include <QFileInfo>
#include <QProcess>

#include <dlfcn.h>
#include <unistd.h>

namespace Cadenza::Platform {

AdministratorService::~AdministratorService() = default;

QString PolkitAdministratorService::helperPath()
{
    const QString fromEnvironment = qEnvironmentVariable("CADENZA_REMOVE_HELPER");
    if (!fromEnvironment.isEmpty()) {
        return fromEnvironment;
    }
    const QString configured = QStringLiteral(CADENZA_LIBEXECDIR "/cadenza-remove-bundle");
    if (QFileInfo::exists(configured)) {
        return configured;
    }
    // Installed with another prefix than the configured one: the helper sits beside this library.
    Dl_info library {};
    if (dladdr(reinterpret_cast<const void *>(&PolkitAdministratorService::helperPath), &library) != 0
        && library.dli_fname) {
        const QString moved = QFileInfo(QString::fromLocal8Bit(library.dli_fname)).absolutePath()
            + QStringLiteral("/" CADENZA_LIBEXECDIR_FROM_LIBDIR "/cadenza-remove-bundle");
        if (QFileInfo::exists(moved)) {
            return QDir::cleanPath(moved);
        }
    }
    return configured;
}

bool PolkitAdministratorService::obtainRight(const QString &, int)
{
    // polkit decides per removal, when pkexec asks; holding the right here is only the intent.
    m_hasRight = true;
    return true;
}

bool PolkitAdministratorService::authenticate()
{
    m_authenticated = m_hasRight;
    return m_authenticated;
}

AdministratorService::Removal PolkitAdministratorService::removeBundle(const QString &path)
{
    QString error;
    const QString parent = QFileInfo(path).absolutePath();
    if (::access(QFile::encodeName(parent).constData(), W_OK) == 0) {
        if (BundleRemoval::remove(path, &error)) {
            return Removal::Removed;
        }
        qCWarning(lcInstallation, "Cannot remove %s: %s", qPrintable(path), qPrintable(error));
        return Removal::Failed;
    }
    QProcess helper;
    helper.start(QStringLiteral("pkexec"), {helperPath(), path});
    if (!helper.waitForStarted(5000)) {
        qCWarning(lcInstallation, "Cannot run pkexec to remove %s", qPrintable(path));
        return Removal::Failed;
    }
    helper.waitForFinished(-1);
    // pkexec answers 126 when the user refused or could not authenticate, 127 when not allowed.
    if (helper.exitStatus() == QProcess::NormalExit
        && (helper.exitCode() == 126 || helper.exitCode() == 127)) {
        return Removal::Refused;
    }
    if (helper.exitStatus() != QProcess::NormalExit || helper.exitCode() != 0) {
        qCWarning(lcInstallation, "Removing %s failed: %s", qPrintable(path),
            qPrintable(QString::fromLocal8Bit(helper.readAllStandardError()).trimmed()));
        return Removal::Failed;
    }
    return Removal::Removed;
}

} // namespace Cadenza::Platform
