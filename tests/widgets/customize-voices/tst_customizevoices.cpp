// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeInstallerDaemon.h"
#include "TestEnvironment.h"

#include "FakeMessagePortService.h"
#include "FakeSoundService.h"
#include "FakeUserLocaleService.h"
#include "InProcessNotificationCenter.h"
#include "MemoryPreferencesStore.h"
#include "core/SpeechNames.h"
#include "core/files/Paths.h"
#include "core/installation/CZSpeechInstallationManager.h"
#include "core/services/BundleSpeechSynthesisService.h"
#include "core/services/MediaSoundService.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "core/voices/CZVoiceObject.h"
#include "core/voices/DownloadableVoice.h"
#include "core/voices/SpeechSynthesizer.h"
#include "protocol/InstallerProtocol.h"
#include "widgets/customize-voices/CZVoiceRowCheckboxButton.h"
#include "widgets/customize-voices/CZVoiceRowTextView.h"
#include "widgets/customize-voices/CustomizeVoicesWindowController.h"
#include "widgets/customize-voices/CustomizeVoicesWindowController_p.h"
#include "widgets/customize-voices/VoiceTableCellView.h"
#include "widgets/helpers/Alert.h"
#include "widgets/installation/CZSpeechInstallationManagerSheets.h"
#include "widgets/voice-popup/CZVoicePopUpButton.h"
#include "widgets/voice-popup/CZVoicePopUpButton_p.h"

#include <QAbstractItemModelTester>
#include <QComboBox>
#include <QDialog>
#include <QDir>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QSignalSpy>
#include <QTableView>
#include <QTest>
#include <QTimer>

using namespace Cadenza;
using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString P = QStringLiteral("com.vendra.speech.synthesis.voice.");
const QString Domain = Cadenza::SpeechNames::VoicePreferencesDomain;

} // namespace

class CustomizeVoicesTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_ports = std::make_shared<FakeMessagePortService>();
        m_notifications = std::make_shared<InProcessNotificationCenter>();
        Services::setSpeechSynthesis(std::make_shared<BundleSpeechSynthesisService>());
        Services::setPreferences(std::make_shared<MemoryPreferencesStore>());
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>());
        Services::setMessagePorts(m_ports);
        Services::setNotifications(m_notifications);
        m_daemon = std::make_unique<Testing::FakeInstallerDaemon>(*m_ports);
        SpeechItemPrivate::setInstallationDictionary(QVariantMap {{QStringLiteral("DownloadableVoices"),
            QVariantMap {{P + QStringLiteral("nora.premium"),
                             TestEnvironment::downloadableVoiceEntry(
                                 QStringLiteral("Nora Premium"), QStringLiteral("en_US"))},
                {P + QStringLiteral("iris.premium"),
                    TestEnvironment::downloadableVoiceEntry(QStringLiteral("Iris Premium"),
                        QStringLiteral("en_US"), P + QStringLiteral("iris.full"))},
                {P + QStringLiteral("femke.compact"),
                    TestEnvironment::downloadableVoiceEntry(
                        QStringLiteral("Femke Compact"), QStringLiteral("nl_NL"))}}}});
        // Maren and Tobias come with the system; Nora was downloaded into the user's folder.
        install(Paths::systemVoicesFolder(), QStringLiteral("maren.compact"), QStringLiteral("Maren Compact"),
            QStringLiteral("en_US"));
        install(Paths::systemVoicesFolder(), QStringLiteral("tobias.compact"),
            QStringLiteral("Tobias Compact"), QStringLiteral("en_US"));
        install(Paths::systemVoicesFolder(), QStringLiteral("liesel.compact"),
            QStringLiteral("Liesel Compact"), QStringLiteral("de_DE"));
        m_noraBundle = install(Paths::userVoicesFolder(), QStringLiteral("nora.premium"),
            QStringLiteral("Nora Premium"), QStringLiteral("en_US"));
        // The user once chose to show Nora.
        Services::preferences().setValue(CZVoiceObject::VisibleIdentifiersKey,
            QVariantMap {{QString(P + QStringLiteral("nora.premium")), 1}}, Domain);
        Alert::setResponder([this](const AlertRequest &) { return m_alertAnswer; });
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
        CZSpeechInstallationManagerSheets::setVoiceSheetPresenter({});
        SpeechItemPrivate::setInstallationDictionary(std::nullopt);
        m_daemon.reset();
        Services::setSpeechSynthesis(nullptr);
        m_environment.reset();
    }

    void listsInstalledAndDownloadableVoices()
    {
        QAbstractItemModelTester tester(m_controller->voiceSelectionTableView()->model(),
            QAbstractItemModelTester::FailureReportingMode::QtTest);
        show();
        QCOMPARE(titles(),
            QStringList({QStringLiteral("# English (United States)"), QStringLiteral("Iris"),
                QStringLiteral("Maren"), QStringLiteral("Nora"), QStringLiteral("Tobias"),
                QStringLiteral("# Dutch (Netherlands)"), QStringLiteral("Femke"),
                QStringLiteral("# German (Germany)"), QStringLiteral("Liesel")}));
        // Voices of the user's own locale start ticked when their base voice is installed.
        QVERIFY(row(QStringLiteral("Maren"))->isSelected());
        QVERIFY(!row(QStringLiteral("Liesel"))->isSelected());
        QVERIFY(!row(QStringLiteral("Iris"))->isSelected());
        QVERIFY(!m_controller->shouldSelectRow(0));
        QVERIFY(m_controller->shouldSelectRow(1));
        // Visible voice rows have a row view each; headings have none.
        QVERIFY(!m_controller->existingViewForRow(0));
        VoiceTableCellView *maren = view(QStringLiteral("Maren"));
        QVERIFY(maren);
        QCOMPARE(maren->activeCheckbox()->voiceIdentifier(), P + QStringLiteral("maren.compact"));
        QCOMPARE(maren->activeCheckbox()->accessibleName(), QStringLiteral("Maren, English (United States)"));
        QVERIFY(m_controller->isDownloadStatusPolling());
        QCOMPARE(m_controller->window()->parentWidget(), m_client.get());
    }

    void tickingADownloadAndAccepting()
    {
        show();
        QSignalSpy notified(m_notifications.get(), &DistributedNotificationCenter::notificationPosted);
        VoiceTableCellView *iris = view(QStringLiteral("Iris"));
        QVERIFY(iris->downloadMessageTextField()->text().isEmpty());
        iris->activeCheckbox()->click();
        QCOMPARE(iris->downloadMessageTextField()->text(), QStringLiteral("Required"));
        QVERIFY(iris->downloadVariantPopUpButton()->isVisibleTo(iris));
        QCOMPARE(iris->downloadVariantPopUpButton()->currentIndex(), 0);
        QCOMPARE(
            m_controller->voiceSelectionTableView()->currentIndex().row(), rowIndex(QStringLiteral("Iris")));
        CustomizeVoicesWindowControllerPrivate::get(m_controller.get())->_updateButtonStates();
        QCOMPARE(
            label("selectedDownloadSizeTextField")->text(), QStringLiteral("Selected download size: 2 MB"));
        // The full size adds its own bytes instead.
        iris->downloadVariantPopUpButton()->setCurrentIndex(1);
        Q_EMIT iris->downloadVariantPopUpButton()->activated(1);
        CustomizeVoicesWindowControllerPrivate::get(m_controller.get())->_updateButtonStates();
        QCOMPARE(
            label("selectedDownloadSizeTextField")->text(), QStringLiteral("Selected download size: 9 MB"));

        // Nora has no size choice.
        QVERIFY(!view(QStringLiteral("Femke"))
                     ->downloadVariantPopUpButton()
                     ->isVisibleTo(view(QStringLiteral("Femke"))));

        QSignalSpy ended(m_controller.get(), &CustomizeVoicesWindowController::sheetEnded);
        button("okButton")->click();
        QCOMPARE(ended.size(), 1);
        QVERIFY(ended.first().first().toBool());
        QVERIFY(!m_controller->window()->isVisible());
        QVERIFY(!m_controller->isDownloadStatusPolling());
        QVERIFY(Alert::answeredRequests().isEmpty());
        const QList<QVariantMap> requests = m_daemon->installRequests();
        QCOMPARE(requests.size(), 1);
        QCOMPARE(requests.first().value(InstallerProtocol::ObjectIDKey).toString(),
            P + QStringLiteral("iris.premium"));
        // The table records every shown voice; the change notification follows 2 s later.
        QCOMPARE(
            CZVoiceObject::visibleVoicesTable()->value(P + QStringLiteral("iris.premium")).toLongLong(), 1);
        // Liesel was never chosen either way; she is recorded as such.
        QCOMPARE(
            CZVoiceObject::visibleVoicesTable()->value(P + QStringLiteral("liesel.compact")).toLongLong(), 2);
        QTRY_VERIFY_WITH_TIMEOUT(std::any_of(notified.cbegin(), notified.cend(),
                                     [](const QList<QVariant> &args) {
                                         return args.first().toString()
                                             == Cadenza::SpeechNames::DefaultVoiceChangedNotification;
                                     }),
            4000);
    }

    void filteringKeepsTicks()
    {
        show();
        view(QStringLiteral("Liesel"))->activeCheckbox()->click();
        QLineEdit *search = m_controller->window()->findChild<QLineEdit *>(QStringLiteral("searchField"));
        search->setText(QStringLiteral("zzz"));
        QCOMPARE(m_controller->numberOfRowsInTableView(), 0);
        QVERIFY(label("noResultsFoundTextField")->isVisible());
        search->setText(QStringLiteral("lie"));
        QCOMPARE(titles(), QStringList({QStringLiteral("# German (Germany)"), QStringLiteral("Liesel")}));
        QVERIFY(!label("noResultsFoundTextField")->isVisible());
        search->clear();
        QCOMPARE(m_controller->numberOfRowsInTableView(), 9);
        QVERIFY(row(QStringLiteral("Liesel"))->isSelected());
        QTRY_VERIFY(view(QStringLiteral("Liesel"))->activeCheckbox()->isChecked());
    }

    void unremovableVoicesAreOnlyHidden()
    {
        show();
        view(QStringLiteral("Tobias"))->activeCheckbox()->click();
        QVERIFY(!m_controller->markedForDeletionSet().contains(P + QStringLiteral("tobias.compact")));
        button("okButton")->click();
        QVERIFY(Alert::answeredRequests().isEmpty());
        QCOMPARE(
            CZVoiceObject::visibleVoicesTable()->value(P + QStringLiteral("tobias.compact")).toLongLong(), 0);
        QVERIFY(QDir(Paths::systemVoicesFolder() + QStringLiteral("/TobiasCompact.SpeechVoice")).exists());
    }

    void deleteAlertAnswers_data()
    {
        QTest::addColumn<int>("answer");
        QTest::addColumn<bool>("sheetStaysOpen");
        QTest::addColumn<bool>("bundleRemoved");
        QTest::newRow("remove") << 0 << false << true;
        QTest::newRow("cancel") << 1 << true << false;
        QTest::newRow("keep") << 2 << false << false;
    }
    void deleteAlertAnswers()
    {
        QFETCH(int, answer);
        QFETCH(bool, sheetStaysOpen);
        QFETCH(bool, bundleRemoved);
        show();
        view(QStringLiteral("Nora"))->activeCheckbox()->click();
        QVERIFY(m_controller->markedForDeletionSet().contains(P + QStringLiteral("nora.premium")));
        m_alertAnswer = answer;
        QSignalSpy ended(m_controller.get(), &CustomizeVoicesWindowController::sheetEnded);
        button("okButton")->click();
        QCOMPARE(Alert::answeredRequests().size(), 1);
        const AlertRequest alert = Alert::answeredRequests().first();
        QVERIFY(alert.asSheet);
        QCOMPARE(alert.title, QStringLiteral("Remove the voices you unchecked from this computer?"));
        QCOMPARE(alert.buttons,
            QStringList({QStringLiteral("Remove"), QStringLiteral("Cancel"), QStringLiteral("Keep")}));
        QTest::qWait(50); // the answer arrives from the event loop
        QCOMPARE(m_controller->window()->isVisible(), sheetStaysOpen);
        QCOMPARE(ended.size(), sheetStaysOpen ? 0 : 1);
        if (sheetStaysOpen) {
            QVERIFY(!row(QStringLiteral("Nora"))->isSelected()); // choices as they were
        }
        QTRY_COMPARE(!QDir(m_noraBundle).exists(), bundleRemoved);
    }

    void removingTheDefaultVoiceForgetsIt()
    {
        Services::preferences().setValue(Cadenza::SpeechNames::SelectedVoiceCreatorKey, 1, Domain);
        Services::preferences().setValue(Cadenza::SpeechNames::SelectedVoiceIDKey, 77, Domain);
        Services::preferences().setValue(
            Cadenza::SpeechNames::SelectedVoiceNameKey, QStringLiteral("Nora"), Domain);
        // Nora, the premium voice of the user's language, is the default.
        QCOMPARE(SpeechSynthesizer::defaultVoiceFromMainstreamVoices(), P + QStringLiteral("nora.premium"));
        show();
        view(QStringLiteral("Nora"))->activeCheckbox()->click();
        m_alertAnswer = 0;
        button("okButton")->click();
        QTest::qWait(50);
        QVERIFY(
            !Services::preferences().value(Cadenza::SpeechNames::SelectedVoiceCreatorKey, Domain).isValid());
        QVERIFY(!Services::preferences().value(Cadenza::SpeechNames::SelectedVoiceIDKey, Domain).isValid());
        QVERIFY(!Services::preferences().value(Cadenza::SpeechNames::SelectedVoiceNameKey, Domain).isValid());
    }

    void downloadingRowsAreTickedAndGreyed()
    {
        m_daemon->setActiveRecords(
            {QVariantMap {{InstallerProtocol::ObjectIDKey, QString(P + QStringLiteral("femke.compact"))},
                {InstallerProtocol::TagNameKey, QStringLiteral("VOICEID:Femke Compact")},
                {InstallerProtocol::ItemDownloadStatusKey, qint64(InstallerProtocol::DownloadingStatus)},
                {InstallerProtocol::ItemPercentCompleteKey, 0.7}}});
        show();
        VoiceTableCellView *femke = view(QStringLiteral("Femke"));
        QVERIFY(row(QStringLiteral("Femke"))->isSelected());
        QVERIFY(!femke->activeCheckbox()->isEnabled());
        QVERIFY(!femke->textField()->isEnabled());
        QCOMPARE(femke->downloadMessageTextField()->text(), QStringLiteral("Downloading"));
        m_daemon->setActiveRecords(
            {QVariantMap {{InstallerProtocol::ObjectIDKey, QString(P + QStringLiteral("femke.compact"))},
                {InstallerProtocol::ItemDownloadStatusKey, qint64(InstallerProtocol::DownloadingStatus)},
                {InstallerProtocol::ItemPercentCompleteKey, 45.9}}});
        // The 2-second poll brings the percentage.
        QTRY_COMPARE_WITH_TIMEOUT(
            femke->downloadMessageTextField()->text(), QStringLiteral("Downloading 45%"), 5000);
    }

    void cancelWritesNothing()
    {
        show();
        view(QStringLiteral("Liesel"))->activeCheckbox()->click();
        view(QStringLiteral("Iris"))->activeCheckbox()->click();
        QSignalSpy ended(m_controller.get(), &CustomizeVoicesWindowController::sheetEnded);
        button("cancelButton")->click();
        QCOMPARE(ended.size(), 1);
        QVERIFY(!ended.first().first().toBool());
        QCOMPARE(CZVoiceObject::visibleVoicesTable()->size(), 1);
        QVERIFY(m_daemon->installRequests().isEmpty());
        // The next showing starts afresh.
        show();
        QVERIFY(!row(QStringLiteral("Liesel"))->isSelected());
    }

    void playAndStop()
    {
        show();
        QTableView *table = m_controller->voiceSelectionTableView();
        QPushButton *play = button("playStopButton");
        QVERIFY(!play->isEnabled());
        table->selectRow(rowIndex(QStringLiteral("Iris")));
        QVERIFY(!play->isEnabled()); // no recorded sample for Iris
        m_controller->startStopPlayingSelection();
        QCOMPARE(Alert::beepCount(), 1);
        QCOMPARE(play->text(), QStringLiteral("Play"));

        // Voices of the sample repository come with a recorded sample.
        const DownloadableVoicePtr recorded
            = DownloadableVoice::initWithVoiceID(P + QStringLiteral("femke.compact"),
                TestEnvironment::downloadableVoiceEntry(
                    QStringLiteral("Femke Compact"), QStringLiteral("nl_NL")));
        QVERIFY(CustomizeVoicesWindowControllerPrivate::get(m_controller.get())
                    ->_isSampleAvailableForVoiceObject(recorded));
        QVERIFY(!CustomizeVoicesWindowControllerPrivate::get(m_controller.get())
                     ->_isSampleAvailableForVoiceObject(nullptr));

        table->selectRow(rowIndex(QStringLiteral("Maren")));
        QVERIFY(play->isEnabled());
        play->click();
        QCOMPARE(play->text(), QStringLiteral("Stop"));
        play->click();
        QCOMPARE(play->text(), QStringLiteral("Play"));
        QVERIFY(!CustomizeVoicesWindowControllerPrivate::get(m_controller.get())->_anyVoicePlaying());
    }

    void sheetTicksAgreeWithTheMenusForEverySampleLocale_data()
    {
        QTest::addColumn<QString>("locale");
        // The locales of the sample voices that come installed.
        for (const char *locale : {"en_US", "en_GB", "en_AU", "de_DE", "fr_FR", "fr_BE", "it_IT", "es_ES",
                 "es_MX", "pt_BR", "ja_JP", "hi_IN"}) {
            QTest::newRow(locale) << QString::fromLatin1(locale);
        }
    }
    void sheetTicksAgreeWithTheMenusForEverySampleLocale()
    {
        QFETCH(QString, locale);
        // The sample voices and the sample catalogue, nothing chosen by the user yet.
        m_controller.reset();
        m_environment = std::make_unique<TestEnvironment>();
        m_environment->installSampleVoices();
        Services::setSpeechSynthesis(std::make_shared<BundleSpeechSynthesisService>());
        Services::setPreferences(std::make_shared<MemoryPreferencesStore>());
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>(QStringList {locale}, locale));
        SpeechItemPrivate::setInstallationDictionary(std::nullopt);
        m_controller = std::make_unique<CustomizeVoicesWindowController>();

        QSet<QString> inMenu;
        QString shown;
        QString shownUpgrade;
        {
            CZVoicePopUpButton popUp(m_client.get());
            popUp.buildPopUpButtonWithSelectVoiceIdentifier(QString());
            // The voice a pop-up shows stays listed whatever the ticks say.
            shown = popUp.selectedVoiceAttributes()
                        .value_or(QVariantMap())
                        .value(QStringLiteral("VoiceIdentifier"))
                        .toString();
            // A sheet row may stand for an installed voice through its upgrade: both count as listed.
            CZSpeechInstallationManager *manager = CZSpeechInstallationManager::sharedManager();
            const QList<DownloadableVoicePtr> downloadables = manager->downloadableVoices();
            for (const VoiceTableRowPtr &entry : VoicePopUpPrivate::currentVoiceRows()) {
                if (!entry->isGroupRow()) {
                    inMenu.insert(entry->voiceObject()->identifier());
                    if (const auto upgrade
                        = manager->downloadableVoiceUpgradeForVoice(*entry->voiceObject(), downloadables)) {
                        inMenu.insert(upgrade->identifier());
                        if (entry->voiceObject()->identifier() == shown) {
                            shownUpgrade = upgrade->identifier();
                        }
                    }
                }
            }
        }
        VoicePopUpPrivate::resetProcessState();
        QVERIFY(!inMenu.isEmpty());

        show();
        int installedRows = 0;
        for (const VoiceTableRowPtr &entry : m_controller->currentlyDisplayedVoiceRows()) {
            // Rows of installed voices, and of upgrades that stand for one; other downloads are not in menus.
            if (entry->isGroupRow()
                || (entry->voiceObject()->isDownloadable()
                    && entry->voiceObject()->downloadStatus() != InstallerProtocol::UpgradeAvailableStatus)) {
                continue;
            }
            ++installedRows;
            const QString identifier = entry->voiceObject()->identifier();
            if (identifier == shown || identifier == shownUpgrade) {
                QVERIFY(inMenu.contains(identifier));
                continue;
            }
            QVERIFY2(entry->isSelected() == inMenu.contains(identifier),
                qPrintable(QStringLiteral("%1: ticked %2, in the menu %3")
                               .arg(identifier)
                               .arg(entry->isSelected())
                               .arg(inMenu.contains(identifier))));
        }
        QVERIFY(installedRows > 0);
        m_controller->cancelVoiceSelection();
    }

    void playingADownloadableSampleReturnsToTheEventLoop()
    {
        // The real sound service, on whatever audio this machine has (none, in the test world).
        Services::setSound(std::make_shared<MediaSoundService>());
        show();
        QTableView *table = m_controller->voiceSelectionTableView();
        QPushButton *play = button("playStopButton");
        table->selectRow(rowIndex(QStringLiteral("Femke")));
        QTRY_VERIFY(play->isEnabled()); // Femke's sample is recorded
        bool timerFired = false;
        QTimer::singleShot(0, this, [&timerFired] { timerFired = true; });
        play->click();
        QTRY_VERIFY_WITH_TIMEOUT(timerFired, 2000);
        // It either plays (Stop) or beeps and stays on Play; it never hangs.
        QTRY_VERIFY_WITH_TIMEOUT(play->text() == QStringLiteral("Stop") || Alert::beepCount() == 1, 10000);
        if (Alert::beepCount() == 1) {
            QCOMPARE(play->text(), QStringLiteral("Play"));
            QVERIFY(!CustomizeVoicesWindowControllerPrivate::get(m_controller.get())->_anyVoicePlaying());
        } else {
            play->click();
            QCOMPARE(play->text(), QStringLiteral("Play"));
        }
        Services::setSound(nullptr);
    }

    void aSampleThatCannotPlayBeepsAndStaysOnPlay()
    {
        auto sound = std::make_shared<FakeSoundService>();
        sound->setOutcome(FakeSoundService::Outcome::Fails);
        Services::setSound(sound);
        show();
        QPushButton *play = button("playStopButton");
        m_controller->voiceSelectionTableView()->selectRow(rowIndex(QStringLiteral("Femke")));
        QTRY_VERIFY(play->isEnabled());
        QStringList titles;
        connect(sound.get(), &SoundService::failed, this, [&] { titles.append(play->text()); });
        play->click();
        QCOMPARE(sound->played().size(), 1);
        QTRY_COMPARE(Alert::beepCount(), 1);
        QCOMPARE(titles, QStringList {QStringLiteral("Play")}); // never showed Stop
        QTest::qWait(10);
        QCOMPARE(play->text(), QStringLiteral("Play"));
        QVERIFY(!CustomizeVoicesWindowControllerPrivate::get(m_controller.get())->_anyVoicePlaying());

        // One that plays shows Stop until it ends, or until Stop is pressed.
        sound->setOutcome(FakeSoundService::Outcome::Plays);
        play->click();
        QTRY_COMPARE(play->text(), QStringLiteral("Stop"));
        sound->finishPlaying();
        QTRY_COMPARE(play->text(), QStringLiteral("Play"));
        play->click();
        QTRY_COMPARE(play->text(), QStringLiteral("Stop"));
        play->click();
        QCOMPARE(play->text(), QStringLiteral("Play"));
        QVERIFY(!sound->isActive());
        Services::setSound(nullptr);
    }

    void keyboardTicksTheCurrentVoice()
    {
        show();
        QTableView *table = m_controller->voiceSelectionTableView();
        table->setFocus();
        table->setCurrentIndex(table->model()->index(rowIndex(QStringLiteral("Liesel")), 0));
        QTest::keyClick(table, Qt::Key_Space);
        QVERIFY(row(QStringLiteral("Liesel"))->isSelected());
        QVERIFY(view(QStringLiteral("Liesel"))->activeCheckbox()->isChecked());
    }

    void customizeItemOfThePopUpOpensTheSheet()
    {
        auto *popUp = new CZVoicePopUpButton(m_client.get());
        popUp->buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("maren.compact"));
        popUp->setCurrentIndex(popUp->count() - 1);
        QVERIFY(!popUp->sendAction());
        CustomizeVoicesWindowController *shared
            = CZSpeechInstallationManagerSheets::voiceSelectionWindowController();
        QVERIFY(shared->window()->isVisible());
        QCOMPARE(shared->window()->parentWidget(), m_client.get());
        shared->cancelVoiceSelection();
        QCOMPARE(popUp->currentText(), QStringLiteral("Maren"));
    }

private:
    QString install(const QString &folder, const QString &suffix, const QString &name, const QString &locale)
    {
        QVariantMap attributes = TestEnvironment::voiceAttributes(P + suffix, name, locale);
        attributes.insert(QStringLiteral("VoiceDemoText"), QString(QStringLiteral("Hello from ") + name));
        return TestEnvironment::writeVoiceBundle(folder, QString(name).remove(u' '), attributes);
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
        const int index = rowIndex(name);
        return index < 0 ? nullptr : m_controller->currentlyDisplayedVoiceRows().at(index);
    }
    /// The row view of a voice, once the table has made it.
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
    QLabel *label(const char *name) const
    {
        return m_controller->window()->findChild<QLabel *>(QLatin1String(name));
    }
    QPushButton *button(const char *name) const
    {
        return m_controller->window()->findChild<QPushButton *>(QLatin1String(name));
    }

    std::unique_ptr<TestEnvironment> m_environment;
    std::shared_ptr<FakeMessagePortService> m_ports;
    std::shared_ptr<InProcessNotificationCenter> m_notifications;
    std::unique_ptr<Testing::FakeInstallerDaemon> m_daemon;
    std::unique_ptr<CustomizeVoicesWindowController> m_controller;
    std::unique_ptr<QWidget> m_client;
    QString m_noraBundle;
    int m_alertAnswer = 0;
};

QTEST_MAIN(CustomizeVoicesTest)
#include "tst_customizevoices.moc"
