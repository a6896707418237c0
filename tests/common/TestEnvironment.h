// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_TESTENVIRONMENT_H
#define CADENZA_TESTS_TESTENVIRONMENT_H

#include <QString>
#include <QTemporaryDir>
#include <QVariantMap>

#include <memory>

namespace Cadenza::Testing {

/**
 * A private world for one test: CADENZA_ROOT and every XDG folder point into a new temporary
 * folder, the platform services go back to their Linux implementations (or the fakes a test
 * installs), and the shared localisation table is chosen again. Undone on destruction.
 */
class TestEnvironment
{
public:
    TestEnvironment();
    ~TestEnvironment();

    [[nodiscard]] QString root() const { return m_dir.path(); }
    [[nodiscard]] QString path(const QString &relative) const { return m_dir.filePath(relative); }

    /// Writes a voice bundle "<folder>/<name>.SpeechVoice" with @p attributes (and English espeak-ng
    /// settings).
    static QString writeVoiceBundle(const QString &folder, const QString &name, const QVariantMap &attributes,
        const QString &engineVoice = QStringLiteral("en-us"));

    /// Writes a flite voice bundle "<folder>/<name>.SpeechVoice" carrying the flite voice @p fliteVoice
    /// ("slt", "rms", "awb", written out at build time) in its Resources, described by size and SHA-256.
    static QString writeFliteVoiceBundle(const QString &folder, const QString &name,
        const QVariantMap &attributes, const QString &fliteVoice = QStringLiteral("slt"));

    /// Attributes of a test voice.
    static QVariantMap voiceAttributes(const QString &identifier, const QString &name, const QString &locale,
        const QString &gender = QStringLiteral("VoiceGenderFemale"));

    /**
     * A downloadable voice of the catalogue as the customise voices sheet lists it: compact 2 MB,
     * full size 9 MB (whose installed voice is @p fullSizeIdentifier, if any), tagged by @p name.
     */
    static QVariantMap downloadableVoiceEntry(
        const QString &name, const QString &locale, const QString &fullSizeIdentifier = QString());

    /// Copies the sample voices, as the build completed them, into the system voice folder of this world.
    void installSampleVoices() const;

private:
    QTemporaryDir m_dir;
    QHash<QByteArray, QByteArray> m_saved;
};

} // namespace Cadenza::Testing

#endif
