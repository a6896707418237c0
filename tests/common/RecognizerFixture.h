// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_RECOGNIZERFIXTURE_H
#define CADENZA_TESTS_RECOGNIZERFIXTURE_H

#include <QString>
#include <QVariantMap>

namespace Cadenza::Testing {

/// Recognizer bundles for tests.
class RecognizerFixture
{
public:
    /// The US English pocketsphinx model of the Debian package.
    [[nodiscard]] static QString debianModelFolder();

    /**
     * Writes "<folder>/<locale>.SpeechRecognition" for the pocketsphinx engine whose model files link
     * to the Debian package's US English model. Returns the bundle folder.
     */
    static QString writeModelBundle(const QString &folder, const QString &locale);

    /**
     * Writes a small bundle for the pocketsphinx engine whose files have the right first bytes but no
     * real content: enough for listing, not for recognising. The bundle is named @p bundleName, or
     * "<locale>.SpeechRecognition".
     */
    static QString writeTinyBundle(
        const QString &folder, const QString &locale, const QString &bundleName = {});

    enum class Damage { Truncated, Zeroed, WrongMagic };
    /// The model files a damaged bundle can have damaged: "acoustic/<name>", "language.lm.bin",
    /// "pronunciation.dict".
    [[nodiscard]] static QStringList modelFiles();

    /**
     * Writes a bundle like writeModelBundle() whose file @p file (one of modelFiles()) is a copy
     * with @p damage: cut to half its length, every byte zero, or its first four bytes changed.
     */
    static QString writeDamagedBundle(
        const QString &folder, const QString &locale, const QString &file, Damage damage);

    /// Word error rate of @p hypothesis against @p reference: word edit distance over the reference's
    /// word count, case and punctuation ignored.
    [[nodiscard]] static double wordErrorRate(const QString &reference, const QString &hypothesis);

    /// Writes a bundle with only an Info.plist holding @p info.
    static QString writeBareBundle(const QString &folder, const QString &name, const QVariantMap &info);
};

} // namespace Cadenza::Testing

#endif
