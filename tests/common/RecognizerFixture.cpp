// SPDX-License-Identifier: LGPL-2.1-or-later
#include "RecognizerFixture.h"

#include "core/formats/PropertyList.h"

#include <QDir>
#include <QFile>

namespace Cadenza::Testing {

namespace {

void writeFile(const QString &path, const QByteArray &content)
{
    QDir().mkpath(path.left(path.lastIndexOf(QLatin1Char('/'))));
    QFile file(path);
    if (file.open(QIODevice::WriteOnly)) {
        file.write(content);
    }
}

QVariantMap modelInfo(const QString &locale)
{
    return {{QStringLiteral("BundleIdentifier"),
                QString(QStringLiteral("com.vendra.speech.recognition.") + locale)},
        {QStringLiteral("BundleVersion"), QStringLiteral("1.0")},
        {QStringLiteral("LocaleIdentifier"), locale},
        {QStringLiteral("RecognitionEngine"), QStringLiteral("pocketsphinx")},
        {QStringLiteral("RecognitionModel"),
            QVariantMap {{QStringLiteral("AcousticModel"), QStringLiteral("Resources/acoustic")},
                {QStringLiteral("LanguageModel"), QStringLiteral("Resources/language.lm.bin")},
                {QStringLiteral("Dictionary"), QStringLiteral("Resources/pronunciation.dict")}}}};
}

} // namespace

QString RecognizerFixture::debianModelFolder()
{
    return QStringLiteral(CADENZA_POCKETSPHINX_MODEL_DIR);
}

QString RecognizerFixture::writeBareBundle(
    const QString &folder, const QString &name, const QVariantMap &info)
{
    const QString bundle = folder + QLatin1Char('/') + name;
    writeFile(bundle + QStringLiteral("/Info.plist"), Platform::PropertyList::serialize(info));
    return bundle;
}

QString RecognizerFixture::writeModelBundle(const QString &folder, const QString &locale)
{
    const QString bundle
        = writeBareBundle(folder, locale + QStringLiteral(".SpeechRecognition"), modelInfo(locale));
    const QString model = debianModelFolder();
    QDir().mkpath(bundle + QStringLiteral("/Resources"));
    QFile::link(model + QStringLiteral("/en-us"), bundle + QStringLiteral("/Resources/acoustic"));
    QFile::link(
        model + QStringLiteral("/en-us.lm.bin"), bundle + QStringLiteral("/Resources/language.lm.bin"));
    QFile::link(model + QStringLiteral("/cmudict-en-us.dict"),
        bundle + QStringLiteral("/Resources/pronunciation.dict"));
    return bundle;
}

QString RecognizerFixture::writeTinyBundle(
    const QString &folder, const QString &locale, const QString &bundleName)
{
    const QString bundle = writeBareBundle(folder,
        bundleName.isEmpty() ? locale + QStringLiteral(".SpeechRecognition") : bundleName, modelInfo(locale));
    const QString resources = bundle + QStringLiteral("/Resources/");
    writeFile(resources + QStringLiteral("acoustic/mdef"), "0.3\n0 n_base\n");
    for (const char *part : {"means", "variances", "transition_matrices", "feat.params"}) {
        writeFile(resources + QStringLiteral("acoustic/") + QLatin1String(part), "s3\n");
    }
    writeFile(resources + QStringLiteral("language.lm.bin"), "\\data\\\nngram 1=0\n\\end\\\n");
    writeFile(resources + QStringLiteral("pronunciation.dict"), "hallo HH AA L OW\n");
    return bundle;
}

} // namespace Cadenza::Testing
