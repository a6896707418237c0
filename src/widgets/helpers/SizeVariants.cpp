// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "SizeVariants.h"

#include "core/locale/LocalizationTable.h"
#include "core/speech-items/CZSpeechItem.h"

#include <QComboBox>

namespace Cadenza::Platform {

namespace {
constexpr int IdentifierRole = Qt::UserRole + 1; // Qt::UserRole holds the tag

QString title(const char *key, quint64 bytes)
{
    return LocalizationTable::shared().text(QLatin1String(key)) + QStringLiteral(" (")
        + CZSpeechItem::displayStringForByteSize(bytes) + QLatin1Char(')');
}
} // namespace

void SizeVariants::show(QComboBox *popUp, const QString &identifier, quint64 compactBytes,
    quint64 fullSizeBytes, bool downloadFullSize)
{
    popUp->setItemText(0, title("DownloadVariantCompactItem", compactBytes));
    popUp->setItemText(1, title("DownloadVariantFullSizeItem", fullSizeBytes));
    popUp->setItemData(0, identifier, IdentifierRole);
    popUp->setItemData(1, identifier, IdentifierRole);
    popUp->setCurrentIndex(downloadFullSize ? 1 : 0);
    popUp->show();
}

QString SizeVariants::identifier(const QComboBox *popUp, int index)
{
    return popUp->itemData(index, IdentifierRole).toString();
}

bool SizeVariants::isFullSize(const QComboBox *popUp, int index)
{
    return popUp->itemData(index).toInt() > 0;
}

} // namespace Cadenza::Platform
