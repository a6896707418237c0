// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "CZFloatSlider.h"

#include <cmath>

namespace Cadenza {

class CZFloatSliderPrivate
{
public:
    double m_minimum = 0.0;
    double m_maximum = 1.0;
};

CZFloatSlider::CZFloatSlider(QWidget *parent)
    : CZFloatSlider(Qt::Horizontal, parent)
{ }

CZFloatSlider::CZFloatSlider(Qt::Orientation orientation, QWidget *parent)
    : QSlider(orientation, parent)
    , d(std::make_unique<CZFloatSliderPrivate>())
{
    setRange(0, Steps);
    setSingleStep(Steps / 100);
    setPageStep(Steps / 10);
    connect(this, &QSlider::valueChanged, this, [this] { Q_EMIT floatValueChanged(floatValue()); });
}

CZFloatSlider::~CZFloatSlider() = default;

double CZFloatSlider::minimumFloatValue() const
{
    return d->m_minimum;
}

void CZFloatSlider::setMinimumFloatValue(double minimum)
{
    d->m_minimum = minimum;
}

double CZFloatSlider::maximumFloatValue() const
{
    return d->m_maximum;
}

void CZFloatSlider::setMaximumFloatValue(double maximum)
{
    d->m_maximum = maximum;
}

double CZFloatSlider::floatValue() const
{
    return d->m_minimum
        + (d->m_maximum - d->m_minimum) * double(value() - minimum()) / double(maximum() - minimum());
}

void CZFloatSlider::setFloatValue(double value)
{
    if (!(d->m_maximum > d->m_minimum) || std::isnan(value)) {
        return;
    }
    const double fraction = std::clamp((value - d->m_minimum) / (d->m_maximum - d->m_minimum), 0.0, 1.0);
    setValue(minimum() + int(std::lround(fraction * (maximum() - minimum()))));
}

} // namespace Cadenza
