#include "VoiceRowDelegate.h"

namespace Cadenza {

VoiceRowDelegate::VoiceRowDelegate(Recycler recycler, QObject *parent)
    : QStyledItemDelegate(parent)
    , m_recycler(std::move(recycler))
{ }

void VoiceRowDelegate::destroyEditor(QWidget *editor, const QModelIndex &index) const
{
    if (m_recycler) {
        m_recycler(editor);
        return;
    }
    QStyledItemDelegate::destroyEditor(editor, index);
}

} // namespace Cadenza
