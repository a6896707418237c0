// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#ifndef CADENZA_VOICESETTINGS_CZFLOATSLIDER_H
#define CADENZA_VOICESETTINGS_CZFLOATSLIDER_H

#include "cadenza_export.h"

#include <QSlider>

#include <memory>

namespace Cadenza {

class CZFloatSliderPrivate;

/**
 * A slider over a real range (0.0 to 1.0 unless set), in 1,000 steps. QSlider itself only knows
 * integers; the volume is a fraction.
 */
class CADENZA_EXPORT CZFloatSlider : public QSlider
{
    Q_OBJECT
    Q_PROPERTY(double floatValue READ floatValue WRITE setFloatValue NOTIFY floatValueChanged)
    Q_PROPERTY(double minimumFloatValue READ minimumFloatValue WRITE setMinimumFloatValue)
    Q_PROPERTY(double maximumFloatValue READ maximumFloatValue WRITE setMaximumFloatValue)
public:
    static constexpr int Steps = 1000;

    explicit CZFloatSlider(QWidget *parent = nullptr);
    explicit CZFloatSlider(Qt::Orientation orientation, QWidget *parent = nullptr);
    ~CZFloatSlider() override;

    [[nodiscard]] double floatValue() const;
    /// Moves the knob to the step nearest @p value, held inside the range.
    void setFloatValue(double value);
    [[nodiscard]] double minimumFloatValue() const;
    void setMinimumFloatValue(double minimum);
    [[nodiscard]] double maximumFloatValue() const;
    void setMaximumFloatValue(double maximum);

Q_SIGNALS:
    void floatValueChanged(double value);

private:
    std::unique_ptr<CZFloatSliderPrivate> const d;
};

} // namespace Cadenza

#endif
