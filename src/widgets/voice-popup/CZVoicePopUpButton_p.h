#ifndef CADENZA_VOICEPOPUP_CZVOICEPOPUPBUTTON_P_H
#define CADENZA_VOICEPOPUP_CZVOICEPOPUPBUTTON_P_H

#include "cadenza_export.h"
#include "core/rows/VoiceTableRow.h"
#include "widgets/voice-popup/VoiceMenuModel.h"

// Not public API: the process-wide state of the voice pop-ups, for tests and benchmarks.
namespace Cadenza::VoicePopUpPrivate {

[[nodiscard]] CADENZA_EXPORT QList<VoiceMenuModel::Item> sharedMenu();
[[nodiscard]] CADENZA_EXPORT QList<VoiceTableRowPtr> currentVoiceRows();
/// Forgets every piece of process-wide state, as in a new process (pop-ups must be gone).
CADENZA_EXPORT void resetProcessState();
/// The folders watched for voice changes.
[[nodiscard]] CADENZA_EXPORT QStringList watchedFolders();

} // namespace Cadenza::VoicePopUpPrivate

#endif
