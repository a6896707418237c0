// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_INSTALLATION_INSTALLERPROTOCOL_H
#define CADENZA_INSTALLATION_INSTALLERPROTOCOL_H

#include <QString>

/// Names, message ids and record keys shared by the installer daemon and its clients.
namespace Cadenza::InstallerProtocol {

inline const QString ServicePortName = QStringLiteral("com.vendra.speech.quillond");
inline const QString LivenessPortName = QStringLiteral("com.vendra.speech.quillond.isavailable");
/// Local port names: the service name, a hyphen and a number 0..65535.
inline const QString LocalPortNameFormat = QStringLiteral("%1-%2");
inline const QString StartedInstallationNotification
    = QStringLiteral("com.vendra.speech.quillond.startedInstallationNofication");
inline const QString FinishedInstallationNotification
    = QStringLiteral("com.vendra.speech.quillond.finishedInstallationNofication");

enum MessageId : qint32 {
    StartInstallingMessage = 1,
    CancelAllMessage = 2,
    ActiveInstallationsMessage = 3,
    ShowProgressWindowMessage = 4,
};

/// Ids of the completion message sent to a request's local port.
enum CompletionId : qint32 {
    InstalledCompletion = 1,
    CancelledCompletion = 2,
    FailedCompletion = 3,
};

enum DownloadStatus : qint64 {
    InstalledStatus = 0,
    UpgradeAvailableStatus = 1,
    NotInstalledStatus = 2,
    DownloadingStatus = 3,
    WaitingStatus = 4,
};

/// Values of ItemSoftwareUpdateStateKey.
enum UpdateState : qint64 {
    PreparingState = 1,
    DownloadingState = 2,
    InstallingState = 3,
};

inline const QString TagNameKey = QStringLiteral("QLNDTagName");
inline const QString ItemNameKey = QStringLiteral("QLNDItemName");
inline const QString ItemByteSizeKey = QStringLiteral("QLNDItemByteSize");
inline const QString ClientPortNameKey = QStringLiteral("QLNDClientPortName");
inline const QString ClientProcessIDKey = QStringLiteral("QLNDClientProcessID");
inline const QString ObjectIDKey = QStringLiteral("QLNDObjectID");
inline const QString UserInteractionModeKey = QStringLiteral("QLNDUserInteractionMode");
inline const QString ItemDownloadStatusKey = QStringLiteral("QLNDItemDownloadStatus");
inline const QString ItemPercentCompleteKey = QStringLiteral("QLNDItemPercentComplete");
inline const QString ItemSecondsRemainingKey = QStringLiteral("QLNDItemSecondsRemaining");
inline const QString ItemSoftwareUpdateStateKey = QStringLiteral("QLNDItemSoftwareUpdateState");
inline const QString ItemDownloadByteCountKey = QStringLiteral("QLNDItemDownloadByteCount");
inline const QString ItemDownloadStartRefTimeKey = QStringLiteral("QLNDItemDownloadStartRefTime");
/// Added by Cadenza's daemon to failed completions: why the installation failed, for people.
inline const QString FailureReasonKey = QStringLiteral("QLNDFailureReason");

inline const QString VoiceTagPrefix = QStringLiteral("VOICEID:");
inline const QString RecognitionTagPrefix = QStringLiteral("SRCLANGID:");

/// Seconds between 1970-01-01 and 2001-01-01, the reference date of times in records.
constexpr double ReferenceDateOffset = 978307200.0;

/// The longest tag, object identifier or item name a request may carry, in characters.
constexpr qsizetype MaximumFieldLength = 1024;

constexpr double SendTimeout = 10.0;
constexpr double ReceiveTimeout = 10.0;

} // namespace Cadenza::InstallerProtocol

#endif
