// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
// A window with Cadenza's voice pop-up, its download status line and the voice settings dialog.
// Run with --check to build the window, print the chosen voice and exit.
#include <Cadenza/CZVoicePopUpButton>
#include <Cadenza/SpeechSynthesizer>
#include <Cadenza/SpeechSynthesizerVoiceSettings>
#include <core/voices/SpeechSynthesizer.h>
#include <widgets/voice-popup/CZVoicePopUpButton.h>
#include <widgets/voice-settings/SpeechSynthesizerVoiceSettings.h>

#include <QApplication>
#include <QLabel>
#include <QProgressBar>
#include <QPushButton>
#include <QVBoxLayout>

#include <cstdio>

class Host : public QWidget
{
    Q_OBJECT
public:
    Host()
    {
        auto *voices = new Cadenza::CZVoicePopUpButton(this);
        auto *status = new QLabel(this);
        auto *busy = new QProgressBar(this);
        voices->setDownloadStatusTextField(status);
        voices->setDownloadStatusProgressIndicator(busy);
        voices->setAllowSystemVoiceChoice(true);
        voices->buildPopUpButtonWithSelectVoiceIdentifier(QString());
        auto *settings = new QPushButton(QStringLiteral("Voice Settings…"), this);
        connect(settings, &QPushButton::clicked, this,
            [this] { Cadenza::SpeechSynthesizerVoiceSettings::beginSheetForVoiceSettings({}, this, this); });
        auto *layout = new QVBoxLayout(this);
        layout->addWidget(voices);
        layout->addWidget(status);
        layout->addWidget(busy);
        layout->addWidget(settings);
        m_voices = voices;
    }
    Q_INVOKABLE void didEndWithVoiceSettings(const QVariant &settings)
    {
        if (settings.isValid()) {
            m_speaker = Cadenza::SpeechSynthesizer::initWithVoiceSettings(settings.toMap());
        }
    }
    Cadenza::CZVoicePopUpButton *m_voices;
    std::unique_ptr<Cadenza::SpeechSynthesizer> m_speaker;
};

int main(int argc, char *argv[])
{
    QApplication app(argc, argv);
    Host host;
    if (app.arguments().contains(QStringLiteral("--check"))) {
        std::printf("voice menu: %d items, selected: %s\n", host.m_voices->count(),
            qPrintable(host.m_voices->currentText()));
        return host.m_voices->count() >= 2 ? 0 : 1;
    }
    host.show();
    return app.exec();
}

#include "main.moc"
