// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "GroupedRowsModel.h"

#include <QFont>

namespace Cadenza::Platform {

GroupedRowsModel::GroupedRowsModel(QObject *parent)
    : QAbstractTableModel(parent)
{ }

bool GroupedRowsModel::isValidRow(const QModelIndex &index) const
{
    // Views ask about invalid indexes routinely; that is not an error.
    return index.isValid() && !index.parent().isValid() && index.row() < rowTotal();
}

int GroupedRowsModel::rowCount(const QModelIndex &parent) const
{
    return parent.isValid() ? 0 : rowTotal();
}

int GroupedRowsModel::columnCount(const QModelIndex &parent) const
{
    return parent.isValid() ? 0 : 1;
}

QVariant GroupedRowsModel::data(const QModelIndex &index, int role) const
{
    if (!isValidRow(index)) {
        return {};
    }
    switch (role) {
    case Qt::DisplayRole:
        return textAt(index.row());
    case Qt::AccessibleTextRole:
        return accessibleTextAt(index.row());
    case Qt::FontRole:
        if (isGroupRowAt(index.row())) {
            QFont bold;
            bold.setBold(true);
            return bold;
        }
        return {};
    case GroupRowRole:
        return isGroupRowAt(index.row());
    case IdentifierRole:
        return identifierAt(index.row());
    case TickedRole:
        return !isGroupRowAt(index.row()) && isTickedAt(index.row());
    default:
        return {};
    }
}

QVariant GroupedRowsModel::headerData(int section, Qt::Orientation orientation, int role) const
{
    if (orientation == Qt::Horizontal && section == 0 && role == Qt::DisplayRole) {
        return m_columnTitle;
    }
    return {};
}

Qt::ItemFlags GroupedRowsModel::flags(const QModelIndex &index) const
{
    if (!isValidRow(index)) {
        return Qt::NoItemFlags;
    }
    return isGroupRowAt(index.row()) ? Qt::ItemIsEnabled | Qt::ItemNeverHasChildren
                                     : Qt::ItemIsEnabled | Qt::ItemIsSelectable | Qt::ItemNeverHasChildren;
}

} // namespace Cadenza::Platform
