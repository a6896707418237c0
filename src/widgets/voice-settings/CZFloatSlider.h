#ifndef CADENZA_VOICESETTINGS_CZFLOATSLIDER_H
#define CADENZA_VOICESETTINGS_CZFLOATSLIDER_H

#include "cadenza_export.h"

#include <QSlider>

namespace Cadenza {

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

    [[nodiscard]] double floatValue() const;
    /// Moves the knob to the step nearest @p value, held inside the range.
    void setFloatValue(double value);
    [[nodiscard]] double minimumFloatValue() const { return m_minimum; }
    void setMinimumFloatValue(double minimum) { m_minimum = minimum; }
    [[nodiscard]] double maximumFloatValue() const { return m_maximum; }
    void setMaximumFloatValue(double maximum) { m_maximum = maximum; }

Q_SIGNALS:
    void floatValueChanged(double value);

private:
    double m_minimum = 0.0;
    double m_maximum = 1.0;
};

} // namespace Cadenza

#endif
