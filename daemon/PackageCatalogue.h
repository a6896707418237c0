// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef QUILLOND_PACKAGECATALOGUE_H
#define QUILLOND_PACKAGECATALOGUE_H

#include <QHash>
#include <QString>
#include <QVariantMap>

#include <optional>

namespace Quillond {

/// One downloadable bundle: where it comes from, how to check it and where it goes.
struct Package
{
    enum class Kind { Voice, Recognizer };

    QString tag;
    QString path; ///< relative to a repository base
    QByteArray sha256; ///< 32 bytes
    quint64 byteSize = 0;
    Kind kind = Kind::Voice;
    QString bundleName; ///< the archive's single top-level folder, such as "TobiasPremium.SpeechVoice"
    QString bundleIdentifier;
    QString objectIdentifier;
    QString version;
};

/**
 * The "Packages" section of the catalogue: installer tag to package. Entries that could lead
 * outside the repository or the bundle folders are refused when the catalogue is read.
 */
class PackageCatalogue
{
public:
    /// Reads the catalogue at @p path (a file, or a resource path starting with ":/").
    [[nodiscard]] static std::optional<PackageCatalogue> load(const QString &path, QString *error);
    [[nodiscard]] static PackageCatalogue fromDictionary(const QVariantMap &catalogue);

    [[nodiscard]] std::optional<Package> package(const QString &tag) const;
    [[nodiscard]] qsizetype size() const { return m_packages.size(); }

    /// Whether @p name is a plain bundle folder name of the given kind.
    [[nodiscard]] static bool isSafeBundleName(const QString &name, Package::Kind kind);
    /// Whether @p path stays inside the folder it is relative to.
    [[nodiscard]] static bool isSafeRelativePath(const QString &path);

private:
    QHash<QString, Package> m_packages;
};

} // namespace Quillond

#endif
