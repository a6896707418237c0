// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: GPL-3.0-or-later
#ifndef CADENZA_DICTATION_DICTATIONSERVICE_H
#define CADENZA_DICTATION_DICTATIONSERVICE_H

#include <QDBusContext>
#include <QFileSystemWatcher>
#include <QHash>
#include <QObject>
#include <QSet>
#include <QThreadPool>
#include <QTimer>

#include <memory>

namespace Cadenza {

class Transcriber;

/**
 * The dictation engine of the user's session: keeps the models of the recognition languages loaded
 * ("pre-heated") and transcribes sound files for clients over the session bus.
 *
 * A language is loaded when the installer daemon reports it installed, when a new recognizer bundle
 * appears in a recognizer folder, or when a client first asks for it. Loading and decoding run on
 * one worker thread, so the bus stays answered while a model loads and the models are never used by
 * two threads at once.
 */
class DictationService : public QObject, protected QDBusContext
{
    Q_OBJECT
    Q_CLASSINFO("D-Bus Interface", "org.cadenza.Dictation")
public:
    static const QString ServiceName;
    static const QString ObjectPath;
    static const QString PreHeatNotification;
    static const QString WillStartListeningNotification;

    /// @p idleExitSeconds: quit after this long without a request (0: never).
    explicit DictationService(int idleExitSeconds, QObject *parent = nullptr);
    ~DictationService() override;

    /// Claims the bus name and publishes the interface; false with a readable @p error.
    [[nodiscard]] bool publish(QString *error);

public Q_SLOTS:
    /// Loads the model of @p locale now; a bus error names the language when it cannot be loaded.
    Q_SCRIPTABLE void PreHeat(const QString &locale);
    /// The words of the sound file at @p path in @p locale (free dictation).
    Q_SCRIPTABLE QString TranscribeFile(const QString &path, const QString &locale);
    /// The same, recognising only the sentences of the JSGF grammar at @p grammarPath.
    Q_SCRIPTABLE QString TranscribeFileWithGrammar(
        const QString &path, const QString &locale, const QString &grammarPath);

private:
    struct Models;

    void notificationPosted(const QString &name, const QVariantMap &userInfo);
    void scanRecognizerFolders();
    /// Queues loading @p locale; @p reload drops a model loaded before (the bundle was replaced).
    void preHeatInBackground(const QString &locale, bool reload);
    void transcribe(const QString &path, const QString &locale, const QString &grammarPath);
    void post(const QString &name, const QString &locale);
    void touch();

    int m_idleExitSeconds;
    QThreadPool m_worker;
    std::shared_ptr<Models> m_models;
    QFileSystemWatcher m_watcher;
    QTimer m_scanTimer;
    QTimer m_idleTimer;
    QSet<QString> m_seenLanguages;
};

} // namespace Cadenza

#endif
