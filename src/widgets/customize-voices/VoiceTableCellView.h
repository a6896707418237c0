#ifndef CADENZA_CUSTOMIZEVOICES_VOICETABLECELLVIEW_H
#define CADENZA_CUSTOMIZEVOICES_VOICETABLECELLVIEW_H

#include "cadenza_export.h"

#include "widgets/helpers/RowView.h"

class QComboBox;
class QLabel;

namespace Cadenza {

class CZVoiceRowCheckboxButton;
class CZVoiceRowTextView;

/**
 * The view of one voice row in the customise voices table: the show tick, the voice's name, a
 * download status line, the upgrade tick and the choice between a voice's two download sizes.
 *
 * The children carry object names ("activeCheckbox", "textField", "downloadMessageTextField",
 * "downloadCheckbox", "downloadVariantPopUpButton") so tests and style sheets can find them. The
 * size pop-up holds two items whose data are the tags 0 (compact) and 1 (full size).
 */
class CADENZA_EXPORT VoiceTableCellView : public Platform::RowView
{
    Q_OBJECT
public:
    explicit VoiceTableCellView(QWidget *parent = nullptr);
    ~VoiceTableCellView() override;

    [[nodiscard]] CZVoiceRowCheckboxButton *activeCheckbox() const { return m_activeCheckbox; }
    [[nodiscard]] CZVoiceRowTextView *textField() const { return m_textField; }
    [[nodiscard]] QLabel *downloadMessageTextField() const { return m_downloadMessageTextField; }
    [[nodiscard]] CZVoiceRowCheckboxButton *downloadCheckbox() const { return m_downloadCheckbox; }
    [[nodiscard]] QComboBox *downloadVariantPopUpButton() const { return m_downloadVariantPopUpButton; }

private:
    CZVoiceRowCheckboxButton *m_activeCheckbox;
    CZVoiceRowTextView *m_textField;
    QLabel *m_downloadMessageTextField;
    CZVoiceRowCheckboxButton *m_downloadCheckbox;
    QComboBox *m_downloadVariantPopUpButton;
};

} // namespace Cadenza

#endif
