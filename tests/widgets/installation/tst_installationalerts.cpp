// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// The customise voices sheet's OK when no installer daemon can be reached: the user is told.
#include "TestEnvironment.h"

#include "core/installation/CZSpeechInstallationManager.h"
#include "core/installation/CZSpeechInstallationManager_p.h"
#include "core/voices/CZVoiceObject.h"
#include "core/voices/DownloadableVoice.h"
#include "widgets/customize-voices/CZVoiceRowCheckboxButton.h"
#include "widgets/customize-voices/CustomizeVoicesWindowController.h"
#include "widgets/customize-voices/VoiceTableCellView.h"
#include "widgets/helpers/Alert.h"
#include "widgets/installation/CZSpeechInstallationManagerSheets.h"

#include <QAbstractItemView>
#include <QDialog>
#include <QPushButton>
#include <QTableView>
#include <QTest>

using namespace Cadenza;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString Femke = QStringLiteral("com.vendra.speech.synthesis.voice.femke.compact");
} // namespace

class InstallationAlertsTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_environment->installSampleVoices();
        Platform::Alert::setResponder([](const Platform::AlertRequest &) { return 0; });
    }
    void cleanup()
    {
        Platform::Alert::setResponder({});
        m_environment.reset();
    }

    void okWithoutADaemonSaysSo()
    {
        QWidget window;
        window.resize(400, 200);
        window.show();
        CZSpeechInstallationManagerSheets::showVoiceSelectionSheetForWindow(&window, false);
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
        const int before = int(Platform::Alert::answeredRequests().size());
        sheet->window()->findChild<QPushButton *>(QStringLiteral("okButton"))->click();
        QVERIFY(!sheet->window()->isVisible());

        // One alert for the whole OK, naming what could not be fetched; no request is left waiting.
        QTRY_VERIFY(Platform::Alert::answeredRequests().size() > before);
        const QList<Platform::AlertRequest> alerts = Platform::Alert::answeredRequests().mid(before);
        int unreachable = 0;
        for (const Platform::AlertRequest &alert : alerts) {
            if (alert.title == u"The download could not be started.") {
                ++unreachable;
                QVERIFY2(alert.message.contains(QStringLiteral("Femke")), qPrintable(alert.message));
                QVERIFY(alert.message.contains(QStringLiteral("quillond is not running")));
            }
        }
        QCOMPARE(unreachable, 1);
        QVERIFY(CZSpeechInstallationManagerPrivate::get(CZSpeechInstallationManager::sharedManager())
                    ->pendingLocalPortNames()
                    .isEmpty());
    }

    void aBackgroundFetchDoesNotAlert()
    {
        (void)CZSpeechInstallationManagerSheets::voiceSelectionWindowController(); // the alerts are wired
        auto *manager = CZSpeechInstallationManager::sharedManager();
        const QList<DownloadableVoicePtr> voices = manager->downloadableVoices();
        QVERIFY(!voices.isEmpty());
        const int before = int(Platform::Alert::answeredRequests().size());
        QVERIFY(!manager->startInstallingDownloadableVoices({voices.first()}, true, 1)); // the policy's mode
        QTest::qWait(100);
        QCOMPARE(Platform::Alert::answeredRequests().size(), before);
        QVERIFY(!manager->startInstallingDownloadableVoices({voices.first()}, true, 0)); // the user's
        QTRY_COMPARE(Platform::Alert::answeredRequests().size(), before + 1);
    }

private:
    std::unique_ptr<TestEnvironment> m_environment;
};

QTEST_MAIN(InstallationAlertsTest)
#include "tst_installationalerts.moc"
