// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// A dictation language from the pop-up's sheet to the menu, with the real daemon, the session bus and a
// second process that plays the dictation engine.
#include "QuillondProcess.h"
#include "RecognizerFixture.h"
#include "TestEnvironment.h"

#include "core/files/Paths.h"
#include "core/formats/PropertyList.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "protocol/InstallerProtocol.h"
#include "widgets/installation/CZSpeechInstallationManagerSheets.h"
#include "widgets/recognition-languages/CZCustomizeSRLanguagesWindowController.h"
#include "widgets/recognition-languages/CZSRLanguagePopUpButton.h"
#include "widgets/recognition-languages/CZSRLanguagePopUpButton_p.h"

#include <QCryptographicHash>
#include <QDialog>
#include <QDir>
#include <QElapsedTimer>
#include <QLabel>
#include <QProcess>
#include <QProgressBar>
#include <QPushButton>
#include <QRandomGenerator>
#include <QTest>

using namespace Cadenza;
using Cadenza::Testing::TestEnvironment;

namespace {
constexpr qsizetype ModelBytes = 24 * 1024 * 1024; // big enough that unpacking can be watched
} // namespace

class RecognitionInstallationTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_environment->installSampleVoices();
        // A US English recognizer with a large model, packed into a repository of its own.
        const QString repository = m_environment->path(QStringLiteral("repository"));
        // The test's own fixture: plausible pocketsphinx model files, so the language is listed once
        // installed, plus a large file that makes the download take a while.
        const QString bundle
            = Testing::RecognizerFixture::writeTinyBundle(repository, QStringLiteral("en_US"));
        QFile model(bundle + QStringLiteral("/Resources/model.bin"));
        QVERIFY(model.open(QIODevice::WriteOnly));
        QByteArray noise(ModelBytes, Qt::Uninitialized);
        QRandomGenerator(7).fillRange(reinterpret_cast<quint32 *>(noise.data()), noise.size() / 4);
        model.write(noise);
        model.close();
        QProcess tar;
        tar.setWorkingDirectory(repository);
        tar.start(QStringLiteral("tar"),
            {QStringLiteral("czf"), QStringLiteral("en_US.tar.gz"),
                QStringLiteral("en_US.SpeechRecognition")});
        QVERIFY(tar.waitForFinished(60000) && tar.exitCode() == 0);
        QFile archive(repository + QStringLiteral("/en_US.tar.gz"));
        QVERIFY(archive.open(QIODevice::ReadOnly));
        QCryptographicHash hash(QCryptographicHash::Sha256);
        hash.addData(&archive);
        const QVariantMap package {{QStringLiteral("Path"), QStringLiteral("en_US.tar.gz")},
            {QStringLiteral("SHA256"), QString::fromLatin1(hash.result().toHex())},
            {QStringLiteral("ByteSize"), qint64(archive.size())},
            {QStringLiteral("Kind"), QStringLiteral("recognizer")},
            {QStringLiteral("BundleName"), QStringLiteral("en_US.SpeechRecognition")},
            {QStringLiteral("BundleIdentifier"), QStringLiteral("com.vendra.speech.recognition.en_US")},
            {QStringLiteral("ObjectID"), QStringLiteral("en_US")},
            {QStringLiteral("Version"), QStringLiteral("1.0")}};
        const QString catalogue = m_environment->path(QStringLiteral("catalogue.plist"));
        QFile file(catalogue);
        QVERIFY(file.open(QIODevice::WriteOnly));
        file.write(Platform::PropertyList::serialize(QVariantMap {
            {QStringLiteral("Packages"), QVariantMap {{QStringLiteral("SRCLANGID:en_US"), package}}}}));
        file.close();

        QVERIFY2(m_daemon.start({QStringLiteral("--catalogue"), catalogue, QStringLiteral("--repository"),
                     QUrl::fromLocalFile(repository).toString()}),
            "quillond did not start");
    }
    void cleanupTestCase()
    {
        m_daemon.terminate();
        m_environment.reset();
    }

    void downloadWaitForPreHeatAndList()
    {
        QWidget window;
        auto *popUp = new CZSRLanguagePopUpButton(&window);
        auto *status = new QLabel(&window);
        auto *spinner = new QProgressBar(&window);
        popUp->setDownloadStatusTextField(status);
        popUp->setDownloadStatusProgressIndicator(spinner);
        popUp->setLanguagesAreDownloadable(true);
        window.resize(500, 300);
        window.show();
        const QStringList network {QStringLiteral("en_US"), QStringLiteral("de_DE")};
        popUp->buildPopUpButtonAndSelectLocaleIdentifier(QStringLiteral("en_US"), network, std::nullopt);
        popUp->setEnabled(true);
        QCOMPARE(popUp->currentText(), QStringLiteral("English (United States)"));

        // The command item opens the sheet; US English, the pop-up's language, is ticked for download.
        popUp->setCurrentIndex(popUp->count() - 1);
        QVERIFY(!popUp->sendAction());
        CZCustomizeSRLanguagesWindowController *sheet
            = CZSpeechInstallationManagerSheets::srLanguagesSelectionWindowController();
        QVERIFY(sheet->window()->isVisible());
        QPushButton *ok = sheet->window()->findChild<QPushButton *>(QStringLiteral("okButton"));
        QVERIFY(ok->isEnabled());
        ok->click();
        QVERIFY(!sheet->window()->isVisible());

        // Watch the status line closely while the daemon works.
        const QString bundle
            = Platform::Paths::userRecognizersFolder() + QStringLiteral("/en_US.SpeechRecognition");
        QStringList seen;
        QElapsedTimer clock;
        clock.start();
        while (clock.elapsed() < 60000
            && !(QDir(bundle).exists()
                && CZSRLanguagePopUpButtonPrivate::get(popUp)->_isWaitingForPreHeat())) {
            CZSRLanguagePopUpButtonPrivate::get(popUp)->_updateDownloadStatusFields();
            if (!status->text().isEmpty() && (seen.isEmpty() || seen.constLast() != status->text())) {
                seen.append(status->text());
            }
            QTest::qWait(5);
        }
        qInfo("status lines: %s", qPrintable(seen.join(QStringLiteral(" | ")).replace(u'\n', u'/')));
        QVERIFY(QDir(bundle).exists());
        QVERIFY(std::any_of(
            seen.cbegin(), seen.cend(), [](const QString &line) { return line.startsWith(u"Installing"); }));

        // The installer is done, but the line stays until the dictation engine has loaded the language.
        QTRY_VERIFY_WITH_TIMEOUT(
            CZSpeechInstallationManager::sharedManager()->activeInstallations().isEmpty(), 10000);
        QTest::qWait(1500);
        QVERIFY(status->text().startsWith(QStringLiteral("Installing Enhanced Dictation")));
        QVERIFY(spinner->isVisible());
        QProcess engine;
        engine.start(QStringLiteral(CADENZA_CLI_PATH),
            {QStringLiteral("notify"), QStringLiteral("DictationIMNotificationRecognizerDidPreHeat")});
        QVERIFY(engine.waitForFinished(10000));
        QCOMPARE(engine.exitCode(), 0);
        QTRY_VERIFY_WITH_TIMEOUT(status->text().isEmpty(), 5000);
        QVERIFY(!spinner->isVisible());

        // Listed, no longer as downloading, and still chosen.
        QCOMPARE(popUp->currentText(), QStringLiteral("English (United States)"));
        QCOMPARE(popUp->selectedLanguageItem()->localeIdentifier(), QStringLiteral("en_US"));
        QVERIFY(popUp->model()->flags(popUp->model()->index(popUp->currentIndex(), 0)) & Qt::ItemIsEnabled);
    }

private:
    std::unique_ptr<TestEnvironment> m_environment;
    Testing::QuillondProcess m_daemon;
};

QTEST_MAIN(RecognitionInstallationTest)
#include "tst_recognitioninstallation.moc"
