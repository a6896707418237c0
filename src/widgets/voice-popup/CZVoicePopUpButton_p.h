// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICEPOPUP_CZVOICEPOPUPBUTTON_P_H
#define CADENZA_VOICEPOPUP_CZVOICEPOPUPBUTTON_P_H

#include "cadenza_export.h"
#include "core/rows/VoiceTableRow.h"
#include "widgets/voice-popup/CZVoicePopUpButton.h"
#include "widgets/voice-popup/VoiceMenuModel.h"

#include <QPointer>

class QTimer;

// Not public API: the voice pop-up's state and internal operations, and the process-wide state of
// the voice pop-ups, for tests and benchmarks.
namespace Cadenza {

class DownloadStatusLine;

class CADENZA_EXPORT CZVoicePopUpButtonPrivate
{
public:
    explicit CZVoicePopUpButtonPrivate(CZVoicePopUpButton *q);
    ~CZVoicePopUpButtonPrivate();

    [[nodiscard]] static CZVoicePopUpButtonPrivate *get(CZVoicePopUpButton *popUp) { return popUp->d.get(); }

    static void _startDelayedForceAllVoicePopupsToUpdate();
    static void _forceAllVoicePopupsToUpdate();

    void _handleSpeechDataInstallationNotification();
    /// The status line of running voice downloads; null when there is none. Starts or stops the
    /// 0.5-second refresh.
    [[nodiscard]] QString _statusStringForActiveDownloads();
    void _updateDownloadStatusFields();
    [[nodiscard]] QString _previouslyChosenVoiceIdentifier() const
    {
        return m_previouslyChosenVoiceIdentifier;
    }
    void _setPreviouslyChosenVoiceIdentifier(const QString &identifier)
    {
        m_previouslyChosenVoiceIdentifier = identifier;
    }
    void _forcePopupsToAdoptCachedMenuExceptPopUp(CZVoicePopUpButton *popUp)
    {
        CZVoicePopUpButton::forcePopupsToAdoptCachedMenuExceptPopUp(popUp);
    }
    /// Empties the shared menu and has every pop-up adopt it again.
    void _forceAllVoicePopupsToUpdateNow();
    /// Whether the status line's refresh timer runs.
    [[nodiscard]] bool _hasDownloadStatusUpdateTimer() const;

    CZVoicePopUpButton *const q;
    QStringList _fixedRateVoiceIdentifiers;
    QString m_previouslyChosenVoiceIdentifier;
    QString m_systemVoiceLocalizedText;
    qint64 m_systemVoiceMenuItemTag = 0;
    bool m_allowSystemVoiceChoice = false;
    bool m_showIndividualVoiceQualities = false;
    DownloadStatusLine *m_statusLine = nullptr;
    VoiceMenuModel *m_menu;
};

namespace VoicePopUpPrivate {

[[nodiscard]] CADENZA_EXPORT QList<VoiceMenuModel::Item> sharedMenu();
[[nodiscard]] CADENZA_EXPORT QList<VoiceTableRowPtr> currentVoiceRows();
/// Forgets every piece of process-wide state, as in a new process (pop-ups must be gone).
CADENZA_EXPORT void resetProcessState();
/// The folders watched for voice changes.
[[nodiscard]] CADENZA_EXPORT QStringList watchedFolders();

} // namespace VoicePopUpPrivate

} // namespace Cadenza

#endif
