// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZSRLanguageRow.h"

#include "core/speech-items/CZSpeechItem_p.h"
#include "protocol/InstallerProtocol.h"

#include <QHash>

#include <algorithm>

namespace Cadenza {

CZSRLanguageRowPtr CZSRLanguageRow::initWithTitle(
    const QString &title, const CZSRLanguageItemPtr &srLanguageItem)
{
    auto row = std::shared_ptr<CZSRLanguageRow>(new CZSRLanguageRow);
    row->_title = title;
    row->_srLanguageItem = srLanguageItem;
    return row;
}

QString CZSRLanguageRow::title() const
{
    QMutexLocker locker(&m_atomic);
    return _title;
}

CZSRLanguageItemPtr CZSRLanguageRow::srLanguageItem() const
{
    QMutexLocker locker(&m_atomic);
    return _srLanguageItem;
}

void CZSRLanguageRow::setSelected(bool selected)
{
    _selected = selected;
    if (const auto item = srLanguageItem()) {
        item->setVisibility(selected ? 1 : 0);
    }
}

void CZSRLanguageRow::setSelectedUsingLanguageCodeOnlyToSelectItems(bool)
{
    const auto item = srLanguageItem();
    if (_groupRow || !item) {
        return;
    }
    const qint64 status = item->downloadStatus();
    if (status == InstallerProtocol::DownloadingStatus || status == InstallerProtocol::WaitingStatus) {
        _selected = true;
        item->setVisibility(1); // a language on its way in is always shown
        return;
    }
    if (item->visibility() == 2) {
        return;
    }
    _selected = item->visibility() == 1;
}

QString CZSRLanguageRow::description() const
{
    const auto item = srLanguageItem();
    return _groupRow || !item ? title() : item->description();
}

QList<CZSRLanguageRowPtr> CZSRLanguageRow::arrangedRowsFromSRLanguageItems(
    const QList<CZSRLanguageItemPtr> &items, bool groupCountries, bool useLanguageCodeOnlyToSelectItems,
    bool showCurrentLocaleAtTop)
{
    QStringList names;
    QHash<QString, QList<CZSRLanguageItemPtr>> groups;
    for (const auto &item : items) {
        const QString name = item->languageDisplayString();
        if (!groups.contains(name)) {
            names.append(name);
        }
        groups[name].append(item);
    }
    std::sort(names.begin(), names.end(),
        [](const QString &a, const QString &b) { return SpeechItemPrivate::compareForDisplay(a, b) < 0; });

    QList<CZSRLanguageRowPtr> result;
    std::optional<QList<CZSRLanguageRowPtr>> topRows;
    if (showCurrentLocaleAtTop) {
        topRows.emplace();
    }
    for (const QString &name : names) {
        QList<CZSRLanguageItemPtr> group = groups.value(name);
        std::stable_sort(
            group.begin(), group.end(), [](const CZSRLanguageItemPtr &a, const CZSRLanguageItemPtr &b) {
                return a->compareCountryTitle(*b) < 0;
            });
        QList<CZSRLanguageRowPtr> rows;
        bool matchesSystem = false;
        bool headerAdded = false;
        for (const auto &item : group) {
            if (groupCountries && !matchesSystem) {
                matchesSystem = item->doesMatchSystemLocale();
            }
            if (groupCountries && !headerAdded) {
                CZSRLanguageRowPtr header = initWithTitle(name, nullptr);
                header->setGroupRow(true);
                rows.append(header);
                headerAdded = true;
            }
            // Full titles go with headings, bare country names without them.
            CZSRLanguageRowPtr row
                = initWithTitle(groupCountries ? item->displayTitle() : item->countryDisplayString(), item);
            row->setSelectedUsingLanguageCodeOnlyToSelectItems(
                matchesSystem && useLanguageCodeOnlyToSelectItems);
            rows.append(row);
        }
        (topRows && matchesSystem ? *topRows : result).append(rows);
    }
    if (topRows && !topRows->isEmpty()) {
        result = *topRows + result;
    }
    return result;
}

} // namespace Cadenza
