// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "SettingsWindow.h"

#include "TryDictationArea.h"
#include "cadenza_settings_logging.h"

#include "core/SpeechNames.h"
#include "core/locale/LocalizationTable.h"
#include "core/recognition-items/CZSRLanguageItem.h"
#include "core/services/DistributedNotificationCenter.h"
#include "core/services/PreferencesStore.h"
#include "core/services/Services.h"
#include "core/services/SpeechDispatcherModule.h"
#include "core/speech-items/CZSpeechItem.h"
#include "core/voices/CZVoiceObject.h"
#include "core/voices/SpeechSynthesizer.h"
#include "widgets/recognition-languages/CZSRLanguagePopUpButton.h"
#include "widgets/voice-popup/CZVoicePopUpButton.h"
#include "widgets/voice-settings/SpeechSynthesizerVoiceSettings.h"

#include <QComboBox>
#include <QCoreApplication>
#include <QFormLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QProgressBar>
#include <QPushButton>
#include <QVBoxLayout>

using namespace Cadenza;

namespace {
// The application speaks the user's language through the same tables as the library.
QString text(const char *key)
{
    return Platform::LocalizationTable::shared().text(QLatin1String(key));
}

// The entries of the "offer" list, in the order they are added.
enum LocaleList { InstalledRecognizers, NetworkService, OfflineOnly };
} // namespace

SettingsWindow::SettingsWindow(QWidget *parent)
    : QWidget(parent)
    , m_voicePopUp(new CZVoicePopUpButton(this))
    , m_downloadStatus(new QLabel(this))
    , m_downloadIndicator(new QProgressBar(this))
    , m_voiceSettingsSummary(new QLabel(this))
    , m_languagePopUp(new CZSRLanguagePopUpButton(this))
    , m_languageStatus(new QLabel(this))
    , m_languageIndicator(new QProgressBar(this))
    , m_localeLists(new QComboBox(this))
    , m_speechDispatcherButton(new QPushButton(this))
    , m_speechDispatcherStatus(new QLabel(this))
{
    setObjectName(QStringLiteral("settingsWindow"));
    setWindowTitle(text("SettingsSpeech"));
    m_downloadStatus->setObjectName(QStringLiteral("downloadStatusTextField"));
    m_downloadIndicator->setObjectName(QStringLiteral("downloadStatusProgressIndicator"));
    m_downloadIndicator->setMaximumWidth(60);
    m_voiceSettingsSummary->setObjectName(QStringLiteral("voiceSettingsSummary"));
    m_voiceSettingsSummary->setWordWrap(true);
    m_voicePopUp->setDownloadStatusTextField(m_downloadStatus);
    m_voicePopUp->setDownloadStatusProgressIndicator(m_downloadIndicator);
    m_voicePopUp->setAccessibleName(text("SettingsSystemVoiceName"));
    connect(m_voicePopUp, &CZVoicePopUpButton::voiceActivated, this, &SettingsWindow::systemVoiceChosen);

    auto *voiceLabel = new QLabel(text("SettingsSystemVoiceLabel"), this);
    voiceLabel->setBuddy(m_voicePopUp);
    auto *status = new QHBoxLayout;
    status->addWidget(m_downloadIndicator);
    status->addWidget(m_downloadStatus, 1);

    auto *asWindow = new QPushButton(text("SettingsVoiceSettingsButton"), this);
    asWindow->setObjectName(QStringLiteral("voiceSettingsWindowButton"));
    auto *asSheet = new QPushButton(text("SettingsVoiceSettingsSheetButton"), this);
    asSheet->setObjectName(QStringLiteral("voiceSettingsSheetButton"));
    connect(asWindow, &QPushButton::clicked, this, &SettingsWindow::openVoiceSettingsWindow);
    connect(asSheet, &QPushButton::clicked, this, &SettingsWindow::openVoiceSettingsSheet);
    auto *buttons = new QHBoxLayout;
    buttons->addWidget(asWindow);
    buttons->addWidget(asSheet);
    buttons->addStretch(1);

    auto *voiceBox = new QGroupBox(text("SettingsSpeech"), this);
    auto *form = new QFormLayout;
    form->addRow(voiceLabel, m_voicePopUp);
    form->addRow(QString(), status);
    auto *voiceLayout = new QVBoxLayout(voiceBox);
    voiceLayout->addLayout(form);
    voiceLayout->addLayout(buttons);
    voiceLayout->addWidget(m_voiceSettingsSummary);

    // Other apps speak through speech-dispatcher; its per-user module folder offers them these voices.
    m_speechDispatcherButton->setObjectName(QStringLiteral("speechDispatcherModuleButton"));
    m_speechDispatcherStatus->setObjectName(QStringLiteral("speechDispatcherModuleStatus"));
    m_speechDispatcherStatus->setWordWrap(true);
    connect(
        m_speechDispatcherButton, &QPushButton::clicked, this, &SettingsWindow::toggleSpeechDispatcherModule);
    auto *otherApps = new QHBoxLayout;
    otherApps->addWidget(m_speechDispatcherButton);
    otherApps->addWidget(m_speechDispatcherStatus, 1);
    voiceLayout->addLayout(otherApps);
    showSpeechDispatcherModuleState();

    // Dictation: the language pop-up, its status, and which locale lists the recognition service offers.
    m_languagePopUp->setAccessibleName(text("SettingsDictationLanguageName"));
    m_languagePopUp->setLanguagesAreDownloadable(true);
    m_languageStatus->setObjectName(QStringLiteral("languageStatusTextField"));
    m_languageIndicator->setObjectName(QStringLiteral("languageStatusProgressIndicator"));
    m_languageIndicator->setMaximumWidth(60);
    m_languagePopUp->setDownloadStatusTextField(m_languageStatus);
    m_languagePopUp->setDownloadStatusProgressIndicator(m_languageIndicator);
    m_localeLists->setObjectName(QStringLiteral("localeLists"));
    m_localeLists->setAccessibleName(text("SettingsRecognitionServiceName"));
    m_localeLists->addItem(text("SettingsInstalledRecognizers"));
    m_localeLists->addItem(text("SettingsNetworkService"));
    m_localeLists->addItem(text("SettingsOfflineOnly"));
    connect(m_localeLists, &QComboBox::activated, this, &SettingsWindow::rebuildLanguages);
    auto *languageLabel = new QLabel(text("SettingsLanguageLabel"), this);
    languageLabel->setBuddy(m_languagePopUp);
    auto *languageStatus = new QHBoxLayout;
    languageStatus->addWidget(m_languageIndicator);
    languageStatus->addWidget(m_languageStatus, 1);
    auto *dictationBox = new QGroupBox(text("SettingsDictation"), this);
    auto *dictationForm = new QFormLayout(dictationBox);
    dictationForm->addRow(languageLabel, m_languagePopUp);
    dictationForm->addRow(QString(), languageStatus);
    dictationForm->addRow(text("SettingsOfferLabel"), m_localeLists);
    auto *tryArea = new TryDictationArea(
        [this] {
            const auto item = m_languagePopUp->selectedLanguageItem();
            return item ? item->localeIdentifier() : QString();
        },
        this);
    dictationForm->addRow(text("SettingsTryDictation"), tryArea);

    auto *layout = new QVBoxLayout(this);
    layout->addWidget(voiceBox);
    layout->addWidget(dictationBox);
    layout->addStretch(1);

    m_voicePopUp->buildPopUpButtonWithSelectVoiceIdentifier(
        SpeechSynthesizer::defaultVoiceFromMainstreamVoices());
    showVoiceSettings();
    rebuildLanguages();
}

void SettingsWindow::rebuildLanguages()
{
    const QStringList network {QStringLiteral("en_US"), QStringLiteral("en_GB"), QStringLiteral("de_DE"),
        QStringLiteral("fr_FR"), QStringLiteral("es_ES"), QStringLiteral("ja_JP")};
    const QStringList offline {QStringLiteral("en_US"), QStringLiteral("de_DE")};
    const QString chosen = m_languagePopUp->previouslyChosenLocaleIdentifier();
    switch (m_localeLists->currentIndex()) {
    case NetworkService:
        m_languagePopUp->buildPopUpButtonAndSelectLocaleIdentifier(chosen, network, offline);
        break;
    case OfflineOnly:
        m_languagePopUp->buildPopUpButtonAndSelectLocaleIdentifier(chosen, std::nullopt, offline);
        break;
    case InstalledRecognizers:
    default:
        m_languagePopUp->buildPopUpButtonAndSelectLocaleIdentifier(chosen, std::nullopt, std::nullopt);
        break;
    }
    m_languagePopUp->setEnabled(true); // the pop-up leaves enabling to its host
}

void SettingsWindow::systemVoiceChosen()
{
    const auto attributes = m_voicePopUp->selectedVoiceAttributes();
    if (!attributes) {
        return;
    }
    // The voice is stored by its creator and number, as the speech service reads it.
    const QString &domain = SpeechNames::VoicePreferencesDomain;
    Platform::PreferencesStore &preferences = Platform::Services::preferences();
    preferences.setValue(
        SpeechNames::SelectedVoiceCreatorKey, attributes->value(QStringLiteral("VoiceCreator")), domain);
    preferences.setValue(
        SpeechNames::SelectedVoiceIDKey, attributes->value(QStringLiteral("VoiceID")), domain);
    preferences.setValue(
        SpeechNames::SelectedVoiceNameKey, attributes->value(QStringLiteral("VoiceName")), domain);
    if (!preferences.synchronize(domain)) {
        qCWarning(lcSettings, "cadenza-settings: the system voice could not be saved");
        return;
    }
    Platform::Services::notifications().postNotification(SpeechNames::DefaultVoiceChangedNotification);
}

void SettingsWindow::openVoiceSettingsWindow()
{
    SpeechSynthesizerVoiceSettings::beginAlertForVoiceSettings(
        m_voiceSettings, this, text("SettingsReadingVoiceTitle"));
}

void SettingsWindow::openVoiceSettingsSheet()
{
    SpeechSynthesizerVoiceSettings::beginSheetForVoiceSettings(m_voiceSettings, this, this);
}

void SettingsWindow::didEndWithVoiceSettings(const QVariant &settings)
{
    if (settings.isValid()) {
        m_voiceSettings = settings.toMap();
        showVoiceSettings();
    }
}

void SettingsWindow::showVoiceSettings()
{
    QStringList parts;
    // The user reads names, never identifiers; a voice that is gone keeps its identifier as its name.
    const QString voice = m_voiceSettings.value(kVoiceSettingsVoiceIdentifierKey).toString();
    QString voiceName = text("SettingsSystemVoiceText");
    if (!voice.isEmpty()) {
        const CZVoiceObjectPtr object = CZVoiceObject::initWithVoiceIdentifier(voice);
        voiceName = object && !object->displayName().isEmpty() ? object->displayName() : voice;
    }
    parts.append(text("SettingsReadingVoiceFormat").arg(voiceName));
    if (m_voiceSettings.contains(kVoiceSettingsCustomRelativeRateKey)) {
        parts.append(text("SettingsRateFormat")
                         .arg(CZSpeechItem::displayStringForPercent(qRound64(
                             m_voiceSettings.value(kVoiceSettingsCustomRelativeRateKey).toDouble() * 100))));
    }
    if (m_voiceSettings.contains(kVoiceSettingsCustomVolumeKey)) {
        parts.append(text("SettingsVolumeFormat")
                         .arg(CZSpeechItem::displayStringForPercent(qRound64(
                             m_voiceSettings.value(kVoiceSettingsCustomVolumeKey).toDouble() * 100))));
    }
    m_voiceSettingsSummary->setText(parts.join(QStringLiteral(", ")));
}

void SettingsWindow::showSpeechDispatcherModuleState()
{
    const bool installed = Platform::SpeechDispatcherModule::isInstalledForUser();
    m_speechDispatcherButton->setText(
        text(installed ? "SettingsSpeechDispatcherRemove" : "SettingsSpeechDispatcherInstall"));
    m_speechDispatcherButton->setEnabled(installed
        || !Platform::SpeechDispatcherModule::shippedModule(QCoreApplication::applicationDirPath())
                .isEmpty());
    m_speechDispatcherStatus->setText(installed ? text("SettingsSpeechDispatcherInstalled") : QString());
}

void SettingsWindow::toggleSpeechDispatcherModule()
{
    QString error;
    const bool done = Platform::SpeechDispatcherModule::isInstalledForUser()
        ? Platform::SpeechDispatcherModule::removeForUser(&error)
        : Platform::SpeechDispatcherModule::installForUser(
            Platform::SpeechDispatcherModule::shippedModule(QCoreApplication::applicationDirPath()), &error);
    showSpeechDispatcherModuleState();
    if (!done) {
        m_speechDispatcherStatus->setText(error);
    }
}
