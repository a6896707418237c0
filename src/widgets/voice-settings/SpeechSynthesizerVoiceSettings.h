// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICESETTINGS_SPEECHSYNTHESIZERVOICESETTINGS_H
#define CADENZA_VOICESETTINGS_SPEECHSYNTHESIZERVOICESETTINGS_H

#include "cadenza_export.h"

#include <QString>
#include <QVariantMap>

class QObject;
class QWidget;

namespace Cadenza {

/**
 * The entry points of the voice settings dialog for client programs.
 *
 * @code
 * class Owner : public QObject {
 *     Q_OBJECT
 * public:
 *     Q_INVOKABLE void didEndWithVoiceSettings(const QVariant &settings)
 *     {
 *         if (settings.isValid())
 *             m_synthesizer = Cadenza::SpeechSynthesizer::initWithVoiceSettings(settings.toMap());
 *     }
 * };
 * Cadenza::SpeechSynthesizerVoiceSettings::beginSheetForVoiceSettings(current, owner, mainWindow);
 * @endcode
 */
class CADENZA_EXPORT SpeechSynthesizerVoiceSettings
{
public:
    /// Opens the dialog as a window (titled @p windowTitle when given).
    static void beginAlertForVoiceSettings(
        const QVariantMap &voiceSettings, QObject *modalDelegate, const QString &windowTitle = QString());
    /// Opens the dialog as a sheet on @p modalForWindow.
    static void beginSheetForVoiceSettings(
        const QVariantMap &voiceSettings, QObject *modalDelegate, QWidget *modalForWindow);
    /// Closes the window as if the user pressed OK (@p savingChanges) or Cancel.
    static void endAlertSavingChanges(bool savingChanges);
    /// Ends the sheet as if the user pressed OK (@p savingChanges) or Cancel.
    static void endSheetSavingChanges(bool savingChanges);
};

} // namespace Cadenza

#endif
