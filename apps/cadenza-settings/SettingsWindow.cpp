#include "SettingsWindow.h"

#include "voice-popup/CZVoicePopUpButton.h"
#include "voice-settings/SpeechSynthesizerVoiceSettings.h"
#include "voices/SpeechSynthesizer.h"

#include <QFormLayout>
#include <QHBoxLayout>
#include <QLabel>
#include <QProgressBar>
#include <QPushButton>
#include <QVBoxLayout>

using namespace Cadenza;

SettingsWindow::SettingsWindow(QWidget *parent)
    : QWidget(parent)
    , m_voicePopUp(new CZVoicePopUpButton(this))
    , m_downloadStatus(new QLabel(this))
    , m_downloadIndicator(new QProgressBar(this))
    , m_voiceSettingsSummary(new QLabel(this))
{
    setObjectName(QStringLiteral("settingsWindow"));
    setWindowTitle(tr("Speech"));
    m_downloadStatus->setObjectName(QStringLiteral("downloadStatusTextField"));
    m_downloadIndicator->setObjectName(QStringLiteral("downloadStatusProgressIndicator"));
    m_downloadIndicator->setMaximumWidth(60);
    m_voiceSettingsSummary->setObjectName(QStringLiteral("voiceSettingsSummary"));
    m_voiceSettingsSummary->setWordWrap(true);
    m_voicePopUp->setDownloadStatusTextField(m_downloadStatus);
    m_voicePopUp->setDownloadStatusProgressIndicator(m_downloadIndicator);
    m_voicePopUp->setAccessibleName(tr("System voice"));

    auto *voiceLabel = new QLabel(tr("System &voice:"), this);
    voiceLabel->setBuddy(m_voicePopUp);
    auto *status = new QHBoxLayout;
    status->addWidget(m_downloadIndicator);
    status->addWidget(m_downloadStatus, 1);

    auto *asWindow = new QPushButton(tr("Voice Settings…"), this);
    asWindow->setObjectName(QStringLiteral("voiceSettingsWindowButton"));
    auto *asSheet = new QPushButton(tr("Voice Settings as Sheet…"), this);
    asSheet->setObjectName(QStringLiteral("voiceSettingsSheetButton"));
    connect(asWindow, &QPushButton::clicked, this, &SettingsWindow::openVoiceSettingsWindow);
    connect(asSheet, &QPushButton::clicked, this, &SettingsWindow::openVoiceSettingsSheet);
    auto *buttons = new QHBoxLayout;
    buttons->addWidget(asWindow);
    buttons->addWidget(asSheet);
    buttons->addStretch(1);

    auto *form = new QFormLayout;
    form->addRow(voiceLabel, m_voicePopUp);
    form->addRow(QString(), status);
    auto *layout = new QVBoxLayout(this);
    layout->addLayout(form);
    layout->addSpacing(12);
    layout->addLayout(buttons);
    layout->addWidget(m_voiceSettingsSummary);
    layout->addStretch(1);

    m_voicePopUp->buildPopUpButtonWithSelectVoiceIdentifier(
        SpeechSynthesizer::defaultVoiceFromMainstreamVoices());
    showVoiceSettings();
}

void SettingsWindow::openVoiceSettingsWindow()
{
    SpeechSynthesizerVoiceSettings::beginAlertForVoiceSettings(m_voiceSettings, this, tr("Reading Voice"));
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
    const QString voice = m_voiceSettings.value(kVoiceSettingsVoiceIdentifierKey).toString();
    parts.append(tr("Reading voice: %1").arg(voice.isEmpty() ? tr("system voice") : voice));
    if (m_voiceSettings.contains(kVoiceSettingsCustomRelativeRateKey)) {
        parts.append(
            tr("rate %1 %")
                .arg(qRound(m_voiceSettings.value(kVoiceSettingsCustomRelativeRateKey).toDouble() * 100)));
    }
    if (m_voiceSettings.contains(kVoiceSettingsCustomVolumeKey)) {
        parts.append(tr("volume %1 %")
                         .arg(qRound(m_voiceSettings.value(kVoiceSettingsCustomVolumeKey).toDouble() * 100)));
    }
    m_voiceSettingsSummary->setText(parts.join(QStringLiteral(", ")));
}
