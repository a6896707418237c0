// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "PackageCatalogue.h"

#include "core/formats/PropertyList.h"
#include "quillond_logging.h"

#include <QRegularExpression>

namespace Quillond {

namespace {

QString stringOf(const QVariantMap &map, const QString &key)
{
    const QVariant v = map.value(key);
    return v.typeId() == QMetaType::QString ? v.toString() : QString();
}

std::optional<quint64> sizeOf(const QVariantMap &map, const QString &key)
{
    const QVariant v = map.value(key);
    if (v.typeId() == QMetaType::LongLong && v.toLongLong() >= 0) {
        return quint64(v.toLongLong());
    }
    if (v.typeId() == QMetaType::ULongLong) {
        return v.toULongLong();
    }
    return std::nullopt;
}

} // namespace

bool PackageCatalogue::isSafeBundleName(const QString &name, Package::Kind kind)
{
    static const QRegularExpression plain(QStringLiteral("^[A-Za-z0-9][A-Za-z0-9_.-]{0,120}$"));
    const QString suffix = kind == Package::Kind::Voice ? QStringLiteral(".SpeechVoice")
                                                        : QStringLiteral(".SpeechRecognition");
    return plain.match(name).hasMatch() && name.endsWith(suffix) && name.size() > suffix.size()
        && !name.contains(QStringLiteral(".."));
}

bool PackageCatalogue::isSafeRelativePath(const QString &path)
{
    if (path.isEmpty() || path.startsWith(QLatin1Char('/')) || path.contains(QLatin1Char('\\'))
        || path.contains(QLatin1Char('?')) || path.contains(QLatin1Char('#'))) {
        return false;
    }
    const QStringList parts = path.split(QLatin1Char('/'));
    for (const QString &part : parts) {
        if (part.isEmpty() || part == u"." || part == u"..") {
            return false;
        }
    }
    return true;
}

PackageCatalogue PackageCatalogue::fromDictionary(const QVariantMap &catalogue)
{
    PackageCatalogue result;
    const QVariantMap packages = catalogue.value(QStringLiteral("Packages")).toMap();
    for (auto it = packages.cbegin(); it != packages.cend(); ++it) {
        if (it.value().typeId() != QMetaType::QVariantMap) {
            qCWarning(lcCatalogue, "Catalogue entry %s is not a dictionary", qPrintable(it.key()));
            continue;
        }
        const QVariantMap entry = it.value().toMap();
        Package package;
        package.tag = it.key();
        package.path = stringOf(entry, QStringLiteral("Path"));
        package.sha256 = QByteArray::fromHex(stringOf(entry, QStringLiteral("SHA256")).toLatin1());
        const auto size = sizeOf(entry, QStringLiteral("ByteSize"));
        package.kind = stringOf(entry, QStringLiteral("Kind")) == u"recognizer" ? Package::Kind::Recognizer
                                                                                : Package::Kind::Voice;
        package.bundleName = stringOf(entry, QStringLiteral("BundleName"));
        package.bundleIdentifier = stringOf(entry, QStringLiteral("BundleIdentifier"));
        package.objectIdentifier = stringOf(entry, QStringLiteral("ObjectID"));
        package.version = stringOf(entry, QStringLiteral("Version"));
        QString problem;
        if (!isSafeRelativePath(package.path)) {
            problem = QStringLiteral("its path is not a plain relative path");
        } else if (package.sha256.size() != 32) {
            problem = QStringLiteral("it has no SHA-256");
        } else if (!size) {
            problem = QStringLiteral("it has no size");
        } else if (!isSafeBundleName(package.bundleName, package.kind)) {
            problem = QStringLiteral("its bundle name is not a plain bundle name");
        }
        if (!problem.isEmpty()) {
            qCWarning(
                lcCatalogue, "Ignoring catalogue entry %s: %s", qPrintable(it.key()), qPrintable(problem));
            continue;
        }
        package.byteSize = *size;
        result.m_packages.insert(package.tag, package);
    }
    return result;
}

std::optional<PackageCatalogue> PackageCatalogue::load(const QString &path, QString *error)
{
    const auto parsed = Cadenza::Platform::PropertyList::readFile(path, error);
    if (!parsed) {
        return std::nullopt;
    }
    if (parsed->typeId() != QMetaType::QVariantMap) {
        *error = QStringLiteral("the catalogue is not a dictionary");
        return std::nullopt;
    }
    // A catalogue without a dictionary of packages is broken, not empty: serving nothing would hide it.
    if (parsed->toMap().value(QStringLiteral("Packages")).typeId() != QMetaType::QVariantMap) {
        *error = QStringLiteral("the catalogue has no dictionary \"Packages\"");
        return std::nullopt;
    }
    return fromDictionary(parsed->toMap());
}

std::optional<Package> PackageCatalogue::package(const QString &tag) const
{
    const auto it = m_packages.constFind(tag);
    if (it == m_packages.cend()) {
        return std::nullopt;
    }
    return *it;
}

} // namespace Quillond
