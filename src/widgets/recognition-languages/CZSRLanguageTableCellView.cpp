#include "CZSRLanguageTableCellView.h"

#include "CZSRLanguageRowCheckboxButton.h"
#include "CZSRLanguageRowTextView.h"
#include "widgets/helpers/PopUpButton.h"

#include <QComboBox>
#include <QHBoxLayout>
#include <QLabel>

namespace Cadenza {

CZSRLanguageTableCellView::CZSRLanguageTableCellView(QWidget *parent)
    : Platform::RowView(parent)
    , m_activeCheckbox(new CZSRLanguageRowCheckboxButton(this))
    , m_textField(new CZSRLanguageRowTextView(this))
    , m_downloadMessageTextField(new QLabel(this))
    , m_downloadVariantPopUpButton(new Platform::PopUpButton(this))
{
    setObjectName(QStringLiteral("LanguageRow"));
    m_activeCheckbox->setObjectName(QStringLiteral("activeCheckbox"));
    m_textField->setObjectName(QStringLiteral("textField"));
    m_textField->setBuddy(m_activeCheckbox);
    m_downloadMessageTextField->setObjectName(QStringLiteral("downloadMessageTextField"));
    m_downloadMessageTextField->setForegroundRole(QPalette::PlaceholderText);
    m_downloadVariantPopUpButton->setObjectName(QStringLiteral("downloadVariantPopUpButton"));
    m_downloadVariantPopUpButton->addItem(QString(), 0);
    m_downloadVariantPopUpButton->addItem(QString(), 1);
    m_downloadVariantPopUpButton->hide();

    auto *layout = new QHBoxLayout(this);
    layout->setContentsMargins(4, 1, 4, 1);
    layout->addWidget(m_activeCheckbox);
    layout->addWidget(m_textField, 1);
    layout->addWidget(m_downloadMessageTextField);
    layout->addWidget(m_downloadVariantPopUpButton);
    setParts(m_activeCheckbox, m_textField, m_downloadMessageTextField);
}

CZSRLanguageTableCellView::~CZSRLanguageTableCellView() = default;

} // namespace Cadenza
