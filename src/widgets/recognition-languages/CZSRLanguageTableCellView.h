#ifndef CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGETABLECELLVIEW_H
#define CADENZA_RECOGNITIONLANGUAGES_CZSRLANGUAGETABLECELLVIEW_H

#include "cadenza_export.h"

#include "widgets/helpers/RowView.h"

class QComboBox;
class QLabel;

namespace Cadenza {

class CZSRLanguageRowCheckboxButton;
class CZSRLanguageRowTextView;

/**
 * The view of one language row in the customise recognition languages table: the show tick, the
 * country (the language is the heading above), a status line and the choice between two download
 * sizes. Children carry the object names "activeCheckbox", "textField", "downloadMessageTextField"
 * and "downloadVariantPopUpButton"; the size pop-up's items hold the tags 0 and 1 as their data.
 */
class CADENZA_EXPORT CZSRLanguageTableCellView : public Platform::RowView
{
    Q_OBJECT
public:
    explicit CZSRLanguageTableCellView(QWidget *parent = nullptr);
    ~CZSRLanguageTableCellView() override;

    [[nodiscard]] CZSRLanguageRowCheckboxButton *activeCheckbox() const { return m_activeCheckbox; }
    [[nodiscard]] CZSRLanguageRowTextView *textField() const { return m_textField; }
    [[nodiscard]] QLabel *downloadMessageTextField() const { return m_downloadMessageTextField; }
    [[nodiscard]] QComboBox *downloadVariantPopUpButton() const { return m_downloadVariantPopUpButton; }

private:
    CZSRLanguageRowCheckboxButton *m_activeCheckbox;
    CZSRLanguageRowTextView *m_textField;
    QLabel *m_downloadMessageTextField;
    QComboBox *m_downloadVariantPopUpButton;
};

} // namespace Cadenza

#endif
