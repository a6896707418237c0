#ifndef CADENZA_CUSTOMIZEVOICES_VOICEROWDELEGATE_H
#define CADENZA_CUSTOMIZEVOICES_VOICEROWDELEGATE_H

#include <QStyledItemDelegate>

#include <functional>

namespace Cadenza {

/**
 * Draws the voice table's rows and hands the row views the table lets go of (on scrolling and on every
 * reset) back to their owner instead of deleting them, so a search keystroke refills a few views
 * rather than building new ones.
 */
class VoiceRowDelegate : public QStyledItemDelegate
{
    Q_OBJECT
public:
    using Recycler = std::function<void(QWidget *view)>;

    explicit VoiceRowDelegate(Recycler recycler, QObject *parent = nullptr);

    void destroyEditor(QWidget *editor, const QModelIndex &index) const override;

private:
    Recycler m_recycler;
};

} // namespace Cadenza

#endif
