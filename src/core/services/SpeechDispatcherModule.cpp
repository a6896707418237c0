// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "SpeechDispatcherModule.h"

#include "core/files/Paths.h"

#include "cadenza-config.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <cstdio>

namespace Cadenza::Platform {

const QString SpeechDispatcherModule::ModuleFileName = QStringLiteral("sd_cadenza");

namespace {

/// A link of ours: a symbolic link whose target is a file called sd_cadenza.
bool isOurLink(const QFileInfo &info)
{
    return info.isSymLink()
        && QFileInfo(info.symLinkTarget()).fileName() == SpeechDispatcherModule::ModuleFileName;
}

} // namespace

QString SpeechDispatcherModule::userModuleFolder()
{
    return QDir::cleanPath(Paths::userDataHome() + QStringLiteral("/../libexec/speech-dispatcher-modules"));
}

QString SpeechDispatcherModule::userModulePath()
{
    return userModuleFolder() + QLatin1Char('/') + ModuleFileName;
}

QString SpeechDispatcherModule::shippedModule(const QString &binaryFolder)
{
    const QString fromEnvironment = qEnvironmentVariable("CADENZA_SPEECHD_MODULE");
    if (!fromEnvironment.isEmpty()) {
        return QFileInfo(fromEnvironment).isExecutable() ? QFileInfo(fromEnvironment).absoluteFilePath()
                                                         : QString();
    }
    const QString moduleDir = QStringLiteral(CADENZA_SPEECHD_MODULEDIR);
    QStringList candidates;
    if (QDir::isAbsolutePath(moduleDir)) {
        candidates.append(moduleDir + QLatin1Char('/') + ModuleFileName);
    } else {
        // bin/<program>: the prefix is one folder up.
        candidates.append(
            binaryFolder + QStringLiteral("/../") + moduleDir + QLatin1Char('/') + ModuleFileName);
    }
    // Run from the build tree: apps/<program>/ beside apps/sd_cadenza/.
    candidates.append(binaryFolder + QStringLiteral("/../sd_cadenza/") + ModuleFileName);
    for (const QString &candidate : std::as_const(candidates)) {
        const QFileInfo info(candidate);
        if (info.isFile() && info.isExecutable()) {
            return info.canonicalFilePath();
        }
    }
    return {};
}

bool SpeechDispatcherModule::isInstalledForUser()
{
    const QFileInfo info(userModulePath());
    return isOurLink(info) && QFileInfo(info.symLinkTarget()).isExecutable();
}

bool SpeechDispatcherModule::installForUser(const QString &module, QString *error)
{
    auto fail = [error](const QString &message) {
        if (error) {
            *error = message;
        }
        return false;
    };
    if (module.isEmpty() || !QFileInfo(module).isExecutable()) {
        return fail(QStringLiteral("no speech-dispatcher module is installed with Cadenza"));
    }
    const QString path = userModulePath();
    const QFileInfo existing(path);
    if (existing.exists() || existing.isSymLink()) {
        if (!isOurLink(existing)) {
            return fail(QStringLiteral("%1 exists and is not Cadenza's; leaving it alone").arg(path));
        }
        if (existing.symLinkTarget() == QFileInfo(module).absoluteFilePath()) {
            return true;
        }
    }
    if (!QDir().mkpath(userModuleFolder())) {
        return fail(QStringLiteral("cannot create %1").arg(userModuleFolder()));
    }
    // Made beside the final name and renamed over it, so the server never sees a half-made module.
    const QString staging = path + QStringLiteral(".new");
    QFile::remove(staging);
    if (!QFile::link(QFileInfo(module).absoluteFilePath(), staging)
        || ::rename(QFile::encodeName(staging).constData(), QFile::encodeName(path).constData()) != 0) {
        QFile::remove(staging);
        return fail(QStringLiteral("cannot link %1").arg(path));
    }
    return true;
}

bool SpeechDispatcherModule::removeForUser(QString *error)
{
    const QString path = userModulePath();
    const QFileInfo existing(path);
    if (!existing.exists() && !existing.isSymLink()) {
        return true;
    }
    if (!isOurLink(existing)) {
        if (error) {
            *error = QStringLiteral("%1 is not Cadenza's; leaving it alone").arg(path);
        }
        return false;
    }
    if (!QFile::remove(path)) {
        if (error) {
            *error = QStringLiteral("cannot remove %1").arg(path);
        }
        return false;
    }
    return true;
}

} // namespace Cadenza::Platform
