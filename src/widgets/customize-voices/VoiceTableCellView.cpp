#include "VoiceTableCellView.h"

#include "CZVoiceRowCheckboxButton.h"
#include "CZVoiceRowTextView.h"
#include "widgets/helpers/PopUpButton.h"

#include <QComboBox>
#include <QHBoxLayout>
#include <QLabel>

namespace Cadenza {

VoiceTableCellView::VoiceTableCellView(QWidget *parent)
    : Platform::RowView(parent)
    , m_activeCheckbox(new CZVoiceRowCheckboxButton(this))
    , m_textField(new CZVoiceRowTextView(this))
    , m_downloadMessageTextField(new QLabel(this))
    , m_downloadCheckbox(new CZVoiceRowCheckboxButton(this))
    , m_downloadVariantPopUpButton(new Platform::PopUpButton(this))
{
    setObjectName(QStringLiteral("VoiceRow"));
    m_activeCheckbox->setObjectName(QStringLiteral("activeCheckbox"));
    m_textField->setObjectName(QStringLiteral("textField"));
    m_downloadMessageTextField->setObjectName(QStringLiteral("downloadMessageTextField"));
    m_downloadCheckbox->setObjectName(QStringLiteral("downloadCheckbox"));
    m_downloadVariantPopUpButton->setObjectName(QStringLiteral("downloadVariantPopUpButton"));

    // A click or mnemonic on the name reaches the show tick.
    m_textField->setBuddy(m_activeCheckbox);
    m_downloadMessageTextField->setForegroundRole(QPalette::PlaceholderText);
    m_downloadVariantPopUpButton->addItem(QString(), 0);
    m_downloadVariantPopUpButton->addItem(QString(), 1);
    m_downloadVariantPopUpButton->setSizeAdjustPolicy(QComboBox::AdjustToContents);
    m_downloadVariantPopUpButton->hide();
    m_downloadCheckbox->hide();

    auto *layout = new QHBoxLayout(this);
    layout->setContentsMargins(4, 1, 4, 1);
    layout->addWidget(m_activeCheckbox);
    layout->addWidget(m_textField, 1);
    layout->addWidget(m_downloadMessageTextField);
    layout->addWidget(m_downloadVariantPopUpButton);
    layout->addWidget(m_downloadCheckbox);
    setParts(m_activeCheckbox, m_textField, m_downloadMessageTextField);
}

VoiceTableCellView::~VoiceTableCellView() = default;

} // namespace Cadenza
