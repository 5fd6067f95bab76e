#include "ui/QtMessageBox.h"

#include "ui/ModalDialog.h"

#include <QApplication>
#include <QMessageBox>

using namespace Platform;

int QtMessageBox::Show(const QString& text, const QString& caption, unsigned style) {
    // A heap box: the window it belongs to may go while it is open.
    auto* const box = new QMessageBox(QApplication::activeWindow());
    ModalDialog modal(box);
    box->setWindowTitle(caption);
    box->setText(text);
    switch (style & 0xF0) {
    case MessageBoxStyle::IconError:
        box->setIcon(QMessageBox::Critical);
        break;
    case MessageBoxStyle::IconQuestion:
        box->setIcon(QMessageBox::Question);
        break;
    case MessageBoxStyle::IconWarning:
        box->setIcon(QMessageBox::Warning);
        break;
    case MessageBoxStyle::IconInformation:
        box->setIcon(QMessageBox::Information);
        break;
    default:
        break;
    }
    switch (style & 0xF) {
    case MessageBoxStyle::OkCancel:
        box->setStandardButtons(QMessageBox::Ok | QMessageBox::Cancel);
        break;
    case MessageBoxStyle::YesNo:
        box->setStandardButtons(QMessageBox::Yes | QMessageBox::No);
        break;
    default:
        box->setStandardButtons(QMessageBox::Ok);
    }
    if ((style & (MessageBoxStyle::SystemModal | MessageBoxStyle::SetForeground)) != 0)
        box->setWindowFlag(Qt::WindowStaysOnTopHint);
    switch (modal.Exec()) {
    case QMessageBox::Ok:
        return MessageBoxAnswer::Ok;
    case QMessageBox::Cancel:
        return MessageBoxAnswer::Cancel;
    case QMessageBox::Yes:
        return MessageBoxAnswer::Yes;
    case QMessageBox::No:
        return MessageBoxAnswer::No;
    default:
        // Closed without an answer, when the program ends: the cautious one.
        return (style & 0xF) == MessageBoxStyle::YesNo      ? MessageBoxAnswer::No
               : (style & 0xF) == MessageBoxStyle::OkCancel ? MessageBoxAnswer::Cancel
                                                            : MessageBoxAnswer::Ok;
    }
}
