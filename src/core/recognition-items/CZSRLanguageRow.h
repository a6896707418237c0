// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEROW_H
#define CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGEROW_H

#include "cadenzacore_export.h"

#include "CZSRLanguageItem.h"

#include <QList>
#include <QMutex>

namespace Cadenza {

class CZSRLanguageRow;
using CZSRLanguageRowPtr = std::shared_ptr<CZSRLanguageRow>;

/// One line of a recognition-language list: a language heading, or one language with its tick.
class CADENZACORE_EXPORT CZSRLanguageRow
{
public:
    [[nodiscard]] static CZSRLanguageRowPtr initWithTitle(
        const QString &title, const CZSRLanguageItemPtr &srLanguageItem);

    /**
     * Rows for @p items grouped by language name in the order names are shown to users, countries
     * sorted within. With @p groupCountries each language gets a heading and full titles, and with
     * @p showCurrentLocaleAtTop the language holding the user's locale comes first.
     */
    [[nodiscard]] static QList<CZSRLanguageRowPtr> arrangedRowsFromSRLanguageItems(
        const QList<CZSRLanguageItemPtr> &items, bool groupCountries, bool useLanguageCodeOnlyToSelectItems,
        bool showCurrentLocaleAtTop);

    [[nodiscard]] QString title() const;
    [[nodiscard]] CZSRLanguageItemPtr srLanguageItem() const;
    [[nodiscard]] qsizetype tableIndex() const { return _tableIndex; }
    void setTableIndex(qsizetype index) { _tableIndex = index; }
    [[nodiscard]] bool isSelected() const { return _selected; }
    /// Also writes the language's visibility: 1 when ticked, 0 when not.
    void setSelected(bool selected);
    [[nodiscard]] bool isGroupRow() const { return _groupRow; }
    void setGroupRow(bool groupRow) { _groupRow = groupRow; }
    /// The initial tick from the item; the argument changes nothing.
    void setSelectedUsingLanguageCodeOnlyToSelectItems(bool languageCodeOnly);
    [[nodiscard]] QString description() const;

private:
    CZSRLanguageRow() = default;

    mutable QMutex m_atomic;
    QString _title;
    qsizetype _tableIndex = 0;
    bool _selected = false;
    bool _groupRow = false;
    CZSRLanguageItemPtr _srLanguageItem;
};

} // namespace Cadenza

#endif
