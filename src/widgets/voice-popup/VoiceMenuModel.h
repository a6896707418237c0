// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICEPOPUP_VOICEMENUMODEL_H
#define CADENZA_VOICEPOPUP_VOICEMENUMODEL_H

#include "cadenza_export.h"

#include <QAbstractListModel>
#include <QList>

namespace Cadenza {

/**
 * The items of a pop-up menu: titles, tags, enabled state and separators. A pop-up's menu is a few
 * leading items of its own followed by the process's shared voice menu, which is held by implicit
 * sharing, so adopting a menu of 10,000 voices copies nothing.
 */
class CADENZA_EXPORT VoiceMenuModel : public QAbstractListModel
{
    Q_OBJECT
public:
    enum Role { TagRole = Qt::UserRole + 1 };

    struct Item
    {
        QString title;
        qint64 tag = 0;
        bool enabled = true;
        bool separator = false;

        [[nodiscard]] static Item makeSeparator()
        {
            Item item;
            item.separator = true;
            item.enabled = false;
            return item;
        }
    };

    explicit VoiceMenuModel(QObject *parent = nullptr);

    /// Replaces every item: @p leading first, then @p shared.
    void setItems(const QList<Item> &leading, const QList<Item> &shared);
    [[nodiscard]] const Item &item(int row) const;
    [[nodiscard]] int count() const { return int(m_leading.size() + m_shared.size()); }

    int rowCount(const QModelIndex &parent = QModelIndex()) const override;
    QVariant data(const QModelIndex &index, int role = Qt::DisplayRole) const override;
    Qt::ItemFlags flags(const QModelIndex &index) const override;

private:
    QList<Item> m_leading;
    QList<Item> m_shared;
};

} // namespace Cadenza

#endif
