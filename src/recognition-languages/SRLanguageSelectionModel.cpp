#include "SRLanguageSelectionModel.h"

#include "recognition-languages/CZSRLanguageItem.h"

#include <QFont>

namespace Cadenza {

SRLanguageSelectionModel::SRLanguageSelectionModel(QObject *parent)
    : QAbstractTableModel(parent)
{ }

void SRLanguageSelectionModel::setRows(const QList<CZSRLanguageRowPtr> &rows)
{
    beginResetModel();
    m_rows = rows;
    endResetModel();
}

int SRLanguageSelectionModel::rowCount(const QModelIndex &parent) const
{
    return parent.isValid() ? 0 : int(m_rows.size());
}

int SRLanguageSelectionModel::columnCount(const QModelIndex &parent) const
{
    return parent.isValid() ? 0 : 1;
}

QVariant SRLanguageSelectionModel::data(const QModelIndex &index, int role) const
{
    if (!index.isValid() || index.parent().isValid() || index.row() >= m_rows.size()) {
        return {};
    }
    const CZSRLanguageRowPtr &row = m_rows.at(index.row());
    const CZSRLanguageItemPtr item = row->srLanguageItem();
    switch (role) {
    case Qt::DisplayRole:
    case Qt::AccessibleTextRole:
        // Under a language heading a row shows its country.
        return row->isGroupRow() || !item ? row->title() : item->countryDisplayString();
    case Qt::FontRole:
        if (row->isGroupRow()) {
            QFont bold;
            bold.setBold(true);
            return bold;
        }
        return {};
    case GroupRowRole:
        return row->isGroupRow();
    case LocaleIdentifierRole:
        return item ? item->localeIdentifier() : QString();
    default:
        return {};
    }
}

QVariant SRLanguageSelectionModel::headerData(int section, Qt::Orientation orientation, int role) const
{
    if (orientation == Qt::Horizontal && section == 0 && role == Qt::DisplayRole) {
        return QStringLiteral("title");
    }
    return {};
}

Qt::ItemFlags SRLanguageSelectionModel::flags(const QModelIndex &index) const
{
    if (!index.isValid() || index.parent().isValid() || index.row() >= m_rows.size()) {
        return Qt::NoItemFlags;
    }
    return m_rows.at(index.row())->isGroupRow()
        ? Qt::ItemIsEnabled | Qt::ItemNeverHasChildren
        : Qt::ItemIsEnabled | Qt::ItemIsSelectable | Qt::ItemNeverHasChildren;
}

} // namespace Cadenza
