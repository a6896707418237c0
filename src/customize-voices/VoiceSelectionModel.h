#ifndef CADENZA_CUSTOMIZEVOICES_VOICESELECTIONMODEL_H
#define CADENZA_CUSTOMIZEVOICES_VOICESELECTIONMODEL_H

#include "cadenza_export.h"
#include "customize-voices/VoiceTableRow.h"

#include <QAbstractTableModel>

namespace Cadenza {

/**
 * The rows of the customise voices table as a one-column model ("title"): headings, which cannot be
 * selected and are drawn bold, and voices, labelled by their name or root name.
 */
class CADENZA_EXPORT VoiceSelectionModel : public QAbstractTableModel
{
    Q_OBJECT
public:
    enum Role { GroupRowRole = Qt::UserRole + 1, VoiceIdentifierRole };

    explicit VoiceSelectionModel(QObject *parent = nullptr);

    /// Replaces every row; voices are labelled with full names when @p showIndividualVoiceQualities.
    void setRows(const QList<VoiceTableRowPtr> &rows, bool showIndividualVoiceQualities);
    [[nodiscard]] const QList<VoiceTableRowPtr> &rows() const { return m_rows; }
    /// The label of a voice row.
    [[nodiscard]] QString labelForVoice(const CZVoiceObject &voice) const;
    /// Tells views that the voice rows' texts or states changed.
    void refreshVoiceRow(int row);

    int rowCount(const QModelIndex &parent = QModelIndex()) const override;
    int columnCount(const QModelIndex &parent = QModelIndex()) const override;
    QVariant data(const QModelIndex &index, int role = Qt::DisplayRole) const override;
    QVariant headerData(int section, Qt::Orientation orientation, int role = Qt::DisplayRole) const override;
    Qt::ItemFlags flags(const QModelIndex &index) const override;

private:
    QList<VoiceTableRowPtr> m_rows;
    bool m_showIndividualVoiceQualities = false;
};

} // namespace Cadenza

#endif
