// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "VoiceMenuModel.h"

namespace Cadenza {

VoiceMenuModel::VoiceMenuModel(QObject *parent)
    : QAbstractListModel(parent)
{ }

void VoiceMenuModel::setItems(const QList<Item> &leading, const QList<Item> &shared)
{
    beginResetModel();
    m_leading = leading;
    m_shared = shared;
    endResetModel();
}

const VoiceMenuModel::Item &VoiceMenuModel::item(int row) const
{
    return row < m_leading.size() ? m_leading.at(row) : m_shared.at(row - m_leading.size());
}

int VoiceMenuModel::rowCount(const QModelIndex &parent) const
{
    return parent.isValid() ? 0 : count();
}

QVariant VoiceMenuModel::data(const QModelIndex &index, int role) const
{
    // The combo box asks about invalid indexes routinely; that is not an error.
    if (!index.isValid() || index.parent().isValid() || index.row() >= count()) {
        return {};
    }
    const Item &entry = item(index.row());
    switch (role) {
    case Qt::DisplayRole:
    case Qt::ToolTipRole:
        return entry.separator ? QVariant() : QVariant(entry.title);
    case Qt::AccessibleTextRole:
        return entry.title;
    case Qt::AccessibleDescriptionRole:
        // The combo box draws an item with this description as a separator line.
        return entry.separator ? QVariant(QStringLiteral("separator")) : QVariant();
    case TagRole:
        return entry.tag;
    default:
        return {};
    }
}

Qt::ItemFlags VoiceMenuModel::flags(const QModelIndex &index) const
{
    if (!index.isValid() || index.parent().isValid() || index.row() >= count()) {
        return Qt::NoItemFlags;
    }
    const Item &entry = item(index.row());
    return entry.enabled && !entry.separator
        ? Qt::ItemIsEnabled | Qt::ItemIsSelectable | Qt::ItemNeverHasChildren
        : Qt::ItemNeverHasChildren;
}

} // namespace Cadenza
