#include "CZVoiceRowCheckboxButton.h"

namespace Cadenza {

CZVoiceRowCheckboxButton::CZVoiceRowCheckboxButton(QWidget *parent)
    : QCheckBox(parent)
{ }

CZVoiceRowCheckboxButton::~CZVoiceRowCheckboxButton() = default;

QString CZVoiceRowCheckboxButton::voiceIdentifier() const
{
    QMutexLocker locker(&m_mutex);
    return m_voiceIdentifier;
}

void CZVoiceRowCheckboxButton::setVoiceIdentifier(const QString &voiceIdentifier)
{
    QMutexLocker locker(&m_mutex);
    m_voiceIdentifier = voiceIdentifier;
}

} // namespace Cadenza
