#include "CZFloatSlider.h"

#include <cmath>

namespace Cadenza {

CZFloatSlider::CZFloatSlider(QWidget *parent)
    : CZFloatSlider(Qt::Horizontal, parent)
{ }

CZFloatSlider::CZFloatSlider(Qt::Orientation orientation, QWidget *parent)
    : QSlider(orientation, parent)
{
    setRange(0, Steps);
    setSingleStep(Steps / 100);
    setPageStep(Steps / 10);
    connect(this, &QSlider::valueChanged, this, [this] { Q_EMIT floatValueChanged(floatValue()); });
}

double CZFloatSlider::floatValue() const
{
    return m_minimum + (m_maximum - m_minimum) * double(value() - minimum()) / double(maximum() - minimum());
}

void CZFloatSlider::setFloatValue(double value)
{
    if (!(m_maximum > m_minimum) || std::isnan(value)) {
        return;
    }
    const double fraction = std::clamp((value - m_minimum) / (m_maximum - m_minimum), 0.0, 1.0);
    setValue(minimum() + int(std::lround(fraction * (maximum() - minimum()))));
}

} // namespace Cadenza
