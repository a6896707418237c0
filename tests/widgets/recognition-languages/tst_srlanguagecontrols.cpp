// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeInstallerDaemon.h"
#include "FakeRecognitionService.h"
#include "TestEnvironment.h"

#include "FakeMessagePortService.h"
#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "InProcessNotificationCenter.h"
#include "MemoryPreferencesStore.h"
#include "core/files/Paths.h"
#include "core/services/RecognitionService.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "protocol/InstallerProtocol.h"
#include "widgets/helpers/Alert.h"
#include "widgets/installation/CZSpeechInstallationManagerSheets.h"
#include "widgets/recognition-languages/CZCustomizeSRLanguagesWindowController.h"
#include "widgets/recognition-languages/CZSRLanguagePopUpButton.h"
#include "widgets/recognition-languages/CZSRLanguagePopUpButton_p.h"
#include "widgets/recognition-languages/CZSRLanguageRowCheckboxButton.h"
#include "widgets/recognition-languages/CZSRLanguageRowTextView.h"
#include "widgets/recognition-languages/CZSRLanguageTableCellView.h"

#include <QAbstractItemModelTester>
#include <QDialog>
#include <QDir>
#include <QLabel>
#include <QLineEdit>
#include <QProgressBar>
#include <QPushButton>
#include <QSignalSpy>
#include <QTableView>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;
namespace Protocol = Cadenza::InstallerProtocol;

namespace {
QVariantMap downloadableLanguage(const QString &locale, qint64 bytes, const QString &fullSize = QString())
{
    QVariantMap entry {{QStringLiteral("LocaleIdentifier"), locale}, {QStringLiteral("ByteSize"), bytes},
        {QStringLiteral("Version"), QStringLiteral("1.0")},
        {QStringLiteral("Tag"), QString(QStringLiteral("SRCLANGID:") + locale)}};
    if (!fullSize.isEmpty()) {
        entry.insert(QStringLiteral("FullSizeBundleIdentifier"), fullSize);
        entry.insert(QStringLiteral("FullSizeByteSize"), bytes * 4);
        entry.insert(QStringLiteral("FullSizeTagName"), QString(QStringLiteral("SRCLANGID:full.") + locale));
    }
    return entry;
}

QVariantMap record(const QString &tag, qint64 state, const QString &name = QString())
{
    return {{Protocol::TagNameKey, tag}, {Protocol::ObjectIDKey, tag.section(QLatin1Char(':'), 1)},
        {Protocol::ItemSoftwareUpdateStateKey, state}, {Protocol::ItemNameKey, name},
        {Protocol::ItemSecondsRemainingKey, 20.0}, {Protocol::ItemByteSizeKey, qint64(1000)},
        {Protocol::ItemDownloadByteCountKey, qint64(100)}};
}
} // namespace

class SRLanguageControlsTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase()
    {
        // The first pop-up of the process follows the notifications; it lives through every test.
        m_notifications = std::make_shared<InProcessNotificationCenter>();
        Services::setNotifications(m_notifications);
        m_first = std::make_unique<QWidget>();
        m_popUp = new CZSRLanguagePopUpButton(m_first.get());
        m_status = new QLabel(m_first.get());
        m_spinner = new QProgressBar(m_first.get());
        m_popUp->setDownloadStatusTextField(m_status);
        m_popUp->setDownloadStatusProgressIndicator(m_spinner);
    }
    void cleanupTestCase() { m_first.reset(); }

    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        auto speech = std::make_shared<FakeSpeechSynthesisService>();
        speech->setSpeechLanguageLocale(QStringLiteral("en_US"));
        m_recognition = std::make_shared<FakeRecognitionService>();
        m_recognition->setInstalledLanguages(QStringList {QStringLiteral("en_US"), QStringLiteral("fr_FR")});
        m_frenchBundle = Paths::userRecognizersFolder() + QStringLiteral("/fr_FR.SpeechRecognition");
        QDir().mkpath(m_frenchBundle);
        m_recognition->addBundle(
            m_frenchBundle, QStringLiteral("com.vendra.speech.recognition.fr_FR"), QStringLiteral("fr_FR"));
        m_ports = std::make_shared<FakeMessagePortService>();
        Services::setSpeechSynthesis(speech);
        Services::setRecognition(m_recognition);
        Services::setPreferences(std::make_shared<MemoryPreferencesStore>());
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>());
        Services::setMessagePorts(m_ports);
        Services::setNotifications(m_notifications);
        m_daemon = std::make_unique<Testing::FakeInstallerDaemon>(*m_ports);
        SpeechItemPrivate::setInstallationDictionary(QVariantMap {{QStringLiteral("DownloadableSRLanguages"),
            QVariantMap {
                {QStringLiteral("r.de"),
                    downloadableLanguage(QStringLiteral("de_DE"), 3'000'000, QStringLiteral("r.de.full"))},
                {QStringLiteral("r.ja"), downloadableLanguage(QStringLiteral("ja_JP"), 5'000'000)}}}});
        Alert::setResponder([this](const AlertRequest &) { return m_alertAnswer; });
        m_presented = 0;
        CZSpeechInstallationManagerSheets::setSRLanguageSheetPresenter(
            [this](QWidget *, const std::optional<QStringList> &, const QString &required, bool) {
                ++m_presented;
                m_presentedRequired = required;
            });
    }
    void cleanup()
    {
        CZSpeechInstallationManagerSheets::setSRLanguageSheetPresenter({});
        Alert::setResponder({});
        SpeechItemPrivate::setInstallationDictionary(std::nullopt);
        m_daemon.reset();
        m_daemon = nullptr;
        m_environment.reset();
    }

    void commandItemTitleFollowsTheLanguageCount()
    {
        QAbstractItemModelTester tester(
            m_popUp->model(), QAbstractItemModelTester::FailureReportingMode::QtTest);
        m_popUp->buildPopUpButtonAndSelectLocaleIdentifier(
            QStringLiteral("en_US"), QStringList {QStringLiteral("en_US")}, std::nullopt);
        QCOMPARE(m_popUp->count(), 3);
        QCOMPARE(m_popUp->itemText(0), QStringLiteral("English (United States)"));
        QCOMPARE(m_popUp->itemText(2), QStringLiteral("Add Language…"));
        QCOMPARE(CZSRLanguagePopUpButtonPrivate::get(m_popUp)->_numberOfFixedItemsAtEndOfMenu(), 2);
        QCOMPARE(m_popUp->previouslyChosenLocaleIdentifier(), QStringLiteral("en_US"));

        // Only the languages the user shows, and the one asked for, are listed.
        m_popUp->buildPopUpButtonAndSelectLocaleIdentifier(
            QStringLiteral("fr_FR"), std::nullopt, std::nullopt);
        QCOMPARE(m_popUp->count(), 3);
        CZSRLanguageItem::setVisibilityValue(1, QStringLiteral("en_US"));
        m_popUp->buildPopUpButtonAndSelectLocaleIdentifier(
            QStringLiteral("fr_FR"), std::nullopt, std::nullopt);
        QCOMPARE(m_popUp->itemText(m_popUp->count() - 1), QStringLiteral("Customize…"));
        QCOMPARE(m_popUp->currentText(), QStringLiteral("French (France)"));
        QCOMPARE(m_popUp->selectedLanguageItem()->localeIdentifier(), QStringLiteral("fr_FR"));
    }

    void unlistedRequestFallsBackToTheSystemLanguage()
    {
        m_popUp->buildPopUpButtonAndSelectLocaleIdentifier(
            QStringLiteral("ko_KR"), std::nullopt, std::nullopt);
        QVERIFY(m_popUp->previouslyChosenLocaleIdentifier().isNull());
        QCOMPARE(m_popUp->selectedLanguageItem()->localeIdentifier(), QStringLiteral("en_US"));
        // Nothing at all known: en_US and the command.
        m_recognition->setInstalledLanguages(std::nullopt);
        m_popUp->buildPopUpButtonAndSelectLocaleIdentifier(QString(), std::nullopt, std::nullopt);
        QCOMPARE(m_popUp->count(), 3);
        QCOMPARE(m_popUp->selectedLanguageItem()->localeIdentifier(), QStringLiteral("en_US"));
    }

    void commandItemOpensTheSheetWithoutSending()
    {
        m_popUp->buildPopUpButtonAndSelectLocaleIdentifier(
            QStringLiteral("en_US"), std::nullopt, std::nullopt);
        QSignalSpy sent(m_popUp, &CZSRLanguagePopUpButton::languageActivated);
        m_popUp->setCurrentIndex(m_popUp->count() - 1);
        QVERIFY(!m_popUp->sendAction());
        QCOMPARE(m_presented, 1);
        QCOMPARE(m_presentedRequired, QStringLiteral("en_US"));
        QCOMPARE(sent.size(), 0);
        QCOMPARE(m_popUp->selectedLanguageItem()->localeIdentifier(), QStringLiteral("en_US"));
        m_popUp->setCurrentIndex(0);
        QVERIFY(m_popUp->sendAction());
        QCOMPARE(sent.size(), 1);
    }

    void statusWaitsForPreHeat()
    {
        m_first->show();
        m_popUp->buildPopUpButtonAndSelectLocaleIdentifier(
            QStringLiteral("en_US"), std::nullopt, std::nullopt);
        m_daemon->setActiveRecords({record(QStringLiteral("SRCLANGID:de_DE"), 2, QStringLiteral("German"))});
        CZSRLanguagePopUpButtonPrivate::get(m_popUp)->_updateDownloadStatusFields();
        QCOMPARE(
            m_status->text(), QStringLiteral("Downloading Enhanced Dictation\nLess than a minute remaining"));
        QVERIFY(m_spinner->isVisible());
        // A voice first: the language waits.
        m_daemon->setActiveRecords({record(QStringLiteral("VOICEID:v"), 2),
            record(QStringLiteral("SRCLANGID:de_DE"), 2, QStringLiteral("German"))});
        CZSRLanguagePopUpButtonPrivate::get(m_popUp)->_updateDownloadStatusFields();
        QCOMPARE(m_status->text(), QStringLiteral("Waiting to download…"));
        // Installing starts the pre-heat wait, which outlives the installer's records.
        m_daemon->setActiveRecords({record(QStringLiteral("SRCLANGID:de_DE"), 3, QStringLiteral("German"))});
        CZSRLanguagePopUpButtonPrivate::get(m_popUp)->_updateDownloadStatusFields();
        QVERIFY(CZSRLanguagePopUpButtonPrivate::get(m_popUp)->_isWaitingForPreHeat());
        m_daemon->setActiveRecords({});
        CZSRLanguagePopUpButtonPrivate::get(m_popUp)->_updateDownloadStatusFields();
        QVERIFY(m_status->text().startsWith(QStringLiteral("Installing Enhanced Dictation\n")));
        // The dictation engine says it has loaded the language.
        m_notifications->postNotification(QStringLiteral("DictationIMNotificationRecognizerDidPreHeat"));
        QTRY_VERIFY(m_status->text().isEmpty());
        QVERIFY(!m_spinner->isVisible());
        QVERIFY(!CZSRLanguagePopUpButtonPrivate::get(m_popUp)->_isWaitingForPreHeat());
        QVERIFY(!CZSRLanguagePopUpButtonPrivate::get(m_popUp)->_hasDownloadStatusUpdateTimer());
    }

    void onlyTheFirstPopUpFollowsNotifications()
    {
        QWidget window;
        auto *second = new CZSRLanguagePopUpButton(&window);
        second->buildPopUpButtonAndSelectLocaleIdentifier(
            QStringLiteral("en_US"), std::nullopt, std::nullopt);
        m_popUp->buildPopUpButtonAndSelectLocaleIdentifier(
            QStringLiteral("en_US"), std::nullopt, std::nullopt);
        QCOMPARE(second->count(), m_popUp->count());
        CZSRLanguageItem::setVisibilityValue(1, QStringLiteral("fr_FR")); // posts the change notification
        QTRY_COMPARE(m_popUp->count(), second->count() + 1);
        QTest::qWait(300);
        QCOMPARE(second->count(), 3);
        // The rebuild kept the chosen language.
        QCOMPARE(m_popUp->previouslyChosenLocaleIdentifier(), QStringLiteral("en_US"));
        QCOMPARE(m_popUp->selectedLanguageItem()->localeIdentifier(), QStringLiteral("en_US"));
    }

    void sheetWithDownloads()
    {
        CZCustomizeSRLanguagesWindowController sheet;
        QWidget client;
        client.resize(700, 500);
        client.show();
        CZSRLanguageItem::setVisibilityValue(1, QStringLiteral("de_DE"));
        CZSRLanguageItem::setVisibilityValue(1, QStringLiteral("fr_FR"));
        sheet.showSheetForWindow(&client, std::nullopt, QStringLiteral("en_US"), true);
        QVERIFY(QTest::qWaitForWindowExposed(sheet.window()));
        QStringList titles;
        for (const CZSRLanguageRowPtr &row : sheet.currentlyDisplayedRows()) {
            titles.append(row->isGroupRow() ? QStringLiteral("# ") + row->title()
                                            : row->srLanguageItem()->localeIdentifier());
        }
        QCOMPARE(titles,
            QStringList({QStringLiteral("# English"), QStringLiteral("en_US"), QStringLiteral("# French"),
                QStringLiteral("fr_FR"), QStringLiteral("# German"), QStringLiteral("de_DE"),
                QStringLiteral("# Japanese"), QStringLiteral("ja_JP")}));
        // German is ticked and not installed: OK is on, the size is shown, and its size can be chosen.
        QPushButton *ok = sheet.window()->findChild<QPushButton *>(QStringLiteral("okButton"));
        QVERIFY(ok->isEnabled());
        QLabel *size = sheet.window()->findChild<QLabel *>(QStringLiteral("selectedDownloadSizeTextField"));
        QCOMPARE(size->text(), QStringLiteral("Selected download size: 3 MB"));
        QTRY_VERIFY(sheet.existingViewForRow(5));
        CZSRLanguageTableCellView *german = sheet.existingViewForRow(5);
        QCOMPARE(german->textField()->text(), QStringLiteral("Germany"));
        QCOMPARE(german->downloadMessageTextField()->text(), QStringLiteral("Required"));
        QVERIFY(german->downloadVariantPopUpButton()->isVisibleTo(german));
        Q_EMIT german->downloadVariantPopUpButton()->activated(1);
        QCOMPARE(size->text(), QStringLiteral("Selected download size: 12 MB"));

        // French is installed and removable; unticking and OK asks first, and dictation stops listening.
        sheet.existingViewForRow(3)->activeCheckbox()->click();
        QVERIFY(sheet.markedForDeletionSet().contains(QStringLiteral("fr_FR")));
        QSignalSpy posted(m_notifications.get(), &DistributedNotificationCenter::notificationPosted);
        m_alertAnswer = 0;
        ok->click();
        QTRY_VERIFY(!sheet.window()->isVisible());
        QCOMPARE(Alert::answeredRequests().last().title,
            QStringLiteral("Remove the languages you unchecked from this computer?"));
        QTRY_VERIFY(std::any_of(posted.cbegin(), posted.cend(), [](const QList<QVariant> &args) {
            return args.first().toString() == u"DictationIMObservationDoCancelListening";
        }));
        QTRY_VERIFY(!QDir(m_frenchBundle).exists());
        const QList<QVariantMap> requests = m_daemon->installRequests();
        QCOMPARE(requests.size(), 1);
        QCOMPARE(
            requests.first().value(Protocol::TagNameKey).toString(), QStringLiteral("SRCLANGID:full.de_DE"));
        QCOMPARE(CZSRLanguageItem::visibiltyValueForLocaleIdentifier(QStringLiteral("fr_FR"), nullptr), 0);
    }

    void requiredLocaleIsNeverRemoved()
    {
        CZCustomizeSRLanguagesWindowController sheet;
        QWidget client;
        client.resize(700, 500);
        client.show();
        CZSRLanguageItem::setVisibilityValue(0, QStringLiteral("fr_FR"));
        sheet.showSheetForWindow(&client, std::nullopt, QStringLiteral("fr_FR"), true);
        QVERIFY(QTest::qWaitForWindowExposed(sheet.window()));
        QTRY_VERIFY(sheet.existingViewForRow(3));
        CZSRLanguageTableCellView *french = sheet.existingViewForRow(3);
        QVERIFY(french->activeCheckbox()->isChecked()); // shown although hidden before
        french->activeCheckbox()->click();
        sheet.window()->findChild<QPushButton *>(QStringLiteral("okButton"))->click();
        QVERIFY(Alert::answeredRequests().isEmpty());
        QVERIFY(QDir(m_frenchBundle).exists());
    }

    void sheetWithoutDownloads()
    {
        CZCustomizeSRLanguagesWindowController sheet;
        QWidget client;
        client.resize(700, 500);
        client.show();
        // French is outside the network service: greyed, offline only.
        sheet.showSheetForWindow(&client, QStringList {QStringLiteral("en_US")}, QString(), false);
        QVERIFY(QTest::qWaitForWindowExposed(sheet.window()));
        QPushButton *ok = sheet.window()->findChild<QPushButton *>(QStringLiteral("okButton"));
        QVERIFY(!ok->isEnabled());
        QTRY_VERIFY(sheet.existingViewForRow(3));
        CZSRLanguageTableCellView *french = sheet.existingViewForRow(3);
        QVERIFY(!french->activeCheckbox()->isEnabled());
        QVERIFY(!french->textField()->isEnabled());
        QCOMPARE(french->downloadMessageTextField()->text(), QStringLiteral("Offline dictation only"));
        QVERIFY(sheet.window()
                    ->findChild<QLabel *>(QStringLiteral("selectedDownloadSizeTextField"))
                    ->text()
                    .isEmpty());

        // Space ticks the current row from the keyboard.
        QTableView *table = sheet.selectionTableView();
        table->setFocus();
        table->setCurrentIndex(table->model()->index(1, 0)); // United States
        const bool ticked = sheet.currentlyDisplayedRows().at(1)->isSelected();
        QTest::keyClick(table, Qt::Key_Space);
        QCOMPARE(sheet.currentlyDisplayedRows().at(1)->isSelected(), !ticked);
        QCOMPARE(sheet.existingViewForRow(1)->activeCheckbox()->isChecked(), !ticked);
        table->setCurrentIndex(table->model()->index(5, 0)); // Germany: outside the network list
        QTest::keyClick(table, Qt::Key_Space);
        QVERIFY(!sheet.currentlyDisplayedRows().at(5)->isSelected()); // greyed rows do not tick

        // A tick on a row the filter then hides is not saved.
        CZSRLanguageRowCheckboxButton *english = sheet.existingViewForRow(1)->activeCheckbox();
        const bool before = english->isChecked();
        english->click();
        QCOMPARE(sheet.currentlyDisplayedRows().at(1)->isSelected(), !before);
        QVERIFY(ok->isEnabled());
        sheet.window()->findChild<QLineEdit *>(QStringLiteral("searchField"))->setText(QStringLiteral("Fre"));
        ok->click();
        QCOMPARE(CZSRLanguageItem::visibiltyValueForLocaleIdentifier(QStringLiteral("en_US"), nullptr), 2);
        QVERIFY(m_daemon->installRequests().isEmpty());
    }

private:
    std::unique_ptr<TestEnvironment> m_environment;
    std::shared_ptr<InProcessNotificationCenter> m_notifications;
    std::shared_ptr<FakeRecognitionService> m_recognition;
    std::shared_ptr<FakeMessagePortService> m_ports;
    std::unique_ptr<Testing::FakeInstallerDaemon> m_daemon;
    std::unique_ptr<QWidget> m_first;
    CZSRLanguagePopUpButton *m_popUp = nullptr;
    QLabel *m_status = nullptr;
    QProgressBar *m_spinner = nullptr;
    QString m_frenchBundle;
    int m_alertAnswer = 0;
    int m_presented = 0;
    QString m_presentedRequired;
};

QTEST_MAIN(SRLanguageControlsTest)
#include "tst_srlanguagecontrols.moc"
