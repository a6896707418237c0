// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "TestEnvironment.h"

#include "FakeSpeechSynthesisService.h"
#include "FakeUserLocaleService.h"
#include "MemoryPreferencesStore.h"
#include "core/formats/WaveFile.h"
#include "core/services/BundleSpeechSynthesisService.h"
#include "core/services/Services.h"
#include "core/voices/SpeechSynthesizer.h"

#include <QSignalSpy>
#include <QTest>

#include <algorithm>
#include <cmath>

using namespace Cadenza;
using namespace Cadenza::Platform;
using Cadenza::Testing::TestEnvironment;

namespace {
const QString Maren = QStringLiteral("com.vendra.speech.synthesis.voice.maren.compact");
const QString Sentence = QStringLiteral("The quick brown fox jumps over the lazy dog near the river bank.");

double rms(const PcmAudio &audio)
{
    double sum = 0;
    for (const qint16 sample : audio.samples) {
        sum += double(sample) * sample;
    }
    return audio.samples.empty() ? 0.0 : std::sqrt(sum / double(audio.samples.size()));
}

/// The median fundamental frequency of the loud frames, by autocorrelation over 60..400 Hz.
double medianPitchHz(const PcmAudio &audio)
{
    const int rate = audio.sampleRate;
    const int frame = rate * 40 / 1000;
    const double loud = rms(audio);
    QList<double> pitches;
    for (size_t start = 0; start + size_t(frame) * 2 < audio.samples.size(); start += size_t(frame)) {
        const qint16 *x = audio.samples.data() + start;
        double energy = 0;
        for (int i = 0; i < frame; ++i) {
            energy += double(x[i]) * x[i];
        }
        if (std::sqrt(energy / frame) < loud) {
            continue; // quiet or unvoiced
        }
        int bestLag = 0;
        double best = 0;
        for (int lag = rate / 400; lag <= rate / 60; ++lag) {
            double sum = 0;
            for (int i = 0; i < frame; ++i) {
                sum += double(x[i]) * x[i + lag];
            }
            const double normalised = sum / energy;
            if (normalised > best) {
                best = normalised;
                bestLag = lag;
            }
        }
        if (bestLag > 0 && best > 0.5) {
            pitches.append(double(rate) / bestLag);
        }
    }
    if (pitches.isEmpty()) {
        return 0;
    }
    std::sort(pitches.begin(), pitches.end());
    return pitches.at(pitches.size() / 2);
}
} // namespace

class SynthesizerExtensionsTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init()
    {
        m_environment = std::make_unique<TestEnvironment>();
        m_service = std::make_shared<FakeSpeechSynthesisService>();
        Services::setSpeechSynthesis(m_service);
        Services::setPreferences(std::make_shared<MemoryPreferencesStore>());
        Services::setUserLocale(std::make_shared<FakeUserLocaleService>());
        QVariantMap attributes
            = TestEnvironment::voiceAttributes(Maren, QStringLiteral("Maren"), QStringLiteral("en_US"));
        attributes.insert(QStringLiteral("VoiceDemoText"), QStringLiteral("Hello from Maren."));
        m_service->addVoice(attributes);
    }
    void cleanup()
    {
        Services::setSpeechSynthesis(nullptr);
        m_environment.reset();
    }

    void fixedPointPitch()
    {
        auto synthesizer = SpeechSynthesizer::initWithVoice(Maren);
        QVERIFY(synthesizer);
        synthesizer->setSpeechPitch(1.5f);
        QCOMPARE(
            synthesizer
                ->objectForProperty(SpeechSynthesizer::PitchBaseProperty, 4, QMetaType::fromType<qint64>())
                .toLongLong(),
            98304);
        QCOMPARE(synthesizer->speechPitch(), 1.5f);

        // Toward zero, never rounded.
        synthesizer->setSpeechPitch(-0.00001f);
        QCOMPARE(
            synthesizer
                ->objectForProperty(SpeechSynthesizer::PitchBaseProperty, 4, QMetaType::fromType<qint64>())
                .toLongLong(),
            0);
        synthesizer->setSpeechPitch(-1.00001f);
        QCOMPARE(
            synthesizer
                ->objectForProperty(SpeechSynthesizer::PitchBaseProperty, 4, QMetaType::fromType<qint64>())
                .toLongLong(),
            -65536);
        // One unit in the last place can be lost on the way in.
        synthesizer->setSpeechPitch(1.0f / 3.0f);
        QCOMPARE(
            synthesizer
                ->objectForProperty(SpeechSynthesizer::PitchBaseProperty, 4, QMetaType::fromType<qint64>())
                .toLongLong(),
            21845);
        QCOMPARE(synthesizer->speechPitch(), float(21845.0 / 65536.0));
    }

    void propertyAccessChecksCodeSizeAndType()
    {
        auto synthesizer = SpeechSynthesizer::initWithVoice(Maren);
        const QMetaType number = QMetaType::fromType<qint64>();
        // Default volume is full, default pitch is the voice's own.
        QCOMPARE(
            synthesizer->objectForProperty(SpeechSynthesizer::VolumeProperty, 4, number).toLongLong(), 65536);
        QCOMPARE(synthesizer->speechPitch(), 50.0f);
        // Wrong size, unknown code, or a non-number requested: nothing.
        QVERIFY(!synthesizer->objectForProperty(SpeechSynthesizer::VolumeProperty, 8, number).isValid());
        QVERIFY(!synthesizer->objectForProperty(0x61626364, 4, number).isValid());
        QVERIFY(!synthesizer
                     ->objectForProperty(SpeechSynthesizer::VolumeProperty, 4, QMetaType::fromType<QString>())
                     .isValid());
        // The channel handle is read-only, 8 bytes, and differs between speakers.
        auto other = SpeechSynthesizer::initWithVoice(Maren);
        QVERIFY(synthesizer->_speechChannel() > 0);
        QVERIFY(synthesizer->_speechChannel() != other->_speechChannel());
        QVERIFY(!synthesizer->_setObjectForProperty(7, SpeechSynthesizer::SpeechChannelProperty, 8));
        QVERIFY(!synthesizer->_setObjectForProperty(
            QStringLiteral("loud"), SpeechSynthesizer::VolumeProperty, 4));
        QCOMPARE(
            synthesizer->objectForProperty(SpeechSynthesizer::VolumeProperty, 4, number).toLongLong(), 65536);
        // A reading that yields nothing gives a pitch of 0: pretend by writing a huge value that is held
        // at the 32-bit end instead of wrapping.
        QVERIFY(synthesizer->_setObjectForProperty(qint64(1) << 40, SpeechSynthesizer::PitchBaseProperty, 4));
        QCOMPARE(synthesizer->objectForProperty(SpeechSynthesizer::PitchBaseProperty, 4, number).toLongLong(),
            qint64(std::numeric_limits<qint32>::max()));
    }

    void rateIsPassedThrough()
    {
        auto synthesizer = SpeechSynthesizer::initWithVoice(Maren);
        QCOMPARE(synthesizer->_normalSpeakingRate(), 175.0f);
        QCOMPARE(synthesizer->speechRate(), 175.0f);
        synthesizer->setSpeechRate(233.5f);
        QCOMPARE(synthesizer->speechRate(), 233.5f);
        QVERIFY(synthesizer->startSpeakingString(QStringLiteral("Hi")));
        QCOMPARE(m_service->requests().constLast().wordsPerMinute, 233.5);
    }

    void voiceSettingsConfigureTheSpeaker()
    {
        auto plain = SpeechSynthesizer::initWithVoiceSettings({});
        QVERIFY(plain);
        QCOMPARE(plain->voice(), Maren); // the default voice
        auto configured = SpeechSynthesizer::initWithVoiceSettings({{kVoiceSettingsVoiceIdentifierKey, Maren},
            {kVoiceSettingsCustomRelativeRateKey, 0.5f}, {kVoiceSettingsCustomVolumeKey, 0.25f}});
        QVERIFY(configured);
        QCOMPARE(configured->speechRate(), 87.5f);
        QCOMPARE(
            configured->objectForProperty(SpeechSynthesizer::VolumeProperty, 4, QMetaType::fromType<qint64>())
                .toLongLong(),
            16384);
        QVERIFY(!SpeechSynthesizer::initWithVoiceSettings({{kVoiceSettingsVoiceIdentifierKey,
            QStringLiteral("com.vendra.speech.synthesis.voice.nobody")}}));
    }

    void speakingReportsItsEnd()
    {
        auto synthesizer = SpeechSynthesizer::initWithVoice(Maren);
        QSignalSpy finished(synthesizer.get(), &SpeechSynthesizer::didFinishSpeaking);
        m_service->setHoldsSpeaking(true);
        QVERIFY(synthesizer->startSpeakingString(QStringLiteral("Hello")));
        QVERIFY(synthesizer->isSpeaking());
        // A volume change reaches the speech in progress.
        synthesizer->setObject(qint64(0.5 * 65536), SpeechSynthesizer::VolumeProperty, 4);
        QCOMPARE(m_service->speakingVolume(), 0.5);
        synthesizer->stopSpeaking();
        QVERIFY(!synthesizer->isSpeaking());
        QCOMPARE(finished.size(), 1);
        QCOMPARE(finished.first().first().toBool(), false);

        QVERIFY(synthesizer->startSpeakingString(QStringLiteral("Hello")));
        m_service->finishHeldRequests(true);
        QCOMPARE(finished.size(), 2);
        QCOMPARE(finished.last().first().toBool(), true);
        QVERIFY(!synthesizer->isSpeaking());
    }

    void realEngineHearsPitchAndVolume()
    {
        m_environment->installSampleVoices();
        Services::setSpeechSynthesis(std::make_shared<BundleSpeechSynthesisService>());
        auto synthesizer = SpeechSynthesizer::initWithVoice(Maren);
        QVERIFY(synthesizer);
        auto render = [&](const QString &name) {
            QString error;
            const QString path = m_environment->path(name);
            if (!synthesizer->startSpeakingStringToFile(Sentence, path, &error)) {
                qWarning("render failed: %s", qPrintable(error));
                return PcmAudio {};
            }
            return WaveFile::read(path, &error).value_or(PcmAudio {});
        };

        const PcmAudio normal = render(QStringLiteral("normal.wav"));
        QVERIFY(!normal.samples.empty());
        synthesizer->setObject(qint64(0.25 * 65536), SpeechSynthesizer::VolumeProperty, 4);
        const PcmAudio quiet = render(QStringLiteral("quiet.wav"));
        QVERIFY(rms(quiet) < rms(normal) * 0.5);
        QVERIFY(rms(quiet) > 0);

        synthesizer->setObject(65536, SpeechSynthesizer::VolumeProperty, 4);
        synthesizer->setSpeechPitch(15.0f);
        const double low = medianPitchHz(render(QStringLiteral("low.wav")));
        synthesizer->setSpeechPitch(90.0f);
        const double high = medianPitchHz(render(QStringLiteral("high.wav")));
        qInfo("median pitch: low %.1f Hz, high %.1f Hz", low, high);
        QVERIFY(low > 0);
        QVERIFY(high > low * 1.2);
    }

private:
    std::unique_ptr<TestEnvironment> m_environment;
    std::shared_ptr<FakeSpeechSynthesisService> m_service;
};

QTEST_GUILESS_MAIN(SynthesizerExtensionsTest)
#include "tst_synthesizerextensions.moc"
