// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "ModuleSession.h"

#include "AudioSender.h"
#include "SsmlText.h"
#include "VoiceLister.h"

#include <QSocketNotifier>

#include <cerrno>
#include <unistd.h>

namespace SdCadenza {

using Kind = ModuleProtocol::Kind;
using Stage = ModuleProtocol::Stage;

ModuleSession::ModuleSession(int inputFd, AudioSender &sender, QObject *parent)
    : QObject(parent)
    , m_inputFd(inputFd)
    , m_sender(sender)
    , m_worker(sender)
{
    if (m_inputFd >= 0) {
        m_notifier = new QSocketNotifier(m_inputFd, QSocketNotifier::Read, this);
        connect(m_notifier, &QSocketNotifier::activated, this, &ModuleSession::readInput);
    }
}

ModuleSession::~ModuleSession() = default;

void ModuleSession::readInput()
{
    char buffer[65536];
    const ssize_t got = ::read(m_inputFd, buffer, sizeof buffer);
    if (got < 0 && (errno == EINTR || errno == EAGAIN)) {
        return;
    }
    if (got <= 0) {
        // speech-dispatcher went away: nobody is left to speak for.
        m_worker.stop();
        finish();
        return;
    }
    receive(QByteArray(buffer, qsizetype(got)));
}

void ModuleSession::receive(const QByteArray &bytes)
{
    m_protocol.feed(bytes);
    while (!m_finished && m_protocol.hasRequest()) {
        handle(m_protocol.takeRequest());
    }
}

void ModuleSession::finish()
{
    if (m_finished) {
        return;
    }
    m_finished = true;
    if (m_notifier) {
        m_notifier->setEnabled(false);
    }
    Q_EMIT finished();
}

bool ModuleSession::applySetting(SpeechSettings &settings, const QByteArray &line)
{
    const qsizetype equals = line.indexOf('=');
    if (equals <= 0) {
        return false;
    }
    const QByteArray name = line.left(equals).trimmed().toLower();
    const QString value = SsmlText::decode(line.mid(equals + 1)).trimmed();
    const bool isNull = value.isEmpty() || value == u"NULL";
    auto number = [&](int &target) {
        if (isNull) {
            return true; // "use your default" for a value the server has not set
        }
        bool ok = false;
        const int parsed = value.toInt(&ok);
        if (!ok) {
            return false;
        }
        target = qBound(-100, parsed, 100);
        return true;
    };
    if (name == "rate") {
        return number(settings.rate);
    }
    if (name == "pitch") {
        return number(settings.pitch);
    }
    if (name == "volume") {
        return number(settings.volume);
    }
    if (name == "language") {
        settings.language = isNull ? QString() : value;
        return true;
    }
    if (name == "voice") {
        settings.voiceType = isNull ? QString() : value.toLower();
        return true;
    }
    if (name == "synthesis_voice") {
        settings.synthesisVoice = isNull ? QString() : value;
        return true;
    }
    if (name == "punctuation_mode") {
        settings.punctuation = isNull ? QStringLiteral("none") : value.toLower();
        return true;
    }
    if (name == "spelling_mode") {
        settings.spelling = value.compare(u"on", Qt::CaseInsensitive) == 0;
        return true;
    }
    if (name == "cap_let_recogn") {
        settings.capitalLetters = isNull ? QStringLiteral("none") : value.toLower();
        return true;
    }
    // pitch_range, punctuation_some, punctuation_most and whatever later versions add: known to the
    // server, of no use to these engines.
    return !name.isEmpty();
}

void ModuleSession::handle(const ModuleProtocol::Request &request)
{
    const bool starting = request.stage == Stage::DataFollows;
    switch (request.kind) {
    case Kind::Init:
        m_sender.send("299-Cadenza: " + QByteArray::number(VoiceLister::voices().size())
            + " voices installed\n299 OK LOADED SUCCESSFULLY\n");
        return;
    case Kind::Audio:
        // Audio always goes to the server; the settings name the server's own output.
        m_sender.send(starting ? "207 OK RECEIVING AUDIO SETTINGS\n" : "203 OK AUDIO INITIALIZED\n");
        return;
    case Kind::LogLevel:
        m_sender.send(starting ? "207 OK RECEIVING LOGLEVEL SETTINGS\n" : "203 OK LOGLEVEL SET\n");
        return;
    case Kind::Set: {
        if (starting) {
            m_sender.send("203 OK RECEIVING SETTINGS\n");
            return;
        }
        bool ok = !request.overflow;
        for (const QByteArray &line : request.data) {
            ok = applySetting(m_settings, line) && ok;
        }
        m_sender.send(ok ? "203 OK SETTINGS RECEIVED\n" : "302 ERROR BAD SYNTAX\n");
        return;
    }
    case Kind::ListVoices:
        m_sender.send(VoiceLister::listing());
        return;
    case Kind::Speak:
    case Kind::Char:
    case Kind::Key:
    case Kind::SoundIcon:
        if (starting) {
            m_sender.send("202 OK RECEIVING MESSAGE\n");
        } else {
            speak(request);
        }
        return;
    case Kind::Stop:
        m_worker.stop(); // asynchronous: no answer, the worker ends the message with STOP
        return;
    case Kind::Pause:
        m_worker.pause();
        return;
    case Kind::Quit:
        m_worker.stop();
        m_sender.send("210 OK QUIT\n");
        finish();
        return;
    case Kind::Debug:
        m_sender.send(
            request.argument.toUpper().startsWith("ON") ? "200 OK DEBUGGING ON\n" : "200 OK DEBUGGING OFF\n");
        return;
    case Kind::Unknown:
        m_sender.send("300 ERR UNKNOWN COMMAND\n");
        return;
    }
}

void ModuleSession::speak(const ModuleProtocol::Request &request)
{
    if (request.overflow) {
        m_sender.send("301 ERROR CANT SPEAK\n");
        return;
    }
    const bool oneLine = request.kind != Kind::Speak;
    if (oneLine && request.data.size() != 1) {
        m_sender.send("305 DATA MORE THAN ONE LINE\n");
        return;
    }
    if (m_worker.isBusy()) {
        m_sender.send("301 ERROR CANT SPEAK\n");
        return;
    }

    SpeechJob job;
    job.rate = m_settings.rate;
    job.pitch = m_settings.pitch;
    job.volume = m_settings.volume;
    const QString text = SsmlText::decode(request.data.join('\n'));
    switch (request.kind) {
    case Kind::SoundIcon:
        job.icon = VoiceLister::field(text);
        break;
    case Kind::Char: {
        QString character = VoiceLister::field(text);
        job.raisePitch
            = m_settings.capitalLetters != u"none" && !character.isEmpty() && character.at(0).isUpper();
        if (character == u"space" || character.isEmpty()) {
            character = QStringLiteral("space");
        }
        job.segments.append({SsmlText::Segment::Kind::Text, character, 0});
        break;
    }
    case Kind::Key: {
        // Key names such as "shift_a" or "kp-enter": say their parts.
        QString key = VoiceLister::field(text);
        if (key.size() > 1) {
            key.replace(QLatin1Char('_'), QLatin1Char(' ')).replace(QLatin1Char('-'), QLatin1Char(' '));
        }
        job.segments.append({SsmlText::Segment::Kind::Text, key, 0});
        break;
    }
    default:
        job.segments = SsmlText::parse(text);
        if (m_settings.spelling) {
            for (auto &segment : job.segments) {
                if (segment.kind == SsmlText::Segment::Kind::Text) {
                    segment.text = SsmlText::spelled(segment.text);
                }
            }
        }
        break;
    }
    job.voiceIdentifier
        = VoiceLister::choose(m_settings.synthesisVoice, m_settings.language, m_settings.voiceType);
    m_sender.send("200 OK SPEAKING\n");
    // The worker may already have been stopped by a STOP sent before this message; start() resets it.
    if (!m_worker.start(std::move(job))) {
        m_sender.send("701 BEGIN\n703 STOP\n");
    }
}

} // namespace SdCadenza
