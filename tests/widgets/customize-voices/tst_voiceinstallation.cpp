// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// From the voice pop-up to an installed voice, with the real daemon on the sample repository.
#include "QuillondProcess.h"
#include "TestEnvironment.h"
#include "TestHttpServer.h"

#include "core/files/Paths.h"
#include "core/formats/WaveFile.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/services/BundleSpeechSynthesisService.h"
#include "core/services/Services.h"
#include "core/voices/DownloadableVoice.h"
#include "protocol/InstallerProtocol.h"
#include "widgets/customize-voices/CZVoiceRowCheckboxButton.h"
#include "widgets/customize-voices/CustomizeVoicesWindowController.h"
#include "widgets/customize-voices/CustomizeVoicesWindowController_p.h"
#include "widgets/customize-voices/VoiceTableCellView.h"
#include "widgets/helpers/SizeVariants.h"
#include "widgets/installation/CZSpeechInstallationManagerSheets.h"
#include "widgets/voice-popup/CZVoicePopUpButton.h"
#include "widgets/voice-popup/CZVoicePopUpButton_p.h"

#include <QAbstractItemView>
#include <QBoxLayout>
#include <QComboBox>
#include <QDialog>
#include <QDir>
#include <QFileInfo>
#include <QLabel>
#include <QProcess>
#include <QProgressBar>
#include <QPushButton>
#include <QTableView>
#include <QTest>

#include <signal.h>

using namespace Cadenza;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString Femke = QStringLiteral("com.vendra.speech.synthesis.voice.femke.compact");
const QString TobiasCompact = QStringLiteral("com.vendra.speech.synthesis.voice.tobias.compact");
const QString TobiasPremium = QStringLiteral("com.vendra.speech.synthesis.voice.tobias.premium");
} // namespace

class VoiceInstallationTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_environment->installSampleVoices();
        // A slow server, so each download lasts long enough to be watched: the upgrade of Orin is a
        // flite voice of megabytes, Femke a few hundred bytes.
        m_http = std::make_unique<Testing::TestHttpServer>(QStringLiteral(CADENZA_SAMPLE_REPOSITORY));
        QVERIFY(m_http->listen());
        m_http->setSecondsPerTransfer(6);
        QVERIFY2(m_daemon.start({QStringLiteral("--repository"), m_http->baseUrl().toString()}),
            "quillond did not start");
    }
    void cleanupTestCase()
    {
        m_daemon.terminate();
        m_environment.reset();
    }

    void tickDownloadAndChooseTheNewVoice()
    {
        QWidget window;
        auto *popUp = new CZVoicePopUpButton(&window);
        auto *status = new QLabel(&window);
        auto *spinner = new QProgressBar(&window);
        popUp->setDownloadStatusTextField(status);
        popUp->setDownloadStatusProgressIndicator(spinner);
        auto *layout = new QVBoxLayout(&window);
        auto *statusRow = new QHBoxLayout;
        spinner->setMaximumWidth(60);
        statusRow->addWidget(spinner);
        statusRow->addWidget(status, 1);
        layout->addWidget(popUp);
        layout->addLayout(statusRow);
        layout->addStretch(1);
        window.resize(520, 110);
        window.show();
        popUp->buildPopUpButtonWithSelectVoiceIdentifier(QString());
        QCOMPARE(popUp->findText(QStringLiteral("Femke")), -1);

        // The customise item opens the sheet.
        popUp->setCurrentIndex(popUp->count() - 1);
        QVERIFY(!popUp->sendAction());
        CustomizeVoicesWindowController *sheet
            = CZSpeechInstallationManagerSheets::voiceSelectionWindowController();
        QVERIFY(sheet->window()->isVisible());
        int femkeRow = -1;
        const QList<VoiceTableRowPtr> rows = sheet->currentlyDisplayedVoiceRows();
        for (int row = 0; row < rows.size(); ++row) {
            if (rows.at(row)->voiceObject() && rows.at(row)->voiceObject()->identifier() == Femke) {
                femkeRow = row;
            }
        }
        QVERIFY(femkeRow >= 0);
        sheet->voiceSelectionTableView()->scrollTo(
            sheet->voiceSelectionTableView()->model()->index(femkeRow, 0));
        QTRY_VERIFY(sheet->existingViewForRow(femkeRow));
        sheet->existingViewForRow(femkeRow)->activeCheckbox()->click();
        sheet->window()->findChild<QPushButton *>(QStringLiteral("okButton"))->click();
        QVERIFY(!sheet->window()->isVisible());

        // The upgrade of Orin was ticked in advance and goes first; then Femke. While she downloads,
        // the pop-up's status line says so, with the time left.
        QTRY_VERIFY_WITH_TIMEOUT(status->text().startsWith(QStringLiteral("Downloading Femke")), 30000);
        QTRY_VERIFY_WITH_TIMEOUT(status->text().contains(QStringLiteral("remaining")), 10000);
        QVERIFY(spinner->isVisible());
        qInfo("status line: %s", qPrintable(status->text()));
        saveScreenshot(&window, "voice-popup-status.png");

        // Installed from the repository; the menu lists the new voice and it can be chosen.
        QTRY_VERIFY_WITH_TIMEOUT(popUp->findText(QStringLiteral("Femke")) >= 0, 30000);
        QVERIFY(
            QDir(Platform::Paths::userVoicesFolder() + QStringLiteral("/FemkeCompact.SpeechVoice")).exists());
        QTRY_VERIFY_WITH_TIMEOUT(status->text().isEmpty(), 5000);
        QVERIFY(!spinner->isVisible());
        popUp->setCurrentIndex(popUp->findText(QStringLiteral("Femke")));
        QVERIFY(popUp->sendAction());
        QCOMPARE(
            popUp->selectedVoiceAttributes()->value(QStringLiteral("VoiceIdentifier")).toString(), Femke);
        saveScreenshot(&window, "voice-popup-closed.png");
        popUp->showPopup();
        QTRY_VERIFY(popUp->view()->isVisible());
        saveScreenshot(popUp->view()->window(), "voice-popup-open.png");
        popUp->hidePopup();
    }

    void fullSizeDownloadEndsWithTheVoiceInTheMenus()
    {
        QWidget window;
        auto *popUp = new CZVoicePopUpButton(&window);
        auto *layout = new QVBoxLayout(&window);
        layout->addWidget(popUp);
        window.show();
        popUp->buildPopUpButtonWithSelectVoiceIdentifier(QString());
        QCOMPARE(popUp->findText(QStringLiteral("Tobias")), -1);

        // Tick Tobias, choose his full size, OK.
        CustomizeVoicesWindowController *sheet = openSheet(popUp);
        const int tobiasRow = rowOf(sheet, TobiasCompact);
        QVERIFY(tobiasRow >= 0);
        sheet->voiceSelectionTableView()->scrollTo(
            sheet->voiceSelectionTableView()->model()->index(tobiasRow, 0));
        QTRY_VERIFY(sheet->existingViewForRow(tobiasRow));
        VoiceTableCellView *view = sheet->existingViewForRow(tobiasRow);
        view->activeCheckbox()->click();
        QComboBox *sizes = view->downloadVariantPopUpButton();
        QVERIFY(sizes->isVisibleTo(view));
        const int fullSize = Platform::SizeVariants::isFullSize(sizes, 1) ? 1 : 0;
        QVERIFY(Platform::SizeVariants::isFullSize(sizes, fullSize));
        // Two real sizes: the compact espeak-ng voice is kilobytes, the full-size flite voice megabytes.
        QCOMPARE(sizes->count(), 2);
        QVERIFY2(sizes->itemText(0) != sizes->itemText(1), qPrintable(sizes->itemText(fullSize)));
        QVERIFY2(
            sizes->itemText(fullSize).contains(QStringLiteral("MB")), qPrintable(sizes->itemText(fullSize)));
        sizes->setCurrentIndex(fullSize);
        Q_EMIT sizes->activated(fullSize);
        sheet->window()->findChild<QPushButton *>(QStringLiteral("okButton"))->click();
        QVERIFY(!sheet->window()->isVisible());

        // While he downloads, the pop-up lists him as downloading, and the sheet keeps his row at
        // full size, ticked and greyed.
        QTRY_VERIFY_WITH_TIMEOUT(popUp->findText(QStringLiteral("Tobias (Downloading)")) >= 0, 30000);
        sheet = openSheet(popUp);
        const VoiceTableRowPtr downloading
            = sheet->currentlyDisplayedVoiceRows().value(rowOf(sheet, TobiasCompact));
        QVERIFY(downloading);
        const qint64 status = downloading->voiceObject()->downloadStatus();
        QVERIFY2(status == InstallerProtocol::DownloadingStatus || status == InstallerProtocol::WaitingStatus,
            qPrintable(QString::number(status)));
        QVERIFY(std::static_pointer_cast<DownloadableVoice>(downloading->voiceObject())->downloadFullSize());
        QVERIFY(downloading->isSelected());
        sheet->cancelVoiceSelection();

        // Installed at full size: Tobias Premium is in the menus, once, and nothing is offered again.
        QTRY_VERIFY_WITH_TIMEOUT(popUp->findText(QStringLiteral("Tobias")) >= 0, 60000);
        const QString installed
            = Platform::Paths::userVoicesFolder() + QStringLiteral("/TobiasPremium.SpeechVoice");
        QVERIFY(QFileInfo(installed + QStringLiteral("/Resources/cmu_us_awb.flitevox")).size() > 1024 * 1024);
        // The full size is the flite voice, and it speaks.
        Platform::BundleSpeechSynthesisService speech;
        const auto premium = speech.voice(TobiasPremium);
        QVERIFY(premium);
        QCOMPARE(premium->engineName, QStringLiteral("flite"));
        const QString wav = m_environment->path(QStringLiteral("tobias.wav"));
        QString error;
        QVERIFY2(
            speech.renderToFile({QStringLiteral("Hello, my name is Tobias."), TobiasPremium}, wav, &error),
            qPrintable(error));
        const auto audio = Platform::WaveFile::read(wav, &error);
        QVERIFY2(audio && audio->rootMeanSquare() > 300.0, qPrintable(error));
        const QList<VoiceTableRowPtr> menuRows = VoicePopUpPrivate::currentVoiceRows();
        QVERIFY(std::any_of(menuRows.cbegin(), menuRows.cend(), [](const VoiceTableRowPtr &row) {
            return row->voiceObject() && row->voiceObject()->identifier() == TobiasPremium;
        }));
        const auto downloadables = CZSpeechInstallationManager::sharedManager()->downloadableVoices();
        QVERIFY(
            std::none_of(downloadables.cbegin(), downloadables.cend(), [](const DownloadableVoicePtr &voice) {
                return voice->identifier().contains(QLatin1String(".tobias."));
            }));

        sheet = openSheet(popUp);
        int tobiasRows = 0;
        for (const VoiceTableRowPtr &row : sheet->currentlyDisplayedVoiceRows()) {
            if (row->voiceObject() && row->voiceObject()->identifier().contains(QLatin1String(".tobias."))) {
                ++tobiasRows;
                QCOMPARE(row->voiceObject()->identifier(), TobiasPremium);
                QVERIFY(row->isSelected());
                QCOMPARE(row->voiceObject()->downloadStatus(), qint64(InstallerProtocol::InstalledStatus));
            }
        }
        QCOMPARE(tobiasRows, 1);
        CustomizeVoicesWindowControllerPrivate::get(sheet)->_updateButtonStates();
        QVERIFY(sheet->window()
                    ->findChild<QLabel *>(QStringLiteral("selectedDownloadSizeTextField"))
                    ->text()
                    .isEmpty());
        sheet->cancelVoiceSelection();
    }

private:
    static CustomizeVoicesWindowController *openSheet(CZVoicePopUpButton *popUp)
    {
        popUp->setCurrentIndex(popUp->count() - 1);
        (void)popUp->sendAction();
        CustomizeVoicesWindowController *sheet
            = CZSpeechInstallationManagerSheets::voiceSelectionWindowController();
        if (!sheet->window()->isVisible()) {
            qFatal("the customise item did not open the sheet");
        }
        return sheet;
    }
    static int rowOf(CustomizeVoicesWindowController *sheet, const QString &identifier)
    {
        const QList<VoiceTableRowPtr> rows = sheet->currentlyDisplayedVoiceRows();
        for (int row = 0; row < rows.size(); ++row) {
            if (rows.at(row)->voiceObject() && rows.at(row)->voiceObject()->identifier() == identifier) {
                return row;
            }
        }
        return -1;
    }

    // With CADENZA_SCREENSHOTS set to a folder, the windows are saved there as the test sees them.
    static void saveScreenshot(QWidget *widget, const char *name)
    {
        const QString folder = qEnvironmentVariable("CADENZA_SCREENSHOTS");
        if (folder.isEmpty()) {
            return;
        }
        QDir().mkpath(folder);
        QVERIFY(widget->grab().save(QDir(folder).filePath(QLatin1String(name))));
    }

    std::unique_ptr<TestEnvironment> m_environment;
    std::unique_ptr<Testing::TestHttpServer> m_http;
    Testing::QuillondProcess m_daemon;
};

QTEST_MAIN(VoiceInstallationTest)
#include "tst_voiceinstallation.moc"
