#include "VoiceSelectionModel.h"

#include <QFont>

namespace Cadenza {

VoiceSelectionModel::VoiceSelectionModel(QObject *parent)
    : QAbstractTableModel(parent)
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

int VoiceSelectionModel::rowCount(const QModelIndex &parent) const
{
    return parent.isValid() ? 0 : int(m_rows.size());
}

int VoiceSelectionModel::columnCount(const QModelIndex &parent) const
{
    return parent.isValid() ? 0 : 1;
}

QVariant VoiceSelectionModel::data(const QModelIndex &index, int role) const
{
    // Views ask about invalid indexes routinely; that is not an error.
    if (!index.isValid() || index.parent().isValid() || index.row() >= m_rows.size()) {
        return {};
    }
    const VoiceTableRowPtr &row = m_rows.at(index.row());
    switch (role) {
    case Qt::DisplayRole:
    case Qt::AccessibleTextRole:
        return row->isGroupRow() || !row->voiceObject() ? row->title() : labelForVoice(*row->voiceObject());
    case Qt::FontRole:
        if (row->isGroupRow()) {
            QFont bold;
            bold.setBold(true);
            return bold;
        }
        return {};
    case GroupRowRole:
        return row->isGroupRow();
    case VoiceIdentifierRole:
        return row->voiceObject() ? row->voiceObject()->identifier() : QString();
    default:
        return {};
    }
}

QVariant VoiceSelectionModel::headerData(int section, Qt::Orientation orientation, int role) const
{
    if (orientation == Qt::Horizontal && section == 0 && role == Qt::DisplayRole) {
        return QStringLiteral("title");
    }
    return {};
}

Qt::ItemFlags VoiceSelectionModel::flags(const QModelIndex &index) const
{
    if (!index.isValid() || index.parent().isValid() || index.row() >= m_rows.size()) {
        return Qt::NoItemFlags;
    }
    // Headings cannot be selected.
    return m_rows.at(index.row())->isGroupRow()
        ? Qt::ItemIsEnabled | Qt::ItemNeverHasChildren
        : Qt::ItemIsEnabled | Qt::ItemIsSelectable | Qt::ItemNeverHasChildren;
}

} // namespace Cadenza
