#ifndef CADENZA_RECOGNITIONLANGUAGES_SRLANGUAGESELECTIONMODEL_H
#define CADENZA_RECOGNITIONLANGUAGES_SRLANGUAGESELECTIONMODEL_H

#include "cadenza_export.h"
#include "recognition-languages/CZSRLanguageRow.h"

#include <QAbstractTableModel>

namespace Cadenza {

/**
 * The rows of the customise recognition languages table as a one-column model ("title"): language
 * headings, which cannot be selected and are drawn bold, and countries.
 */
class CADENZA_EXPORT SRLanguageSelectionModel : public QAbstractTableModel
{
    Q_OBJECT
public:
    enum Role { GroupRowRole = Qt::UserRole + 1, LocaleIdentifierRole };

    explicit SRLanguageSelectionModel(QObject *parent = nullptr);

    void setRows(const QList<CZSRLanguageRowPtr> &rows);
    [[nodiscard]] const QList<CZSRLanguageRowPtr> &rows() const { return m_rows; }

    int rowCount(const QModelIndex &parent = QModelIndex()) const override;
    int columnCount(const QModelIndex &parent = QModelIndex()) const override;
    QVariant data(const QModelIndex &index, int role = Qt::DisplayRole) const override;
    QVariant headerData(int section, Qt::Orientation orientation, int role = Qt::DisplayRole) const override;
    Qt::ItemFlags flags(const QModelIndex &index) const override;

private:
    QList<CZSRLanguageRowPtr> m_rows;
};

} // namespace Cadenza

#endif
