// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CustomizeSheetRowView.h"

#include "widgets/helpers/PopUpButton.h"

#include <QAbstractButton>
#include <QHBoxLayout>
#include <QLabel>

namespace Cadenza {

CustomizeSheetRowView::CustomizeSheetRowView(
    QAbstractButton *tick, QLabel *textField, const QString &objectName, QWidget *parent)
    : Platform::RowView(parent)
{
    // Children in the order they stand, which is the order assistive technology reads them in.
    tick->setParent(this);
    textField->setParent(this);
    m_downloadMessageTextField = new QLabel(this);
    m_downloadVariantPopUpButton = new Platform::PopUpButton(this);
    setObjectName(objectName);
    tick->setObjectName(QStringLiteral("activeCheckbox"));
    textField->setObjectName(QStringLiteral("textField"));
    m_downloadMessageTextField->setObjectName(QStringLiteral("downloadMessageTextField"));
    m_downloadVariantPopUpButton->setObjectName(QStringLiteral("downloadVariantPopUpButton"));
    // A click or mnemonic on the name reaches the show tick.
    textField->setBuddy(tick);
    m_downloadMessageTextField->setForegroundRole(QPalette::PlaceholderText);
    m_downloadVariantPopUpButton->addItem(QString(), 0);
    m_downloadVariantPopUpButton->addItem(QString(), 1);
    m_downloadVariantPopUpButton->hide();

    auto *layout = new QHBoxLayout(this);
    layout->setContentsMargins(4, 1, 4, 1);
    layout->addWidget(tick);
    layout->addWidget(textField, 1);
    layout->addWidget(m_downloadMessageTextField);
    layout->addWidget(m_downloadVariantPopUpButton);
    setParts(tick, textField, m_downloadMessageTextField);
}

CustomizeSheetRowView::~CustomizeSheetRowView() = default;

void CustomizeSheetRowView::addTrailingControl(QWidget *control)
{
    control->setParent(this);
    layout()->addWidget(control);
    // Once more over the children, so the new control too is reached from the table, not by Tab.
    setParts(tick(), nameLabel(), statusLabel());
}

} // namespace Cadenza
