// SPDX-FileCopyrightText: 2026 The Cadenza developers
// SPDX-License-Identifier: LGPL-2.1-or-later
#include "Alert.h"

#include <QApplication>
#include <QMessageBox>
#include <QPointer>
#include <QPushButton>
#include <QTimer>

namespace Cadenza::Platform {

namespace {
struct AlertState
{
    Alert::Responder responder;
    QList<AlertRequest> answered;
    int beeps = 0;
};

AlertState &state()
{
    static AlertState alerts;
    return alerts;
}

QMessageBox *makeBox(const AlertRequest &request, QWidget *parent)
{
    auto *box = new QMessageBox(parent);
    box->setObjectName(QStringLiteral("alert"));
    box->setText(request.title);
    box->setInformativeText(request.message);
    if (!request.icon.isNull()) {
        box->setIconPixmap(request.icon.pixmap(64, 64));
    } else {
        box->setIcon(QMessageBox::Warning);
    }
    // Screen readers name the alert by its title.
    box->setWindowTitle(request.title);
    for (int i = 0; i < request.buttons.size(); ++i) {
        // The first button is the default; the second, when there are more, is Cancel and answers Escape
        // (a lone button answers it too). Roles only place the buttons; the answer is the index.
        const auto role = i == 0 ? QMessageBox::AcceptRole
                                 : (i == 1 ? QMessageBox::RejectRole : QMessageBox::DestructiveRole);
        QPushButton *button = box->addButton(request.buttons.at(i), role);
        button->setProperty("alertAnswer", i);
        if (i == 0) {
            box->setDefaultButton(button);
        }
        if (i == 1 || request.buttons.size() == 1) {
            box->setEscapeButton(button);
        }
    }
    return box;
}

int answerOf(QMessageBox *box)
{
    QAbstractButton *clicked = box->clickedButton();
    return clicked ? clicked->property("alertAnswer").toInt() : -1;
}
} // namespace

int Alert::runModal(const AlertRequest &request, QWidget *parent)
{
    if (state().responder) {
        state().answered.append(request);
        return state().responder(request);
    }
    QMessageBox *box = makeBox(request, parent);
    box->setWindowModality(Qt::ApplicationModal);
    box->exec();
    const int answer = answerOf(box);
    delete box;
    return answer;
}

void Alert::beginSheet(const AlertRequest &request, QWidget *window, std::function<void(int)> answered)
{
    AlertRequest sheet = request;
    sheet.asSheet = true;
    if (state().responder) {
        state().answered.append(sheet);
        const int answer = state().responder(sheet);
        // Sheets answer later, from the event loop, as a user would.
        QTimer::singleShot(0, qApp, [answered = std::move(answered), answer] { answered(answer); });
        return;
    }
    QMessageBox *box = makeBox(sheet, window);
    box->setWindowModality(window ? Qt::WindowModal : Qt::ApplicationModal);
    box->setAttribute(Qt::WA_DeleteOnClose);
    QObject::connect(box, &QMessageBox::finished, box,
        [box, answered = std::move(answered)](int) { answered(answerOf(box)); });
    box->open();
}

void Alert::beep()
{
    if (state().responder) {
        ++state().beeps;
        return;
    }
    QApplication::beep();
}

void Alert::setResponder(Responder responder)
{
    state().responder = std::move(responder);
    state().answered.clear();
    state().beeps = 0;
}

QList<AlertRequest> Alert::answeredRequests()
{
    return state().answered;
}

int Alert::beepCount()
{
    return state().beeps;
}

} // namespace Cadenza::Platform
