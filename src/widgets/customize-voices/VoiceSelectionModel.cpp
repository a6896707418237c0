// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "VoiceSelectionModel.h"

#include "core/locale/LocalizationTable.h"

namespace Cadenza {

VoiceSelectionModel::VoiceSelectionModel(QObject *parent)
    : Platform::GroupedRowsModel(parent)
{ }

void VoiceSelectionModel::setRows(const QList<VoiceTableRowPtr> &rows, bool showIndividualVoiceQualities)
{
    beginResetModel();
    m_rows = rows;
    m_showIndividualVoiceQualities = showIndividualVoiceQualities;
    endResetModel();
}

QString VoiceSelectionModel::labelForVoice(const CZVoiceObject &voice) const
{
    return m_showIndividualVoiceQualities ? voice.displayName() : voice.displayNameRoot();
}

QString VoiceSelectionModel::accessibleNameForVoice(const CZVoiceObject &voice) const
{
    const Platform::LocalizationTable &texts = Platform::LocalizationTable::shared();
    const QString country = voice.countryDisplayString();
    const QString language = country.isEmpty()
        ? voice.languageDisplayString()
        : texts.format(QStringLiteral("LanguageWithCountryFormat"), {voice.languageDisplayString(), country});
    if (language.isEmpty()) {
        return labelForVoice(voice);
    }
    return texts.format(QStringLiteral("AccessibleRowNameFormat"), {labelForVoice(voice), language});
}

QString VoiceSelectionModel::accessibleTextAt(int row) const
{
    const VoiceTableRowPtr &entry = m_rows.at(row);
    return entry->isGroupRow() || !entry->voiceObject() ? entry->title()
                                                        : accessibleNameForVoice(*entry->voiceObject());
}

void VoiceSelectionModel::refreshVoiceRow(int row)
{
    if (row >= 0 && row < m_rows.size()) {
        Q_EMIT dataChanged(index(row, 0), index(row, 0));
    }
}

QString VoiceSelectionModel::textAt(int row) const
{
    const VoiceTableRowPtr &entry = m_rows.at(row);
    return entry->isGroupRow() || !entry->voiceObject() ? entry->title()
                                                        : labelForVoice(*entry->voiceObject());
}

QString VoiceSelectionModel::identifierAt(int row) const
{
    const VoiceTableRowPtr &entry = m_rows.at(row);
    return entry->voiceObject() ? entry->voiceObject()->identifier() : QString();
}

} // namespace Cadenza
