// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_RECOGNITIONLANGUAGES_SRLANGUAGESELECTIONMODEL_H
#define CADENZA_RECOGNITIONLANGUAGES_SRLANGUAGESELECTIONMODEL_H

#include "cadenza_export.h"
#include "core/recognition-items/CZSRLanguageRow.h"
#include "widgets/helpers/GroupedRowsModel.h"

namespace Cadenza {

class CZSRLanguageItem;

/// The rows of the customise recognition languages table: language headings, and countries.
class CADENZA_EXPORT SRLanguageSelectionModel : public Platform::GroupedRowsModel
{
    Q_OBJECT
public:
    explicit SRLanguageSelectionModel(QObject *parent = nullptr);

    void setRows(const QList<CZSRLanguageRowPtr> &rows);
    /// What a screen reader calls a language row: language and country ("German (Germany)"), since the
    /// row itself shows only the country under its language's heading.
    [[nodiscard]] static QString accessibleNameForItem(const CZSRLanguageItem &item);
    [[nodiscard]] const QList<CZSRLanguageRowPtr> &rows() const { return m_rows; }

protected:
    int rowTotal() const override { return int(m_rows.size()); }
    bool isGroupRowAt(int row) const override { return m_rows.at(row)->isGroupRow(); }
    QString textAt(int row) const override;
    QString identifierAt(int row) const override;
    QString accessibleTextAt(int row) const override;
    bool isTickedAt(int row) const override { return m_rows.at(row)->isSelected(); }

private:
    QList<CZSRLanguageRowPtr> m_rows;
};

} // namespace Cadenza

#endif
