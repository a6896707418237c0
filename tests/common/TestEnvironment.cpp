// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/locale/LocaleDisplayName_p.h"
#include "core/locale/LocalizationTable.h"
#include "core/services/Services.h"

#include <QCryptographicHash>
#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QTest>

namespace Cadenza::Testing {

namespace {
const QByteArray Variables[]
    = {"CADENZA_ROOT", "XDG_CONFIG_HOME", "XDG_DATA_HOME", "XDG_RUNTIME_DIR", "XDG_CACHE_HOME"};

void resetServices()
{
    Platform::Services::setPreferences(nullptr);
    Platform::Services::setSpeechSynthesis(nullptr);
    Platform::Services::setUserLocale(nullptr);
    Platform::LocalizationTable::resetShared();
    LocaleDisplayNamePrivate::resetQualifiedTemplate();
}
} // namespace

TestEnvironment::TestEnvironment()
{
    QVERIFY2(m_dir.isValid(), "cannot make a temporary folder");
    for (const QByteArray &name : Variables) {
        m_saved.insert(name, qgetenv(name.constData()));
    }
    const QString base = m_dir.path();
    qputenv("CADENZA_ROOT", QFile::encodeName(base + QStringLiteral("/root")));
    qputenv("XDG_CONFIG_HOME", QFile::encodeName(base + QStringLiteral("/config")));
    qputenv("XDG_DATA_HOME", QFile::encodeName(base + QStringLiteral("/data")));
    qputenv("XDG_RUNTIME_DIR", QFile::encodeName(base + QStringLiteral("/runtime")));
    qputenv("XDG_CACHE_HOME", QFile::encodeName(base + QStringLiteral("/cache")));
    QDir().mkpath(base + QStringLiteral("/runtime"));
    QFile::setPermissions(
        base + QStringLiteral("/runtime"), QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
    resetServices();
}

TestEnvironment::~TestEnvironment()
{
    resetServices();
    for (auto it = m_saved.cbegin(); it != m_saved.cend(); ++it) {
        if (it.value().isEmpty()) {
            qunsetenv(it.key().constData());
        } else {
            qputenv(it.key().constData(), it.value());
        }
    }
}

QVariantMap TestEnvironment::voiceAttributes(
    const QString &identifier, const QString &name, const QString &locale, const QString &gender)
{
    return {{QStringLiteral("VoiceIdentifier"), identifier}, {QStringLiteral("VoiceName"), name},
        {QStringLiteral("VoiceLocaleIdentifier"), locale}, {QStringLiteral("VoiceGender"), gender}};
}

QString TestEnvironment::writeVoiceBundle(
    const QString &folder, const QString &name, const QVariantMap &attributes, const QString &engineVoice)
{
    const QString bundle = folder + QLatin1Char('/') + name + QStringLiteral(".SpeechVoice");
    QDir().mkpath(bundle + QStringLiteral("/Resources"));
    const QVariantMap info {
        {QStringLiteral("BundleIdentifier"), attributes.value(QStringLiteral("VoiceIdentifier"))},
        {QStringLiteral("BundleVersion"), QStringLiteral("1.0")},
        {QStringLiteral("Engine"), QVariantMap {{QStringLiteral("Voice"), engineVoice}}},
        {QStringLiteral("VoiceAttributes"), attributes}};
    QFile file(bundle + QStringLiteral("/Info.plist"));
    if (!file.open(QIODevice::WriteOnly) || file.write(Platform::PropertyList::serialize(info)) < 0) {
        qFatal("cannot write %s", qPrintable(file.fileName()));
    }
    return bundle;
}

QString TestEnvironment::writeFliteVoiceBundle(
    const QString &folder, const QString &name, const QVariantMap &attributes, const QString &fliteVoice)
{
    const QString bundle = folder + QLatin1Char('/') + name + QStringLiteral(".SpeechVoice");
    const QString fileName = QStringLiteral("cmu_us_%1.flitevox").arg(fliteVoice);
    QDir().mkpath(bundle + QStringLiteral("/Resources"));
    QFile source(QStringLiteral(CADENZA_FLITE_VOICES_DIR "/") + fileName);
    if (!source.open(QIODevice::ReadOnly)) {
        qFatal("cannot read %s", qPrintable(source.fileName()));
    }
    const QByteArray data = source.readAll();
    QFile copy(bundle + QStringLiteral("/Resources/") + fileName);
    if (!copy.open(QIODevice::WriteOnly) || copy.write(data) != data.size()) {
        qFatal("cannot write %s", qPrintable(copy.fileName()));
    }
    const QVariantMap info {
        {QStringLiteral("BundleIdentifier"), attributes.value(QStringLiteral("VoiceIdentifier"))},
        {QStringLiteral("BundleVersion"), QStringLiteral("1.0")},
        {QStringLiteral("Engine"),
            QVariantMap {{QStringLiteral("Name"), QStringLiteral("flite")},
                {QStringLiteral("Voice"), fileName}, {QStringLiteral("VoiceFileSize"), qint64(data.size())},
                {QStringLiteral("VoiceFileSHA256"),
                    QString::fromLatin1(
                        QCryptographicHash::hash(data, QCryptographicHash::Sha256).toHex())}}},
        {QStringLiteral("VoiceAttributes"), attributes}};
    QFile file(bundle + QStringLiteral("/Info.plist"));
    if (!file.open(QIODevice::WriteOnly) || file.write(Platform::PropertyList::serialize(info)) < 0) {
        qFatal("cannot write %s", qPrintable(file.fileName()));
    }
    return bundle;
}

void TestEnvironment::installSampleVoices() const
{
    const QString source = QStringLiteral(CADENZA_SAMPLE_VOICES); // completed at build time
    const QString target = Platform::Paths::systemVoicesFolder();
    QDirIterator it(source, QDir::Files, QDirIterator::Subdirectories);
    while (it.hasNext()) {
        const QString file = it.next();
        const QString destination = target + file.mid(source.size());
        QDir().mkpath(QFileInfo(destination).absolutePath());
        QFile::copy(file, destination);
    }
}

QVariantMap TestEnvironment::downloadableVoiceEntry(
    const QString &name, const QString &locale, const QString &fullSizeIdentifier)
{
    return {{QStringLiteral("VoiceAttributes"),
                QVariantMap {{QStringLiteral("VoiceName"), name},
                    {QStringLiteral("VoiceLocaleIdentifier"), locale},
                    {QStringLiteral("VoiceGender"), QStringLiteral("VoiceGenderFemale")}}},
        {QStringLiteral("VoiceByteSize"), qint64(2'000'000)},
        {QStringLiteral("VoiceVersion"), QStringLiteral("1.0")},
        {QStringLiteral("VoiceTag"), QString(QStringLiteral("VOICEID:") + name)},
        {QStringLiteral("FullSizeByteSize"), qint64(9'000'000)},
        {QStringLiteral("FullSizeTagName"), QString(QStringLiteral("VOICEID:full.") + name)},
        {QStringLiteral("FullSizeBundleIdentifier"), fullSizeIdentifier},
        {QStringLiteral("FullSizeVersion"), QStringLiteral("1.0")}};
}

} // namespace Cadenza::Testing
