// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_GROUPEDROWSMODEL_H
#define CADENZA_PLATFORM_GROUPEDROWSMODEL_H

#include "cadenza_export.h"

#include <QAbstractTableModel>

namespace Cadenza::Platform {

/**
 * A one-column table of headings and items, as the customise sheets show them: headings are
 * drawn bold, span the row and cannot be selected. Subclasses say how many rows there are, which are
 * headings and what each row reads.
 */
class CADENZA_EXPORT GroupedRowsModel : public QAbstractTableModel
{
    Q_OBJECT
public:
    enum Role {
        GroupRowRole = Qt::UserRole + 1,
        IdentifierRole,
        TickedRole, ///< whether an item row is ticked; read by assistive technology for rows off screen
    };

    explicit GroupedRowsModel(QObject *parent = nullptr);

    int rowCount(const QModelIndex &parent = QModelIndex()) const override;
    int columnCount(const QModelIndex &parent = QModelIndex()) const override;
    QVariant data(const QModelIndex &index, int role = Qt::DisplayRole) const override;
    QVariant headerData(int section, Qt::Orientation orientation, int role = Qt::DisplayRole) const override;
    Qt::ItemFlags flags(const QModelIndex &index) const override;

    /// The column's title, as assistive technology reads the (hidden) header: what the rows list.
    void setColumnTitle(const QString &title) { m_columnTitle = title; }

protected:
    [[nodiscard]] virtual int rowTotal() const = 0;
    [[nodiscard]] virtual bool isGroupRowAt(int row) const = 0;
    /// What row @p row reads: a heading's title or an item's label.
    [[nodiscard]] virtual QString textAt(int row) const = 0;
    /// The identifier of the item at @p row (voice identifier, locale); empty for headings.
    [[nodiscard]] virtual QString identifierAt(int row) const = 0;
    /// What a screen reader calls row @p row; an item says what it is in full ("German (Germany)").
    [[nodiscard]] virtual QString accessibleTextAt(int row) const { return textAt(row); }
    /// Whether the item at @p row is ticked; false for headings.
    [[nodiscard]] virtual bool isTickedAt(int row) const
    {
        Q_UNUSED(row)
        return false;
    }

private:
    [[nodiscard]] bool isValidRow(const QModelIndex &index) const;

    QString m_columnTitle;
};

} // namespace Cadenza::Platform

#endif
