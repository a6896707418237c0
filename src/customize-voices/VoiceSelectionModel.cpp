#include "VoiceSelectionModel.h"

namespace Cadenza {

VoiceSelectionModel::VoiceSelectionModel(QObject *parent)
    : Platform::GroupedRowsModel(parent)
{ }

void VoiceSelectionModel::setRows(const QList<VoiceTableRowPtr> &rows, bool showIndividualVoiceQualities)
{
    beginResetModel();
    m_rows = rows;
    m_showIndividualVoiceQualities = showIndividualVoiceQualities;
    endResetModel();
}

QString VoiceSelectionModel::labelForVoice(const CZVoiceObject &voice) const
{
    return m_showIndividualVoiceQualities ? voice.displayName() : voice.displayNameRoot();
}

void VoiceSelectionModel::refreshVoiceRow(int row)
{
    if (row >= 0 && row < m_rows.size()) {
        Q_EMIT dataChanged(index(row, 0), index(row, 0));
    }
}

QString VoiceSelectionModel::textAt(int row) const
{
    const VoiceTableRowPtr &entry = m_rows.at(row);
    return entry->isGroupRow() || !entry->voiceObject() ? entry->title()
                                                        : labelForVoice(*entry->voiceObject());
}

QString VoiceSelectionModel::identifierAt(int row) const
{
    const VoiceTableRowPtr &entry = m_rows.at(row);
    return entry->voiceObject() ? entry->voiceObject()->identifier() : QString();
}

} // namespace Cadenza
