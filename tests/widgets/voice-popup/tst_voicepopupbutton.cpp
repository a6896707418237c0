// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeInstallerDaemon.h"
#include "TestEnvironment.h"

#include "FakeMessagePortService.h"
#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "InProcessNotificationCenter.h"
#include "MemoryPreferencesStore.h"
#include "core/SpeechNames.h"
#include "core/services/DBusNotificationCenter.h"
#include "core/services/Services.h"
#include "core/speech-items/CZSpeechItem_p.h"
#include "protocol/InstallerProtocol.h"
#include "widgets/helpers/Alert.h"
#include "widgets/installation/CZSpeechInstallationManagerSheets.h"
#include "widgets/voice-popup/CZVoicePopUpButton.h"
#include "widgets/voice-popup/CZVoicePopUpButton_p.h"

#include <QAbstractItemModelTester>
#include <QAbstractItemView>
#include <QLabel>
#include <QProcess>
#include <QProgressBar>
#include <QSignalSpy>
#include <QTest>

using namespace Cadenza;
using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString P = QStringLiteral("com.vendra.speech.synthesis.voice.");

QStringList titles(const QComboBox &box)
{
    QStringList out;
    for (int i = 0; i < box.count(); ++i) {
        const bool separator = box.itemData(i, Qt::AccessibleDescriptionRole).toString() == u"separator";
        out.append(separator ? QStringLiteral("---") : box.itemText(i));
    }
    return out;
}

QVariantMap downloadable(const QString &name, const QString &locale)
{
    return {{QStringLiteral("VoiceAttributes"),
                QVariantMap {{QStringLiteral("VoiceName"), name},
                    {QStringLiteral("VoiceLocaleIdentifier"), locale},
                    {QStringLiteral("VoiceGender"), QStringLiteral("VoiceGenderFemale")}}},
        {QStringLiteral("VoiceByteSize"), qint64(1000)},
        {QStringLiteral("VoiceVersion"), QStringLiteral("1.0")},
        {QStringLiteral("VoiceTag"), QString(QStringLiteral("VOICEID:") + name)}};
}
} // namespace

class VoicePopUpButtonTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_speech = std::make_shared<FakeSpeechSynthesisService>();
        m_ports = std::make_shared<FakeMessagePortService>();
        m_notifications = std::make_shared<InProcessNotificationCenter>();
        Services::setSpeechSynthesis(m_speech);
        Services::setPreferences(std::make_shared<MemoryPreferencesStore>());
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>());
        Services::setMessagePorts(m_ports);
        Services::setNotifications(m_notifications);
        m_daemon = std::make_unique<Testing::FakeInstallerDaemon>(*m_ports);
        SpeechItemPrivate::setInstallationDictionary(QVariantMap {{QStringLiteral("DownloadableVoices"),
            QVariantMap {{P + QStringLiteral("maren.premium"),
                             downloadable(QStringLiteral("Maren Premium"), QStringLiteral("en_US"))},
                {P + QStringLiteral("nora.premium"),
                    downloadable(QStringLiteral("Nora Premium"), QStringLiteral("en_US"))}}}});
        addVoice(QStringLiteral("maren.compact"), QStringLiteral("Maren Compact"), QStringLiteral("en_US"),
            QStringLiteral("VoiceGenderFemale"));
        addVoice(QStringLiteral("tobias.compact"), QStringLiteral("Tobias Compact"), QStringLiteral("en_US"),
            QStringLiteral("VoiceGenderMale"));
        addVoice(QStringLiteral("amelie.compact"), QStringLiteral("Amelie Compact"), QStringLiteral("en_GB"),
            QStringLiteral("VoiceGenderFemale"));
        addVoice(QStringLiteral("liesel.compact"), QStringLiteral("Liesel Compact"), QStringLiteral("de_DE"),
            QStringLiteral("VoiceGenderFemale"));
        // Voices of other languages are hidden until the user shows them.
        CZVoiceObject::setVisibleVoicesTable(
            {{P + QStringLiteral("amelie.compact"), 1}, {P + QStringLiteral("liesel.compact"), 1}});
        m_presented.clear();
        CZSpeechInstallationManagerSheets::setVoiceSheetPresenter([this](QWidget *window, bool qualities) {
            m_presented.append({window, qualities});
        });
        Alert::setResponder([this](const AlertRequest &) { return m_alertAnswer; });
    }
    void cleanup()
    {
        VoicePopUpPrivate::resetProcessState();
        Alert::setResponder({});
        CZSpeechInstallationManagerSheets::setVoiceSheetPresenter({});
        SpeechItemPrivate::setInstallationDictionary(std::nullopt);
        m_daemon.reset();
        Services::setNotifications(nullptr);
        m_environment.reset();
    }

    void keysOnAClosedPopUpOpenItsMenu()
    {
        // Walking past a closed pop-up with the keyboard must not choose (and save) every voice on the
        // way, nor open the customise sheet at the last item.
        QWidget window;
        auto *popUp = new CZVoicePopUpButton(&window);
        popUp->setAllowSystemVoiceChoice(true);
        popUp->buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("tobias.compact"));
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        popUp->setFocus();
        QSignalSpy chosen(popUp, &CZVoicePopUpButton::voiceActivated);
        QSignalSpy activated(popUp, &QComboBox::activated);
        const int before = popUp->currentIndex();
        for (const Qt::Key key : {Qt::Key_Down, Qt::Key_Up, Qt::Key_End, Qt::Key_PageDown, Qt::Key_Home,
                 Qt::Key_PageUp, Qt::Key_M}) {
            QTest::keyClick(popUp, key);
            QTRY_VERIFY2(popUp->view()->isVisible(), qPrintable(QString::number(key, 16)));
            popUp->hidePopup();
            QTRY_VERIFY(!popUp->view()->isVisible());
        }
        QCOMPARE(popUp->currentIndex(), before);
        QVERIFY(chosen.isEmpty());
        QVERIFY(activated.isEmpty());
        QVERIFY(m_presented.isEmpty());
        // In the open menu the keys move, and Return chooses.
        QTest::keyClick(popUp, Qt::Key_Space);
        QTRY_VERIFY(popUp->view()->isVisible());
        QTest::keyClick(popUp->view(), Qt::Key_Up);
        QTest::keyClick(popUp->view(), Qt::Key_Return);
        QTRY_COMPARE(activated.size(), 1);
        QCOMPARE(popUp->currentText(), QStringLiteral("Maren"));
        QCOMPARE(chosen.size(), 1);
    }

    void menuLayout()
    {
        CZVoicePopUpButton popUp;
        QAbstractItemModelTester tester(
            popUp.model(), QAbstractItemModelTester::FailureReportingMode::QtTest);
        QVERIFY(!popUp.isEnabled());
        popUp.buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("tobias.compact"));
        QVERIFY(popUp.isEnabled());
        // Headings by language and country, separators between groups, voices by root name, then the
        // customise item.
        QCOMPARE(titles(popUp),
            QStringList({QStringLiteral("English (United Kingdom)"), QStringLiteral("Amelie"),
                QStringLiteral("---"), QStringLiteral("English (United States)"), QStringLiteral("Maren"),
                QStringLiteral("Tobias"), QStringLiteral("---"), QStringLiteral("German"),
                QStringLiteral("Liesel"), QStringLiteral("---"), QStringLiteral("Customize…")}));
        QCOMPARE(popUp.currentText(), QStringLiteral("Tobias"));
        QCOMPARE(CZVoicePopUpButtonPrivate::get(&popUp)->_previouslyChosenVoiceIdentifier(),
            P + QStringLiteral("tobias.compact"));
        QCOMPARE(popUp.selectedVoiceAttributes()->value(QStringLiteral("VoiceIdentifier")).toString(),
            P + QStringLiteral("tobias.compact"));
        // Headings and separators cannot be chosen.
        QVERIFY(!(popUp.model()->flags(popUp.model()->index(0, 0)) & Qt::ItemIsEnabled));
        QVERIFY(!(popUp.model()->flags(popUp.model()->index(2, 0)) & Qt::ItemIsEnabled));
        // Each voice row knows its place in the shared menu.
        for (const VoiceTableRowPtr &row : VoicePopUpPrivate::currentVoiceRows()) {
            if (!row->isGroupRow()) {
                QCOMPARE(VoicePopUpPrivate::sharedMenu().at(row->tableIndex()).title,
                    row->voiceObject()->displayNameRoot());
            }
        }
        QCOMPARE(CZVoicePopUpButton::displayNameForGender(QStringLiteral("VoiceGenderMale")),
            QStringLiteral("Male"));
        QVERIFY(CZVoicePopUpButton::displayNameForGender(QStringLiteral("VoiceGenderRobot")).isNull());
    }

    void systemVoiceItem()
    {
        CZVoicePopUpButton popUp;
        popUp.setAllowSystemVoiceChoice(true);
        popUp.setSystemVoiceLocalizedText(QStringLiteral("System"), 42);
        popUp.buildPopUpButtonWithSelectVoiceIdentifier(QString());
        QCOMPARE(popUp.itemText(0), QStringLiteral("System"));
        QCOMPARE(popUp.itemData(0, VoiceMenuModel::TagRole).toLongLong(), 42);
        QCOMPARE(popUp.currentIndex(), 0);
        QVERIFY(CZVoicePopUpButtonPrivate::get(&popUp)->_previouslyChosenVoiceIdentifier().isNull());
        QVERIFY(!popUp.selectedVoiceAttributes());
        // A voice's index is its place in the shared menu plus the two leading items.
        popUp.buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("amelie.compact"));
        QCOMPARE(popUp.currentText(), QStringLiteral("Amelie"));
        QCOMPARE(popUp.currentIndex(), 1 + 2);

        // Without the system item, nil selects the default voice.
        CZVoicePopUpButton plain;
        plain.buildPopUpButtonWithSelectVoiceIdentifier(QString());
        QCOMPARE(plain.currentText(), QStringLiteral("Maren"));
        QCOMPARE(CZVoicePopUpButtonPrivate::get(&plain)->_previouslyChosenVoiceIdentifier(),
            P + QStringLiteral("maren.compact"));
    }

    void longIdentifierPrefixResolves()
    {
        CZVoicePopUpButton popUp;
        const QString prefix = P + QStringLiteral("tobias"); // 40 characters
        QVERIFY(prefix.size() >= 36);
        popUp.buildPopUpButtonWithSelectVoiceIdentifier(prefix);
        QCOMPARE(popUp.currentText(), QStringLiteral("Tobias"));
        QCOMPARE(CZVoicePopUpButtonPrivate::get(&popUp)->_previouslyChosenVoiceIdentifier(),
            P + QStringLiteral("tobias.compact"));
    }

    void requiredVoicesStayListed()
    {
        CZVoicePopUpButton::addRequiredVoiceIdentifier(QString());
        QVERIFY(!CZVoicePopUpButton::isRequiredVoiceIdentifier(QString()));
        CZVoicePopUpButton::addRequiredVoiceIdentifier(QStringLiteral("a"));
        CZVoicePopUpButton::addRequiredVoiceIdentifier(QStringLiteral("a"));
        CZVoicePopUpButton::removeRequiredVoiceIdentifier(QStringLiteral("a"));
        QVERIFY(CZVoicePopUpButton::isRequiredVoiceIdentifier(QStringLiteral("a")));
        CZVoicePopUpButton::removeRequiredVoiceIdentifier(QStringLiteral("a"));
        QVERIFY(!CZVoicePopUpButton::isRequiredVoiceIdentifier(QStringLiteral("a")));
        CZVoicePopUpButton::removeRequiredVoiceIdentifier(QStringLiteral("absent"));

        // Liesel is hidden by the user but shown by one pop-up: every pop-up lists her.
        CZVoiceObject::setVisibleVoicesTable({{P + QStringLiteral("liesel.compact"), 0}});
        CZVoicePopUpButton holder;
        CZVoicePopUpButton other;
        holder.buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("liesel.compact"));
        other.buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("maren.compact"));
        QVERIFY(titles(other).contains(QStringLiteral("Liesel")));
        // Choosing another voice releases her at the next rebuild.
        holder.setCurrentIndex(titles(holder).indexOf(QStringLiteral("Tobias")));
        QVERIFY(holder.sendAction());
        QVERIFY(!CZVoicePopUpButton::isRequiredVoiceIdentifier(P + QStringLiteral("liesel.compact")));
        CZVoicePopUpButtonPrivate::_forceAllVoicePopupsToUpdate();
        QVERIFY(!titles(other).contains(QStringLiteral("Liesel")));
        QVERIFY(!titles(holder).contains(QStringLiteral("Liesel")));
    }

    void excludedVoicesLeaveEveryPopUp()
    {
        CZVoicePopUpButton first;
        CZVoicePopUpButton second;
        first.buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("maren.compact"));
        second.buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("tobias.compact"));
        QVERIFY(titles(second).contains(QStringLiteral("Amelie")));
        first.addExcludedIdentifier(P + QStringLiteral("amelie.compact"));
        QVERIFY(CZVoicePopUpButton::shouldExcludeVoiceIdentifier(P + QStringLiteral("amelie.compact")));
        QVERIFY(!titles(first).contains(QStringLiteral("Amelie")));
        QVERIFY(!titles(second).contains(QStringLiteral("Amelie")));
        QCOMPARE(second.currentText(), QStringLiteral("Tobias"));
    }

    void popUpsStayInStep()
    {
        CZVoicePopUpButton first;
        CZVoicePopUpButton second;
        first.buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("maren.compact"));
        second.buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("tobias.compact"));
        addVoice(QStringLiteral("giulia.compact"), QStringLiteral("Giulia Compact"), QStringLiteral("it_IT"),
            QStringLiteral("VoiceGenderFemale"));
        CZVoiceObject::setVisibleVoicesTable({{P + QStringLiteral("giulia.compact"), 1}});
        // The first pop-up asks for a voice its menu lacks: it rebuilds, the other follows.
        first.buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("giulia.compact"));
        QVERIFY(titles(first).contains(QStringLiteral("Giulia")));
        QTRY_COMPARE(titles(second), titles(first));
        QCOMPARE(second.currentText(), QStringLiteral("Tobias"));
    }

    void customizeItemOpensTheSheetOnly()
    {
        QWidget window;
        auto *popUp = new CZVoicePopUpButton(&window);
        popUp->buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("amelie.compact"));
        QSignalSpy sent(popUp, &CZVoicePopUpButton::voiceActivated);
        popUp->setCurrentIndex(popUp->count() - 1);
        QVERIFY(!popUp->sendAction());
        QCOMPARE(m_presented.size(), 1);
        QCOMPARE(m_presented.first().first, &window);
        QCOMPARE(sent.size(), 0);
        QCOMPARE(popUp->currentText(), QStringLiteral("Amelie"));
        // No selection sends nothing.
        popUp->setCurrentIndex(-1);
        QVERIFY(!popUp->sendAction());
        QCOMPARE(sent.size(), 0);
        // A voice is sent, and the pick from the keyboard reaches the same path.
        window.show();
        popUp->setFocus();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        popUp->setCurrentIndex(titles(*popUp).indexOf(QStringLiteral("Maren")));
        QTest::keyClick(popUp, Qt::Key_Down); // opens the menu; choosing is done in it
        QTRY_VERIFY(popUp->view()->isVisible());
        QCOMPARE(sent.size(), 0);
        QTest::keyClick(popUp->view(), Qt::Key_Down);
        QTest::keyClick(popUp->view(), Qt::Key_Return);
        QTRY_COMPARE(popUp->currentText(), QStringLiteral("Tobias"));
        QCOMPARE(sent.size(), 1);
        QCOMPARE(CZVoicePopUpButtonPrivate::get(popUp)->_previouslyChosenVoiceIdentifier(),
            P + QStringLiteral("tobias.compact"));
        QVERIFY(CZVoicePopUpButton::isRequiredVoiceIdentifier(P + QStringLiteral("tobias.compact")));
        QVERIFY(!CZVoicePopUpButton::isRequiredVoiceIdentifier(P + QStringLiteral("amelie.compact")));
    }

    void downloadingVoicesAreListedDisabled()
    {
        m_daemon->setActiveRecords(
            {QVariantMap {{InstallerProtocol::ObjectIDKey, QString(P + QStringLiteral("nora.premium"))},
                {InstallerProtocol::TagNameKey, QStringLiteral("VOICEID:Nora Premium")},
                {InstallerProtocol::ItemDownloadStatusKey, qint64(InstallerProtocol::DownloadingStatus)}}});
        CZVoicePopUpButton popUp;
        popUp.buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("maren.compact"));
        const int row = titles(popUp).indexOf(QStringLiteral("Nora (Downloading)"));
        QVERIFY2(row > 0, qPrintable(titles(popUp).join(u'|')));
        QVERIFY(!(popUp.model()->flags(popUp.model()->index(row, 0)) & Qt::ItemIsEnabled));

        // A premium download whose compact voice is listed is represented by that entry.
        m_daemon->setActiveRecords(
            {QVariantMap {{InstallerProtocol::ObjectIDKey, QString(P + QStringLiteral("maren.premium"))},
                {InstallerProtocol::TagNameKey, QStringLiteral("VOICEID:Maren Premium")},
                {InstallerProtocol::ItemDownloadStatusKey, qint64(InstallerProtocol::WaitingStatus)}}});
        CZVoicePopUpButtonPrivate::_forceAllVoicePopupsToUpdate();
        QCOMPARE(titles(popUp).filter(QStringLiteral("Maren")), QStringList {QStringLiteral("Maren")});
        // Listing every quality shows it, disabled, under its full name.
        popUp.setShowIndividualVoiceQualities(true);
        CZVoicePopUpButtonPrivate::_forceAllVoicePopupsToUpdate();
        QVERIFY(titles(popUp).contains(QStringLiteral("Maren Premium (Waiting)")));
    }

    void languageCheck()
    {
        QWidget window;
        auto *popUp = new CZVoicePopUpButton(&window);
        popUp->buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("maren.compact"));
        QVERIFY(popUp->isSelectedVoiceAppropriateForCurrentLanguageWithUserConfirmation(false, nullptr));
        QVERIFY(Alert::answeredRequests().isEmpty());

        popUp->buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("liesel.compact"));
        QVERIFY(!popUp->isSelectedVoiceAppropriateForCurrentLanguageWithUserConfirmation(false, &window));
        QCOMPARE(Alert::answeredRequests().size(), 1);
        QVERIFY(Alert::answeredRequests().last().asSheet);
        QCOMPARE(Alert::answeredRequests().last().buttons, QStringList {QStringLiteral("OK")});

        m_alertAnswer = 0; // "Use Voice"
        QVERIFY(popUp->isSelectedVoiceAppropriateForCurrentLanguageWithUserConfirmation(true, nullptr));
        QCOMPARE(Alert::answeredRequests().last().buttons,
            QStringList({QStringLiteral("Use Voice"), QStringLiteral("Cancel")}));
        QVERIFY(!Alert::answeredRequests().last().asSheet);
        m_alertAnswer = 1; // "Cancel"
        QVERIFY(!popUp->isSelectedVoiceAppropriateForCurrentLanguageWithUserConfirmation(true, nullptr));
    }

    void statusLine()
    {
        QWidget window;
        auto *popUp = new CZVoicePopUpButton(&window);
        auto *text = new QLabel(&window);
        auto *spinner = new QProgressBar(&window);
        popUp->setDownloadStatusTextField(text);
        popUp->setDownloadStatusProgressIndicator(spinner);
        window.show();
        popUp->buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("maren.compact"));
        QTRY_VERIFY(!CZVoicePopUpButtonPrivate::get(popUp)->_hasDownloadStatusUpdateTimer());

        m_daemon->setActiveRecords(
            {QVariantMap {{InstallerProtocol::ObjectIDKey, QString(P + QStringLiteral("nora.premium"))},
                {InstallerProtocol::TagNameKey, QStringLiteral("VOICEID:Nora Premium")},
                {InstallerProtocol::ItemNameKey, QStringLiteral("Nora")},
                {InstallerProtocol::ItemSoftwareUpdateStateKey, qint64(InstallerProtocol::DownloadingState)},
                {InstallerProtocol::ItemSecondsRemainingKey, 30.0},
                {InstallerProtocol::ItemByteSizeKey, qint64(1000)},
                {InstallerProtocol::ItemDownloadByteCountKey, qint64(100)}}});
        // An installation notification refreshes the line 0.2 s later.
        m_notifications->postNotification(InstallerProtocol::StartedInstallationNotification);
        QTRY_COMPARE(text->text(), QStringLiteral("Downloading Nora — Less than a minute remaining"));
        QVERIFY(spinner->isVisible());
        QVERIFY(CZVoicePopUpButtonPrivate::get(popUp)->_hasDownloadStatusUpdateTimer());

        // Voices waiting behind another kind of item.
        m_daemon->setActiveRecords(
            {QVariantMap {{InstallerProtocol::TagNameKey, QStringLiteral("SRCLANGID:de_DE")}},
                QVariantMap {{InstallerProtocol::TagNameKey, QStringLiteral("VOICEID:Nora Premium")}}});
        QTRY_COMPARE(text->text(), QStringLiteral("Waiting to download…"));

        // Nothing left: no line, no spinner, no timer.
        m_daemon->setActiveRecords({});
        QTRY_VERIFY(text->text().isEmpty());
        QVERIFY(!spinner->isVisible());
        QVERIFY(!CZVoicePopUpButtonPrivate::get(popUp)->_hasDownloadStatusUpdateTimer());
    }

    void anotherProcessMakesMenusRebuild()
    {
        Services::setNotifications(std::make_shared<DBusNotificationCenter>());
        CZVoicePopUpButton popUp;
        popUp.buildPopUpButtonWithSelectVoiceIdentifier(P + QStringLiteral("maren.compact"));
        QVERIFY(!titles(popUp).contains(QStringLiteral("Giulia")));
        addVoice(QStringLiteral("giulia.compact"), QStringLiteral("Giulia Compact"), QStringLiteral("it_IT"),
            QStringLiteral("VoiceGenderFemale"));
        // Show her the way another process would: the file changes, nothing is posted here.
        QVariantMap table = *CZVoiceObject::visibleVoicesTable();
        table.insert(P + QStringLiteral("giulia.compact"), 1);
        Services::preferences().setValue(
            CZVoiceObject::VisibleIdentifiersKey, table, Cadenza::SpeechNames::VoicePreferencesDomain);
        QTest::qWait(100);
        QVERIFY(!titles(popUp).contains(QStringLiteral("Giulia")));
        QProcess poster;
        poster.start(QStringLiteral(CADENZA_CLI_PATH),
            {QStringLiteral("post"), Cadenza::SpeechNames::DefaultVoiceChangedNotification});
        QVERIFY(poster.waitForFinished(10000));
        QCOMPARE(poster.exitCode(), 0);
        QTRY_VERIFY(titles(popUp).contains(QStringLiteral("Giulia")));
        QCOMPARE(popUp.currentText(), QStringLiteral("Maren"));
    }

private:
    void addVoice(const QString &suffix, const QString &name, const QString &locale, const QString &gender)
    {
        m_speech->addVoice(TestEnvironment::voiceAttributes(P + suffix, name, locale, gender));
    }

    std::unique_ptr<TestEnvironment> m_environment;
    std::shared_ptr<FakeSpeechSynthesisService> m_speech;
    std::shared_ptr<FakeMessagePortService> m_ports;
    std::shared_ptr<InProcessNotificationCenter> m_notifications;
    std::unique_ptr<Testing::FakeInstallerDaemon> m_daemon;
    QList<std::pair<QWidget *, bool>> m_presented;
    int m_alertAnswer = 0;
};

QTEST_MAIN(VoicePopUpButtonTest)
#include "tst_voicepopupbutton.moc"
