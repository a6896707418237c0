// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "SRLanguageSelectionModel.h"

#include "core/locale/LocalizationTable.h"
#include "core/recognition-items/CZSRLanguageItem.h"

namespace Cadenza {

SRLanguageSelectionModel::SRLanguageSelectionModel(QObject *parent)
    : Platform::GroupedRowsModel(parent)
{ }

void SRLanguageSelectionModel::setRows(const QList<CZSRLanguageRowPtr> &rows)
{
    beginResetModel();
    m_rows = rows;
    endResetModel();
}

QString SRLanguageSelectionModel::textAt(int row) const
{
    const CZSRLanguageRowPtr &entry = m_rows.at(row);
    const CZSRLanguageItemPtr item = entry->srLanguageItem();
    // Under a language heading a row shows its country.
    return entry->isGroupRow() || !item ? entry->title() : item->countryDisplayString();
}

QString SRLanguageSelectionModel::accessibleNameForItem(const CZSRLanguageItem &item)
{
    const QString language = item.languageDisplayString();
    const QString country = item.countryDisplayString();
    if (country.isEmpty() || language.isEmpty()) {
        return item.displayTitle();
    }
    return Platform::LocalizationTable::shared().format(
        QStringLiteral("LanguageWithCountryFormat"), {language, country});
}

QString SRLanguageSelectionModel::accessibleTextAt(int row) const
{
    // Read out of its heading's sight, a country alone would not say which language it is.
    const CZSRLanguageRowPtr &entry = m_rows.at(row);
    const CZSRLanguageItemPtr item = entry->srLanguageItem();
    return entry->isGroupRow() || !item ? entry->title() : accessibleNameForItem(*item);
}

QString SRLanguageSelectionModel::identifierAt(int row) const
{
    const CZSRLanguageItemPtr item = m_rows.at(row)->srLanguageItem();
    return item ? item->localeIdentifier() : QString();
}

} // namespace Cadenza
