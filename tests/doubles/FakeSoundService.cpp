// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "FakeSoundService.h"

#include <QTimer>

namespace Cadenza::Platform {

FakeSoundService::FakeSoundService(QObject *parent)
    : SoundService(parent)
{ }

void FakeSoundService::play(const QByteArray &data, const QString &fileName)
{
    Q_UNUSED(data);
    const quint64 generation = ++m_generation;
    m_active = true;
    m_played.append(fileName);
    if (m_outcome == Outcome::NeverAnswers) {
        return;
    }
    // Answers come later, as from a real device.
    QTimer::singleShot(0, this, [this, generation] {
        if (generation != m_generation || !m_active) {
            return;
        }
        if (m_outcome == Outcome::Fails) {
            m_active = false;
            Q_EMIT failed(QStringLiteral("the fake sound service was told to fail"));
        } else {
            Q_EMIT started();
        }
    });
}

void FakeSoundService::stop()
{
    ++m_generation;
    m_active = false;
}

void FakeSoundService::finishPlaying()
{
    if (m_active) {
        ++m_generation;
        m_active = false;
        Q_EMIT finished();
    }
}

} // namespace Cadenza::Platform
