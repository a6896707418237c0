// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "PocketsphinxModelCheck.h"

#include <QFile>
#include <QFileInfo>
#include <QtEndian>

#include <cstring>

namespace Cadenza::Engines {

namespace {

QByteArray head(const QString &path, qint64 size)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.read(size) : QByteArray();
}

bool fileMissing(const QString &path, const QString &what, QString *reason)
{
    const QFileInfo info(path);
    if (path.isEmpty() || !info.isFile() || info.size() == 0) {
        *reason = path.isEmpty() ? QStringLiteral("the bundle names no %1").arg(what)
                                 : QStringLiteral("the %1 %2 is missing or empty").arg(what, path);
        return true;
    }
    return false;
}

/**
 * The tables of Gaussian means and variances ("gauden"), the transition matrices and the plain
 * mixture weights: a text header
 * from "s3" to "endhdr", a byte-order word, counts, then as many 32-bit floats as the counts say and,
 * when the header says so, a checksum. The counts must agree with the file's size, so a cut or
 * padded file is found without reading the tables.
 */
enum class TableKind { Gaussians, TransitionMatrices, MixtureWeights };

bool checkTableFile(const QString &path, TableKind kind, QString *reason)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        *reason = QStringLiteral("the acoustic model file %1 cannot be read").arg(path);
        return false;
    }
    const QByteArray start = file.read(4096);
    const auto bad = [&](const QString &why) {
        *reason = QStringLiteral("the acoustic model file %1 is damaged (%2)").arg(path, why);
        return false;
    };
    if (!start.startsWith("s3\n")) {
        return bad(QStringLiteral("no table header"));
    }
    const qsizetype headerEnd = start.indexOf("endhdr\n");
    if (headerEnd < 0) {
        return bad(QStringLiteral("its header does not end"));
    }
    const bool checksum = start.left(headerEnd).contains("chksum0 yes");
    qsizetype at = headerEnd + 7;
    bool swapped = false;
    const auto word = [&](quint32 *value) {
        if (at + 4 > start.size()) {
            return false;
        }
        quint32 raw;
        std::memcpy(&raw, start.constData() + at, 4);
        at += 4;
        *value = swapped ? qbswap(raw) : raw;
        return true;
    };
    quint32 magic = 0;
    if (!word(&magic)) {
        return bad(QStringLiteral("cut after its header"));
    }
    if (magic != 0x11223344) {
        if (qbswap(magic) != 0x11223344) {
            return bad(QStringLiteral("no byte-order mark"));
        }
        swapped = true;
    }
    // Counts of a real model are small; the limits keep the products far from overflowing.
    constexpr quint32 Limit = 1u << 20;
    quint64 expected = 0;
    if (kind == TableKind::MixtureWeights) {
        quint32 senones = 0, streams = 0, densities = 0;
        if (!word(&senones) || !word(&streams) || !word(&densities) || senones == 0 || streams == 0
            || densities == 0 || senones > Limit || streams > 64 || densities > Limit) {
            return bad(QStringLiteral("impossible counts"));
        }
        expected = quint64(senones) * streams * densities;
    } else if (kind == TableKind::Gaussians) {
        quint32 mixtures = 0, streams = 0, densities = 0;
        if (!word(&mixtures) || !word(&streams) || !word(&densities) || mixtures == 0 || streams == 0
            || densities == 0 || mixtures > Limit || streams > 64 || densities > Limit) {
            return bad(QStringLiteral("impossible counts"));
        }
        quint64 length = 0;
        for (quint32 i = 0; i < streams; ++i) {
            quint32 streamLength = 0;
            if (!word(&streamLength) || streamLength == 0 || streamLength > 4096) {
                return bad(QStringLiteral("impossible vector lengths"));
            }
            length += streamLength;
        }
        expected = quint64(mixtures) * densities * length;
    } else {
        quint32 matrices = 0, from = 0, to = 0;
        if (!word(&matrices) || !word(&from) || !word(&to) || matrices == 0 || from == 0 || to != from + 1
            || matrices > Limit || from > 64) {
            return bad(QStringLiteral("impossible counts"));
        }
        expected = quint64(matrices) * from * to;
    }
    quint32 total = 0;
    if (!word(&total) || total != expected) {
        return bad(QStringLiteral("its counts disagree"));
    }
    const quint64 size = quint64(at) + expected * 4 + (checksum ? 4 : 0);
    if (quint64(file.size()) != size) {
        return bad(QStringLiteral("%1 bytes where its header promises %2").arg(file.size()).arg(size));
    }
    return true;
}

/// Reads little-endian 32-bit words from a byte array, remembering whether it ran out.
struct WordReader
{
    const QByteArray &bytes;
    qsizetype at = 0;
    bool ok = true;

    qint32 next()
    {
        if (at < 0 || at + 4 > bytes.size()) {
            ok = false;
            return 0;
        }
        qint32 value;
        std::memcpy(&value, bytes.constData() + at, 4);
        at += 4;
        return qFromLittleEndian(value);
    }
};

/**
 * The mixture weights in the compressed form ("sendump"): length-prefixed header strings ending
 * with an empty one, the number of codewords and of senones, then one byte per feature stream,
 * codeword and senone. pocketsphinx reads a cut file without complaint and decodes garbage.
 */
bool checkSenoneDump(const QString &path, QString *reason)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        *reason = QStringLiteral("the acoustic model file %1 cannot be read").arg(path);
        return false;
    }
    const QByteArray start = file.read(16384);
    const auto bad = [&](const QString &why) {
        *reason = QStringLiteral("the acoustic model file %1 is damaged (%2)").arg(path, why);
        return false;
    };
    WordReader reader {start};
    qint64 clusters = -1;
    qint64 streams = 1;
    for (int strings = 0;; ++strings) {
        const qint32 length = reader.next();
        if (!reader.ok || strings > 200 || length < 0 || length > 4096) {
            return bad(QStringLiteral("no header"));
        }
        if (length == 0) {
            break;
        }
        if (reader.at + length > start.size()) {
            return bad(QStringLiteral("no header"));
        }
        // Most strings end with a zero byte, not all.
        const QByteArray line = QByteArray(start.constData() + reader.at, length)
                                    .chopped(start.at(reader.at + length - 1) == '\0' ? 1 : 0);
        if (line.startsWith("cluster_count ")) {
            clusters = line.mid(14).toLongLong();
        } else if (line.startsWith("feature_count ")) {
            streams = line.mid(14).toLongLong();
        }
        reader.at += length;
    }
    const qint32 codewords = reader.next();
    const qint32 senones = reader.next();
    if (!reader.ok || codewords <= 0 || codewords > 65536 || senones <= 0 || senones > 1000000 || streams <= 0
        || streams > 64) {
        return bad(QStringLiteral("impossible counts"));
    }
    if (clusters != 0) {
        return true; // the quantised form is not checked further
    }
    const qint64 expected = qint64(reader.at) + streams * codewords * senones;
    if (file.size() < expected) {
        return bad(QStringLiteral("%1 bytes where its header promises %2").arg(file.size()).arg(expected));
    }
    return true;
}

/**
 * The binary model definition: "BMDF", a version, a described header, ten counts, the phone names,
 * then tables whose sizes follow from the counts. A cut file makes pocketsphinx read past its end.
 */
bool checkBinaryModelDefinition(const QString &path, QString *reason)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        *reason = QStringLiteral("the acoustic model file %1 cannot be read").arg(path);
        return false;
    }
    const QByteArray start = file.read(65536);
    const auto bad = [&](const QString &why) {
        *reason = QStringLiteral("the acoustic model file %1 is damaged (%2)").arg(path, why);
        return false;
    };
    WordReader reader {start, 8};
    const qint32 headerLength = reader.next();
    if (!reader.ok || headerLength < 0 || headerLength > 16384) {
        return bad(QStringLiteral("no header"));
    }
    reader.at += headerLength;
    qint32 counts[10];
    for (qint32 &count : counts) {
        count = reader.next();
    }
    const auto [ciPhones, phones, emittingStates, ciSenones, senones, matrices, sequences, context, treeNodes,
        silence]
        = counts;
    Q_UNUSED(ciSenones)
    Q_UNUSED(matrices)
    Q_UNUSED(context)
    Q_UNUSED(silence)
    if (!reader.ok || ciPhones <= 0 || ciPhones > 1024 || phones < ciPhones || phones > 10000000
        || emittingStates < 0 || emittingStates > 16 || senones <= 0 || sequences <= 0 || sequences > 10000000
        || treeNodes < 0 || treeNodes > 10000000) {
        return bad(QStringLiteral("impossible counts"));
    }
    qsizetype at = reader.at;
    for (qint32 i = 0; i < ciPhones; ++i) {
        at = start.indexOf('\0', at);
        if (at < 0) {
            return bad(QStringLiteral("cut in its phone names"));
        }
        ++at;
    }
    at = (at + 3) & ~qsizetype(3);
    // Tree nodes of 8 bytes, phones of 12, senone sequences of 16-bit ids (their lengths follow when
    // phones differ in length, so this is the least a whole file holds).
    const qint64 expected = qint64(at) + qint64(treeNodes) * 8 + qint64(phones) * 12
        + qint64(sequences) * qMax(emittingStates, 1) * 2;
    if (file.size() < expected) {
        return bad(QStringLiteral("%1 bytes where its header promises %2").arg(file.size()).arg(expected));
    }
    return true;
}

/// Feature parameters are whole lines of "-name value"; a file cut inside a line is damaged.
bool plausibleFeatureParameters(const QByteArray &content)
{
    if (!content.startsWith('-') || !content.endsWith('\n') || content.contains('\0')) {
        return false;
    }
    for (const QByteArray &line : content.split('\n')) {
        const QByteArray trimmed = line.trimmed();
        if (!trimmed.isEmpty() && (!trimmed.startsWith('-') || trimmed.simplified().split(' ').size() != 2)) {
            return false;
        }
    }
    return true;
}

/// A language model in one of the three forms pocketsphinx reads: binary trie, DMP or ARPA text.
bool plausibleLanguageModel(const QByteArray &start)
{
    if (start.startsWith("Trie Language Model")) {
        return true;
    }
    if (start.size() >= 20 && start.mid(4, 16) == "Darpa Trigram LM") {
        return true;
    }
    // ARPA text: comments may come before the data section.
    return start.contains("\\data\\");
}

/// A dictionary line is a word followed by at least one phone.
bool plausibleDictionary(const QByteArray &start)
{
    const QByteArray firstLine = start.left(start.indexOf('\n')).trimmed();
    return !firstLine.isEmpty() && firstLine.split(' ').size() >= 2 && !firstLine.contains('\0');
}

} // namespace

bool PocketsphinxModelFiles::resolve(const Platform::RecognizerModel &model, QString *reason)
{
    QString ignored;
    QString &why = reason ? *reason : ignored;
    acousticModel = model.filePath(QStringLiteral("AcousticModel"));
    languageModel = model.filePath(QStringLiteral("LanguageModel"));
    dictionary = model.filePath(QStringLiteral("Dictionary"));
    if (acousticModel.isEmpty() || !QFileInfo(acousticModel).isDir()) {
        why = acousticModel.isEmpty()
            ? QStringLiteral("the bundle names no acoustic model folder")
            : QStringLiteral("the acoustic model folder %1 is missing").arg(acousticModel);
        return false;
    }
    for (const char *part : {"mdef", "means", "variances", "transition_matrices", "feat.params"}) {
        if (fileMissing(acousticModel + QLatin1Char('/') + QLatin1String(part),
                QStringLiteral("acoustic model file"), &why)) {
            return false;
        }
    }
    const bool mixtureWeights = QFileInfo(acousticModel + QStringLiteral("/mixture_weights")).isFile();
    if (fileMissing(acousticModel
                + (mixtureWeights ? QStringLiteral("/mixture_weights") : QStringLiteral("/sendump")),
            QStringLiteral("acoustic model file (mixture weights)"), &why)) {
        return false;
    }
    if (mixtureWeights ? !checkTableFile(
            acousticModel + QStringLiteral("/mixture_weights"), TableKind::MixtureWeights, &why)
                       : !checkSenoneDump(acousticModel + QStringLiteral("/sendump"), &why)) {
        return false;
    }
    if (!plausibleFeatureParameters(head(acousticModel + QStringLiteral("/feat.params"), 65536))) {
        why = QStringLiteral("the acoustic model's feat.params in %1 are not feature parameters")
                  .arg(acousticModel);
        return false;
    }
    const QString noise = acousticModel + QStringLiteral("/noisedict");
    if (QFileInfo::exists(noise) && !plausibleDictionary(head(noise, 512))) {
        why = QStringLiteral("the noise dictionary %1 is not a pronouncing dictionary").arg(noise);
        return false;
    }
    if (!checkTableFile(acousticModel + QStringLiteral("/means"), TableKind::Gaussians, &why)
        || !checkTableFile(acousticModel + QStringLiteral("/variances"), TableKind::Gaussians, &why)
        || !checkTableFile(
            acousticModel + QStringLiteral("/transition_matrices"), TableKind::TransitionMatrices, &why)) {
        return false;
    }
    const QByteArray mdef = head(acousticModel + QStringLiteral("/mdef"), 16);
    if (!mdef.startsWith("BMDF") && !mdef.startsWith("0.3")) {
        why = QStringLiteral("the acoustic model's mdef in %1 is not a model definition").arg(acousticModel);
        return false;
    }
    if (mdef.startsWith("BMDF")
        && !checkBinaryModelDefinition(acousticModel + QStringLiteral("/mdef"), &why)) {
        return false;
    }
    if (fileMissing(languageModel, QStringLiteral("language model"), &why)) {
        return false;
    }
    if (!plausibleLanguageModel(head(languageModel, 4096))) {
        why = QStringLiteral("the language model %1 is not one pocketsphinx reads").arg(languageModel);
        return false;
    }
    if (fileMissing(dictionary, QStringLiteral("dictionary"), &why)) {
        return false;
    }
    if (!plausibleDictionary(head(dictionary, 512))) {
        why = QStringLiteral("the dictionary %1 is not a pronouncing dictionary").arg(dictionary);
        return false;
    }
    return true;
}

} // namespace Cadenza::Engines
