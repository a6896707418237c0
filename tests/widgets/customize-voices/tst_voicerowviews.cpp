// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "widgets/customize-voices/CZVoiceRowCheckboxButton.h"
#include "widgets/customize-voices/CZVoiceRowTextView.h"
#include "widgets/customize-voices/VoiceTableCellView.h"

#include <QComboBox>
#include <QLabel>
#include <QMouseEvent>
#include <QSignalSpy>
#include <QTest>
#include <QVBoxLayout>

using namespace Cadenza;

namespace {
/// A holder that records the presses that reach it.
class PressRecorder : public QWidget
{
public:
    QList<QPoint> presses;

protected:
    void mousePressEvent(QMouseEvent *event) override
    {
        presses.append(event->position().toPoint());
        event->accept();
    }
};
} // namespace

class VoiceRowViewsTest : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void checkboxKeepsItsVoice()
    {
        CZVoiceRowCheckboxButton box;
        QVERIFY(box.voiceIdentifier().isEmpty());
        box.setVoiceIdentifier(QStringLiteral("v.en.anna"));
        QCOMPARE(box.voiceIdentifier(), QStringLiteral("v.en.anna"));
        QCOMPARE(box.property("voiceIdentifier").toString(), QStringLiteral("v.en.anna"));
        // Toggling from the keyboard works as for any checkbox and keeps the identifier.
        QSignalSpy clicks(&box, &QAbstractButton::clicked);
        box.show();
        box.setFocus();
        QTest::keyClick(&box, Qt::Key_Space);
        QCOMPARE(clicks.size(), 1);
        QVERIFY(box.isChecked());
        QCOMPARE(box.voiceIdentifier(), QStringLiteral("v.en.anna"));
    }

    void pressOnLabelReachesItsHolderOnce()
    {
        PressRecorder holder;
        holder.resize(300, 40);
        auto *layout = new QVBoxLayout(&holder);
        layout->setContentsMargins(20, 10, 0, 0);
        auto *label = new CZVoiceRowTextView(&holder);
        label->setText(QStringLiteral("Anna"));
        layout->addWidget(label);
        holder.show();
        QVERIFY(QTest::qWaitForWindowExposed(&holder));

        QTest::mouseClick(label, Qt::LeftButton, {}, QPoint(3, 4));
        QCOMPARE(holder.presses.size(), 1);
        // In the holder's own coordinates: where the user clicked.
        QCOMPARE(holder.presses.first(), label->mapTo(&holder, QPoint(3, 4)));
    }

    void pressOnLabelWithoutHolderIsDropped()
    {
        CZVoiceRowTextView label;
        label.setText(QStringLiteral("Anna"));
        label.show();
        QMouseEvent press(QEvent::MouseButtonPress, QPointF(2, 2), QPointF(2, 2), QPointF(2, 2),
            Qt::LeftButton, Qt::LeftButton, Qt::NoModifier);
        press.ignore();
        QCoreApplication::sendEvent(&label, &press);
        QVERIFY(press.isAccepted());
    }

    void cellViewHasItsOutlets()
    {
        VoiceTableCellView cell;
        QCOMPARE(cell.objectName(), QStringLiteral("VoiceRow"));
        QCOMPARE(cell.findChild<CZVoiceRowCheckboxButton *>(QStringLiteral("activeCheckbox")),
            cell.activeCheckbox());
        QCOMPARE(cell.findChild<CZVoiceRowCheckboxButton *>(QStringLiteral("downloadCheckbox")),
            cell.downloadCheckbox());
        QCOMPARE(cell.findChild<QLabel *>(QStringLiteral("downloadMessageTextField")),
            cell.downloadMessageTextField());
        QCOMPARE(cell.findChild<CZVoiceRowTextView *>(QStringLiteral("textField")), cell.textField());
        QComboBox *sizes = cell.findChild<QComboBox *>(QStringLiteral("downloadVariantPopUpButton"));
        QCOMPARE(sizes, cell.downloadVariantPopUpButton());
        QCOMPARE(sizes->count(), 2);
        QCOMPARE(sizes->itemData(0).toInt(), 0);
        QCOMPARE(sizes->itemData(1).toInt(), 1);
        // Only the show tick is visible until the sheet says otherwise.
        cell.show();
        QVERIFY(cell.activeCheckbox()->isVisible());
        QVERIFY(!cell.downloadCheckbox()->isVisible());
        QVERIFY(!sizes->isVisible());
        // Focus given to the row lands on its show tick.
        cell.setFocus();
        QCOMPARE(cell.focusProxy(), cell.activeCheckbox());
    }

    void clickOnNameInCellSelectsNotTicks()
    {
        PressRecorder table;
        auto *layout = new QVBoxLayout(&table);
        auto *cell = new VoiceTableCellView;
        layout->addWidget(cell);
        cell->textField()->setText(QStringLiteral("Anna"));
        table.resize(400, 60);
        table.show();
        QVERIFY(QTest::qWaitForWindowExposed(&table));
        QTest::mouseClick(cell->textField(), Qt::LeftButton, {}, QPoint(2, 2));
        // The press travels label → cell → table (the cell does not take presses itself).
        QCOMPARE(table.presses.size(), 1);
        QVERIFY(!cell->activeCheckbox()->isChecked());
    }
};

QTEST_MAIN(VoiceRowViewsTest)
#include "tst_voicerowviews.moc"
