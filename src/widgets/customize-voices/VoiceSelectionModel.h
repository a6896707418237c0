// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_CUSTOMIZEVOICES_VOICESELECTIONMODEL_H
#define CADENZA_CUSTOMIZEVOICES_VOICESELECTIONMODEL_H

#include "cadenza_export.h"
#include "core/rows/VoiceTableRow.h"
#include "widgets/helpers/GroupedRowsModel.h"

namespace Cadenza {

/// The rows of the customise voices table: headings, and voices labelled by their name or root name.
class CADENZA_EXPORT VoiceSelectionModel : public Platform::GroupedRowsModel
{
    Q_OBJECT
public:
    explicit VoiceSelectionModel(QObject *parent = nullptr);

    /// Replaces every row; voices are labelled with full names when @p showIndividualVoiceQualities.
    void setRows(const QList<VoiceTableRowPtr> &rows, bool showIndividualVoiceQualities);
    [[nodiscard]] const QList<VoiceTableRowPtr> &rows() const { return m_rows; }
    /// The label of a voice row.
    [[nodiscard]] QString labelForVoice(const CZVoiceObject &voice) const;
    /// What a screen reader calls a voice: its label and its language ("Maren, English (United States)").
    [[nodiscard]] QString accessibleNameForVoice(const CZVoiceObject &voice) const;
    /// Tells views that a voice row's text or state changed.
    void refreshVoiceRow(int row);

protected:
    int rowTotal() const override { return int(m_rows.size()); }
    bool isGroupRowAt(int row) const override { return m_rows.at(row)->isGroupRow(); }
    QString textAt(int row) const override;
    QString identifierAt(int row) const override;
    QString accessibleTextAt(int row) const override;
    bool isTickedAt(int row) const override { return m_rows.at(row)->isSelected(); }

private:
    QList<VoiceTableRowPtr> m_rows;
    bool m_showIndividualVoiceQualities = false;
};

} // namespace Cadenza

#endif
