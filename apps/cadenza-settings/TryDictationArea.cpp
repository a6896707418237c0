// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "TryDictationArea.h"

#include "core/dictation/Recognizer.h"
#include "core/locale/LocalizationTable.h"

#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>

using namespace Cadenza;

namespace {
QString text(const char *key)
{
    return Platform::LocalizationTable::shared().text(QLatin1String(key));
}
} // namespace

TryDictationArea::TryDictationArea(std::function<QString()> language, QWidget *parent)
    : QWidget(parent)
    , m_language(std::move(language))
    , m_button(new QPushButton(this))
    , m_words(new QLabel(this))
    , m_recognizer(new Recognizer(this))
{
    m_button->setObjectName(QStringLiteral("tryDictationButton"));
    m_words->setObjectName(QStringLiteral("tryDictationText"));
    m_words->setWordWrap(true);
    m_words->setTextInteractionFlags(Qt::TextSelectableByMouse);
    auto *layout = new QHBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(m_button);
    layout->addWidget(m_words, 1);
    connect(m_button, &QPushButton::clicked, this, &TryDictationArea::toggle);
    connect(m_recognizer, &Recognizer::listening, this,
        [this] { m_words->setText(text("SettingsTryDictationListening")); });
    connect(m_recognizer, &Recognizer::partialResult, m_words, &QLabel::setText);
    connect(m_recognizer, &Recognizer::finalResult, this, [this](const QString &words) {
        showIdle();
        m_words->setText(words.isEmpty() ? text("SettingsTryDictationNothing") : words);
    });
    connect(m_recognizer, &Recognizer::failed, this, [this](const QString &reason) {
        showIdle();
        m_words->setText(reason);
    });
    showIdle();
    m_words->setText(text("SettingsTryDictationHint"));
}

TryDictationArea::~TryDictationArea()
{
    m_recognizer->cancel();
}

void TryDictationArea::showIdle()
{
    m_button->setText(text("SettingsTryDictationRecord"));
}

void TryDictationArea::toggle()
{
    if (m_recognizer->isRunning()) {
        m_recognizer->stop();
        return;
    }
    m_recognizer->setLanguage(m_language ? m_language() : QString());
    m_button->setText(text("SettingsTryDictationStop"));
    // The model loads and the microphone opens on the recognizer's thread; listening() says when.
    m_words->setText(text("SettingsTryDictationPreparing"));
    m_recognizer->startFromMicrophone();
}
