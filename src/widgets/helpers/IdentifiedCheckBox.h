// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_PLATFORM_IDENTIFIEDCHECKBOX_H
#define CADENZA_PLATFORM_IDENTIFIEDCHECKBOX_H

#include "cadenza_export.h"

#include <QCheckBox>
#include <QMutex>

namespace Cadenza::Platform {

/**
 * A checkbox that carries the identifier of what it ticks, so its click handler finds the thing
 * without asking the table which row was clicked. The identifier is read and written atomically.
 */
class CADENZA_EXPORT IdentifiedCheckBox : public QCheckBox
{
    Q_OBJECT
public:
    explicit IdentifiedCheckBox(QWidget *parent = nullptr);
    ~IdentifiedCheckBox() override;

protected:
    [[nodiscard]] QString identifier() const;
    void setIdentifier(const QString &identifier);

private:
    mutable QMutex m_mutex;
    QString m_identifier;
};

} // namespace Cadenza::Platform

#endif
