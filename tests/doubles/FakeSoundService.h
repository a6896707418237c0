// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_TESTS_FAKESOUNDSERVICE_H
#define CADENZA_TESTS_FAKESOUNDSERVICE_H

#include "core/services/SoundService.h"

#include <QList>

namespace Cadenza::Platform {

/// Sounds that a test plays: they start, fail or never answer, as the test says, one event-loop turn later.
class FakeSoundService final : public SoundService
{
    Q_OBJECT
public:
    enum class Outcome { Plays, Fails, NeverAnswers };

    explicit FakeSoundService(QObject *parent = nullptr);

    void play(const QByteArray &data, const QString &fileName) override;
    void stop() override;
    [[nodiscard]] bool isActive() const override { return m_active; }

    void setOutcome(Outcome outcome) { m_outcome = outcome; }
    /// The playing sound reaches its end.
    void finishPlaying();
    /// The file names of the sounds asked for, in order.
    [[nodiscard]] QStringList played() const { return m_played; }

private:
    Outcome m_outcome = Outcome::Plays;
    bool m_active = false;
    quint64 m_generation = 0;
    QStringList m_played;
};

} // namespace Cadenza::Platform

#endif
