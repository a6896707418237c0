// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "Microphone.h"

#include "core/locale/LocalizationTable.h"

#include <QAudioDevice>
#include <QAudioFormat>
#include <QAudioSource>
#include <QMediaDevices>

#include <cstring>

namespace Cadenza::Platform {

Microphone::Microphone(QObject *parent)
    : QObject(parent)
{ }

Microphone::~Microphone()
{
    stop();
}

bool Microphone::start(int sampleRate, QString *error)
{
    stop();
    const QAudioDevice device = QMediaDevices::defaultAudioInput();
    if (device.isNull()) {
        *error = LocalizationTable::shared().text(QStringLiteral("MicrophoneMissing"));
        return false;
    }
    QAudioFormat format;
    format.setSampleRate(sampleRate);
    format.setChannelCount(1);
    format.setSampleFormat(QAudioFormat::Int16);
    if (!device.isFormatSupported(format)) {
        *error = LocalizationTable::shared().format(QStringLiteral("MicrophoneFormatUnsupported"),
            {device.description(), QString::number(sampleRate)});
        return false;
    }
    m_source = new QAudioSource(device, format, this);
    m_device = m_source->start();
    if (!m_device) {
        *error = LocalizationTable::shared().format(
            QStringLiteral("MicrophoneCannotOpen"), {device.description()});
        stop();
        return false;
    }
    connect(m_device, &QIODevice::readyRead, this, &Microphone::deliver);
    return true;
}

void Microphone::deliver()
{
    m_pending.append(m_device->readAll());
    const qsizetype count = m_pending.size() / qsizetype(sizeof(qint16));
    if (count == 0) {
        return;
    }
    QVector<qint16> samples(count);
    std::memcpy(samples.data(), m_pending.constData(), size_t(count) * sizeof(qint16));
    m_pending.remove(0, count * qsizetype(sizeof(qint16)));
    Q_EMIT samplesAvailable(samples);
}

void Microphone::finish()
{
    if (m_device) {
        deliver();
    }
    stop();
}

void Microphone::stop()
{
    if (m_source) {
        m_source->stop();
        delete m_source;
        m_source = nullptr;
        m_device = nullptr;
    }
    m_pending.clear();
}

} // namespace Cadenza::Platform
