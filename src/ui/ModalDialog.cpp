#include "ui/ModalDialog.h"

#include <QList>

namespace {

// The dialogs whose Exec is running, innermost last.
QList<QPointer<QDialog>>& OpenDialogs() {
    static QList<QPointer<QDialog>> open;
    return open;
}

int g_closingAll = 0;

} // namespace

ModalDialog::ModalDialog(QDialog* dialog) : m_dialog(dialog) {
    // This object decides when the dialog goes; a close must not free it under Exec.
    if (dialog != nullptr)
        dialog->setAttribute(Qt::WA_DeleteOnClose, false);
}

ModalDialog::~ModalDialog() {
    delete m_dialog.data();
}

int ModalDialog::Exec() {
    if (!m_dialog || g_closingAll > 0)
        return QDialog::Rejected;
    OpenDialogs().append(m_dialog);
    const QPointer<QDialog> dialog = m_dialog;
    // QDialog::exec answers Rejected by itself when the dialog is destroyed in its loop.
    const int result = dialog->exec();
    OpenDialogs().removeAll(dialog);
    OpenDialogs().removeAll(nullptr);
    return dialog ? result : QDialog::Rejected;
}

ModalDialog::ClosingAll::ClosingAll() {
    ++g_closingAll;
    // Each nested loop ends once the code that runs inside it returns.
    const QList<QPointer<QDialog>> open = OpenDialogs();
    for (const QPointer<QDialog>& dialog : open) {
        if (dialog)
            dialog->done(QDialog::Rejected);
    }
}

ModalDialog::ClosingAll::~ClosingAll() {
    --g_closingAll;
}
