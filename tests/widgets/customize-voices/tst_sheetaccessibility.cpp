// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// What a screen reader and a keyboard user meet in the customise voices sheet and in alerts: the rows
// as check boxes with names and states, headings, Tab leaving the table, arrows passing over headings,
// Escape as Cancel, focus and status changes reported.
#include "FakeInstallerDaemon.h"
#include "TestEnvironment.h"

#include "FakeMessagePortService.h"
#include "FakeUserLocaleService.h"
#include "InProcessNotificationCenter.h"
#include "MemoryPreferencesStore.h"
#include "core/SpeechNames.h"
#include "core/files/Paths.h"
#include "core/services/BundleSpeechSynthesisService.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "core/voices/CZVoiceObject.h"
#include "widgets/customize-voices/CZVoiceRowCheckboxButton.h"
#include "widgets/customize-voices/CustomizeVoicesWindowController.h"
#include "widgets/customize-voices/VoiceTableCellView.h"
#include "widgets/helpers/Alert.h"
#include "widgets/helpers/RowView.h"
#include "widgets/installation/CZSpeechInstallationManagerSheets.h"
#include "widgets/voice-popup/CZVoicePopUpButton_p.h"

#include <QAccessible>
#include <QComboBox>
#include <QDialog>
#include <QHeaderView>
#include <QLabel>
#include <QLineEdit>
#include <QMessageBox>
#include <QPushButton>
#include <QSignalSpy>
#include <QTableView>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString P = QStringLiteral("com.vendra.speech.synthesis.voice.");
const QString Domain = Cadenza::SpeechNames::VoicePreferencesDomain;

} // namespace

class SheetAccessibilityTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_ports = std::make_shared<FakeMessagePortService>();
        Services::setSpeechSynthesis(std::make_shared<BundleSpeechSynthesisService>());
        Services::setPreferences(std::make_shared<MemoryPreferencesStore>());
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>());
        Services::setMessagePorts(m_ports);
        Services::setNotifications(std::make_shared<InProcessNotificationCenter>());
        m_daemon = std::make_unique<Testing::FakeInstallerDaemon>(*m_ports);
        SpeechItemPrivate::setInstallationDictionary(QVariantMap {{QStringLiteral("DownloadableVoices"),
            QVariantMap {{P + QStringLiteral("iris.premium"),
                             TestEnvironment::downloadableVoiceEntry(QStringLiteral("Iris Premium"),
                                 QStringLiteral("en_US"), P + QStringLiteral("iris.full"))},
                {P + QStringLiteral("femke.premium"),
                    TestEnvironment::downloadableVoiceEntry(
                        QStringLiteral("Femke Premium"), QStringLiteral("nl_NL"))}}}});
        install(QStringLiteral("maren.compact"), QStringLiteral("Maren Compact"), QStringLiteral("en_US"));
        install(QStringLiteral("tobias.compact"), QStringLiteral("Tobias Compact"), QStringLiteral("en_US"));
        install(QStringLiteral("liesel.compact"), QStringLiteral("Liesel Compact"), QStringLiteral("de_DE"));
        Alert::setResponder([](const AlertRequest &) { return 1; });
        m_controller = std::make_unique<CustomizeVoicesWindowController>();
        m_client = std::make_unique<QWidget>();
        m_client->resize(700, 600);
        m_client->show();
    }
    void cleanup()
    {
        m_controller.reset();
        m_client.reset();
        Alert::setResponder({});
        VoicePopUpPrivate::resetProcessState();
        SpeechItemPrivate::setInstallationDictionary(std::nullopt);
        m_daemon.reset();
        Services::setSpeechSynthesis(nullptr);
        m_environment.reset();
    }

    void rowsAreNamedCheckBoxesAndHeadingsAreHeadings()
    {
        show();
        QTableView *table = m_controller->voiceSelectionTableView();
        QAccessibleInterface *list = QAccessible::queryAccessibleInterface(table);
        QVERIFY(list);
        QCOMPARE(list->role(), QAccessible::List);
        QCOMPARE(list->text(QAccessible::Name), QStringLiteral("Voices"));
        QCOMPARE(table->model()->headerData(0, Qt::Horizontal).toString(), QStringLiteral("Voices"));
        QCOMPARE(list->childCount(), m_controller->numberOfRowsInTableView());

        QAccessibleInterface *heading = list->child(0);
        QCOMPARE(heading->role(), QAccessible::Heading);
        QCOMPARE(heading->text(QAccessible::Name), QStringLiteral("English (United States)"));
        QVERIFY(!heading->state().selectable);
        QCOMPARE(heading->parent(), list);
        QCOMPARE(list->indexOfChild(heading), 0);

        // A row with a view reads as its view: a check box with the voice's name and language.
        VoiceTableCellView *maren = view(QStringLiteral("Maren"));
        QAccessibleInterface *row = QAccessible::queryAccessibleInterface(maren);
        QCOMPARE(list->child(rowIndex(QStringLiteral("Maren"))), row);
        QCOMPARE(row->role(), QAccessible::CheckBox);
        QCOMPARE(row->text(QAccessible::Name), QStringLiteral("Maren, English (United States)"));
        QVERIFY(row->state().checkable);
        QVERIFY(row->state().checked);
        QVERIFY(!row->state().disabled);
        QCOMPARE(row->parent(), list);
        QCOMPARE(list->indexOfChild(row), rowIndex(QStringLiteral("Maren")));
        // Its name is not read twice through the label, and an empty status says nothing.
        QCOMPARE(row->childCount(), 0);

        QAccessibleInterface *iris = QAccessible::queryAccessibleInterface(view(QStringLiteral("Iris")));
        QVERIFY(!iris->state().checked);
        QVERIFY(iris->actionInterface()->actionNames().contains(QAccessibleActionInterface::toggleAction()));
        iris->actionInterface()->doAction(QAccessibleActionInterface::toggleAction());
        QVERIFY(iris->state().checked);
        QVERIFY(view(QStringLiteral("Iris"))->activeCheckbox()->isChecked());
        // Ticked, the row shows its status and its size choice, both named children.
        QCOMPARE(iris->text(QAccessible::Description), QStringLiteral("Required"));
        QCOMPARE(iris->childCount(), 2);
        QCOMPARE(iris->child(0)->text(QAccessible::Name), QStringLiteral("Required"));
        QCOMPARE(iris->child(1)->role(), QAccessible::ComboBox);
        // On Linux a pop-up reads its choice as its name; what it chooses is its description.
        QVERIFY(iris->child(1)->text(QAccessible::Name).startsWith(QStringLiteral("Compact")));
        QCOMPARE(iris->child(1)->text(QAccessible::Description), QStringLiteral("Download size for Iris"));
        QCOMPARE(iris->child(1)->parent(), iris);
        // The selected row is painted with the highlight.
        QVERIFY(iris->state().selected);
        QCOMPARE(view(QStringLiteral("Iris"))->palette().color(QPalette::Window),
            table->palette().color(QPalette::Highlight));
        QVERIFY(view(QStringLiteral("Maren"))->palette().color(QPalette::Window)
            != table->palette().color(QPalette::Highlight));
    }

    void rowsOffScreenReadFromTheModel()
    {
        // Many voices: the last ones have no view until scrolled to.
        for (int i = 0; i < 40; ++i) {
            install(QStringLiteral("extra%1.compact").arg(i),
                QStringLiteral("Zora%1 Compact").arg(i, 2, 10, QLatin1Char('0')), QStringLiteral("en_US"));
        }
        show();
        QAccessibleInterface *list
            = QAccessible::queryAccessibleInterface(m_controller->voiceSelectionTableView());
        const int last = m_controller->numberOfRowsInTableView() - 1;
        QVERIFY(!m_controller->existingViewForRow(last));
        QAccessibleInterface *row = list->child(last);
        QCOMPARE(row->role(), QAccessible::CheckBox);
        QVERIFY(row->text(QAccessible::Name).endsWith(QStringLiteral(", German (Germany)")));
        QVERIFY(row->state().checkable);
        QVERIFY(row->state().offscreen);
        QCOMPARE(list->indexOfChild(row), last);
        QCOMPARE(list->child(last), row); // one stand-in per row
    }

    void tabLeavesTheTableThroughTheRowControls()
    {
        show();
        QTableView *table = m_controller->voiceSelectionTableView();
        QLineEdit *search = m_controller->window()->findChild<QLineEdit *>(QStringLiteral("searchField"));
        QTRY_COMPARE(QApplication::focusWidget(), search);
        QTest::keyClick(search, Qt::Key_Tab);
        QCOMPARE(QApplication::focusWidget(), table);
        // The first item row becomes current, never a heading.
        QCOMPARE(table->currentIndex().row(), rowIndex(QStringLiteral("Iris")));
        QTest::keyClick(table, Qt::Key_Space);
        QVERIFY(row(QStringLiteral("Iris"))->isSelected());
        // Tab: the current row's size pop-up, then on past the table, never through other rows.
        QComboBox *sizes = view(QStringLiteral("Iris"))->downloadVariantPopUpButton();
        QTest::keyClick(table, Qt::Key_Tab);
        QCOMPARE(QApplication::focusWidget(), sizes);
        QTest::keyClick(sizes, Qt::Key_Tab);
        QWidget *after = QApplication::focusWidget();
        QVERIFY(qobject_cast<QPushButton *>(after));
        QVERIFY(!table->isAncestorOf(after));
        // Shift+Tab from the size pop-up goes back to the table.
        sizes->setFocus();
        QTest::keyClick(sizes, Qt::Key_Backtab, Qt::ShiftModifier);
        QCOMPARE(QApplication::focusWidget(), table);
        // No control inside a row is a tab stop of its own.
        for (QWidget *inside : table->viewport()->findChildren<QWidget *>()) {
            QVERIFY2(!(inside->focusPolicy() & Qt::TabFocus),
                qPrintable(inside->objectName() + QLatin1Char(' ')
                    + QLatin1String(inside->metaObject()->className())));
        }
    }

    void arrowsPassOverHeadingsAndReportTheFocus()
    {
        show();
        QTableView *table = m_controller->voiceSelectionTableView();
        table->setFocus();
        QTRY_VERIFY(table->hasFocus());
        table->setCurrentIndex(table->model()->index(rowIndex(QStringLiteral("Tobias")), 0));
        QTest::keyClick(table, Qt::Key_Down);
        QCOMPARE(table->currentIndex().row(), rowIndex(QStringLiteral("Femke")));
        // The focus is on Femke's check box, for the table and for the row itself (the focus event the
        // bridge gets is checked over AT-SPI, where a bridge runs).
        QAccessibleInterface *list = QAccessible::queryAccessibleInterface(table);
        QAccessibleInterface *femke = list->focusChild();
        QVERIFY(femke);
        QCOMPARE(femke->text(QAccessible::Name), QStringLiteral("Femke, Dutch (Netherlands)"));
        QCOMPARE(femke->role(), QAccessible::CheckBox);
        QVERIFY(femke->state().focused);
        QVERIFY(!QAccessible::queryAccessibleInterface(view(QStringLiteral("Tobias")))->state().focused);
        QTest::keyClick(table, Qt::Key_Up);
        QCOMPARE(table->currentIndex().row(), rowIndex(QStringLiteral("Tobias")));
        // Above the first voice there is only a heading: the cursor stays.
        table->setCurrentIndex(table->model()->index(rowIndex(QStringLiteral("Iris")), 0));
        QTest::keyClick(table, Qt::Key_Up);
        QCOMPARE(table->currentIndex().row(), rowIndex(QStringLiteral("Iris")));
        QTest::keyClick(table, Qt::Key_Home);
        QCOMPARE(table->currentIndex().row(), rowIndex(QStringLiteral("Iris")));
        QTest::keyClick(table, Qt::Key_End);
        QCOMPARE(table->currentIndex().row(), rowIndex(QStringLiteral("Liesel")));
    }

    void statusChangesAndEmptySearchesAreDescribed()
    {
        show();
        VoiceTableCellView *iris = view(QStringLiteral("Iris"));
        QAccessibleInterface *row = QAccessible::queryAccessibleInterface(iris);
        RowView::setStatusText(iris->downloadMessageTextField(), QStringLiteral("Downloading 40 %"));
        QCOMPARE(iris->downloadMessageTextField()->text(), QStringLiteral("Downloading 40 %"));
        QCOMPARE(row->text(QAccessible::Description), QStringLiteral("Downloading 40 %"));
        QCOMPARE(row->child(0)->text(QAccessible::Name), QStringLiteral("Downloading 40 %"));
        QLineEdit *search = m_controller->window()->findChild<QLineEdit *>(QStringLiteral("searchField"));
        search->setText(QStringLiteral("zzz"));
        QCOMPARE(search->accessibleDescription(), QStringLiteral("No Results"));
        search->clear();
        QVERIFY(search->accessibleDescription().isEmpty());
    }

    void escapeCancelsFromInsideARow()
    {
        show();
        VoiceTableCellView *iris = view(QStringLiteral("Iris"));
        iris->activeCheckbox()->click();
        QComboBox *sizes = iris->downloadVariantPopUpButton();
        sizes->setFocus();
        QSignalSpy ended(m_controller.get(), &CustomizeVoicesWindowController::sheetEnded);
        QTest::keyClick(sizes, Qt::Key_Escape);
        QCOMPARE(ended.size(), 1);
        QVERIFY(!ended.first().first().toBool());
        QVERIFY(!m_controller->window()->isVisible());
    }

    void alertsAnswerEscapeWithCancel_data()
    {
        QTest::addColumn<QStringList>("buttons");
        QTest::addColumn<int>("escapeAnswer");
        QTest::newRow("one") << QStringList {QStringLiteral("OK")} << 0;
        QTest::newRow("two") << QStringList {QStringLiteral("Use Voice"), QStringLiteral("Cancel")} << 1;
        QTest::newRow("three") << QStringList {QStringLiteral("Delete"), QStringLiteral("Cancel"),
            QStringLiteral("Keep")}
                               << 1;
    }
    void alertsAnswerEscapeWithCancel()
    {
        QFETCH(QStringList, buttons);
        QFETCH(int, escapeAnswer);
        Alert::setResponder({}); // shown for real
        AlertRequest request;
        request.title = QStringLiteral("Delete the voices?");
        request.message = QStringLiteral("They can be downloaded again.");
        request.buttons = buttons;
        int answer = -2;
        Alert::beginSheet(request, m_client.get(), [&answer](int given) { answer = given; });
        QMessageBox *box = m_client->findChild<QMessageBox *>(QStringLiteral("alert"));
        QVERIFY(box);
        QVERIFY(QTest::qWaitForWindowExposed(box));
        QAccessibleInterface *alert = QAccessible::queryAccessibleInterface(box);
        QCOMPARE(alert->role(), QAccessible::AlertMessage);
        QCOMPARE(alert->text(QAccessible::Name), request.title);
        auto *first = qobject_cast<QPushButton *>(box->buttons().isEmpty() ? nullptr : box->defaultButton());
        QVERIFY(first);
        QCOMPARE(first->text(), buttons.first());
        QVERIFY(QAccessible::queryAccessibleInterface(first)->state().defaultButton);
        QTest::keyClick(box, Qt::Key_Escape);
        QTRY_COMPARE(answer, escapeAnswer);
    }

private:
    void install(const QString &suffix, const QString &name, const QString &locale)
    {
        QVariantMap attributes = TestEnvironment::voiceAttributes(P + suffix, name, locale);
        (void)TestEnvironment::writeVoiceBundle(
            Paths::systemVoicesFolder(), QString(name).remove(u' '), attributes);
    }
    void show()
    {
        m_controller->showSheetForWindow(m_client.get(), false);
        QVERIFY(QTest::qWaitForWindowExposed(m_controller->window()));
        QTRY_VERIFY(m_controller->existingViewForRow(1));
    }
    QStringList titles() const
    {
        QStringList out;
        for (const VoiceTableRowPtr &entry : m_controller->currentlyDisplayedVoiceRows()) {
            out.append(entry->isGroupRow() ? QStringLiteral("# ") + entry->title()
                                           : entry->voiceObject()->displayNameRoot());
        }
        return out;
    }
    int rowIndex(const QString &name) const { return int(titles().indexOf(name)); }
    VoiceTableRowPtr row(const QString &name) const
    {
        return m_controller->currentlyDisplayedVoiceRows().at(rowIndex(name));
    }
    VoiceTableCellView *view(const QString &name) const
    {
        (void)QTest::qWaitFor(
            [&] { return m_controller->existingViewForRow(rowIndex(name)) != nullptr; }, 2000);
        VoiceTableCellView *found = m_controller->existingViewForRow(rowIndex(name));
        if (!found) {
            qFatal("no row view for %s", qPrintable(name));
        }
        return found;
    }

    std::unique_ptr<TestEnvironment> m_environment;
    std::shared_ptr<FakeMessagePortService> m_ports;
    std::unique_ptr<Testing::FakeInstallerDaemon> m_daemon;
    std::unique_ptr<CustomizeVoicesWindowController> m_controller;
    std::unique_ptr<QWidget> m_client;
};

QTEST_MAIN(SheetAccessibilityTest)
#include "tst_sheetaccessibility.moc"
