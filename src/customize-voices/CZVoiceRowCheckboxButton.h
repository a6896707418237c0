#ifndef CADENZA_CUSTOMIZEVOICES_CZVOICEROWCHECKBOXBUTTON_H
#define CADENZA_CUSTOMIZEVOICES_CZVOICEROWCHECKBOXBUTTON_H

#include "cadenza_export.h"

#include <QCheckBox>
#include <QMutex>

namespace Cadenza {

/**
 * A checkbox in a voice row that knows the voice it belongs to, so its click handler finds the voice
 * without asking the table which row was clicked.
 */
class CADENZA_EXPORT CZVoiceRowCheckboxButton : public QCheckBox
{
    Q_OBJECT
    Q_PROPERTY(QString voiceIdentifier READ voiceIdentifier WRITE setVoiceIdentifier)
public:
    explicit CZVoiceRowCheckboxButton(QWidget *parent = nullptr);
    ~CZVoiceRowCheckboxButton() override;

    /// The identifier of the voice whose checkbox this is; read and written atomically.
    [[nodiscard]] QString voiceIdentifier() const;
    void setVoiceIdentifier(const QString &voiceIdentifier);

private:
    mutable QMutex m_mutex;
    QString m_voiceIdentifier;
};

} // namespace Cadenza

#endif
