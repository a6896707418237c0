// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "IdentifiedCheckBox.h"

namespace Cadenza::Platform {

IdentifiedCheckBox::IdentifiedCheckBox(QWidget *parent)
    : QCheckBox(parent)
{ }

IdentifiedCheckBox::~IdentifiedCheckBox() = default;

QString IdentifiedCheckBox::identifier() const
{
    QMutexLocker locker(&m_mutex);
    return m_identifier;
}

void IdentifiedCheckBox::setIdentifier(const QString &identifier)
{
    QMutexLocker locker(&m_mutex);
    m_identifier = identifier;
}

} // namespace Cadenza::Platform
