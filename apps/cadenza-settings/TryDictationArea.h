// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_SETTINGS_TRYDICTATIONAREA_H
#define CADENZA_SETTINGS_TRYDICTATIONAREA_H

#include <QWidget>

#include <functional>

class QLabel;
class QPushButton;

namespace Cadenza {
class Recognizer;
}

/**
 * "Try dictation": a button that records from the microphone until pressed again, and a line that
 * shows the words as they are recognised, or why nothing can be recorded.
 */
class TryDictationArea : public QWidget
{
    Q_OBJECT
public:
    /// @p language gives the locale to dictate in when recording starts (empty: the preferred one).
    explicit TryDictationArea(std::function<QString()> language, QWidget *parent = nullptr);
    ~TryDictationArea() override;

private:
    void toggle();
    void showIdle();

    std::function<QString()> m_language;
    QPushButton *m_button;
    QLabel *m_words;
    Cadenza::Recognizer *m_recognizer;
};

#endif
