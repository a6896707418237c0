// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEPOPUPBUTTON_P_H
#define CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEPOPUPBUTTON_P_H

#include "cadenza_export.h"
#include "core/recognition-items/CZSRLanguageRow.h"
#include "widgets/recognition-languages/CZSRLanguagePopUpButton.h"

#include <QPointer>

class QTimer;

// Not public API: the dictation language pop-up's state and internal operations, for tests.
namespace Cadenza {

class DownloadStatusLine;
class VoiceMenuModel;

class CADENZA_EXPORT CZSRLanguagePopUpButtonPrivate
{
public:
    explicit CZSRLanguagePopUpButtonPrivate(CZSRLanguagePopUpButton *q);
    ~CZSRLanguagePopUpButtonPrivate();

    [[nodiscard]] static CZSRLanguagePopUpButtonPrivate *get(CZSRLanguagePopUpButton *popUp)
    {
        return popUp->d.get();
    }

    void _startDelayedPopUpUpdate();
    void _updateSRLanguageMenu();
    void _updateDownloadStatusFields();
    /// The status text, or null; starts or stops the 0.5-second refresh.
    [[nodiscard]] QString _statusStringForActiveDownloads();
    void _clearDownloadStatusFieldAfterPreHeat();
    [[nodiscard]] int _numberOfFixedItemsAtEndOfMenu() const { return m_numberOfFixedItemsAtEndOfMenu; }
    [[nodiscard]] bool _isWaitingForPreHeat() const { return m_preHeatTimer != nullptr; }
    [[nodiscard]] bool _hasDownloadStatusUpdateTimer() const;
    [[nodiscard]] QList<CZSRLanguageRowPtr> rows() const { return m_rows; }

    CZSRLanguagePopUpButton *const q;
    QString m_previouslyChosenLocaleIdentifier;
    std::optional<QStringList> m_network;
    std::optional<QStringList> m_offline;
    int m_numberOfFixedItemsAtEndOfMenu = 1;
    DownloadStatusLine *m_statusLine = nullptr;
    QTimer *m_preHeatTimer = nullptr;
    bool m_languagesAreDownloadable = false;
    VoiceMenuModel *m_menu;
    QList<CZSRLanguageRowPtr> m_rows;
};

} // namespace Cadenza

#endif
