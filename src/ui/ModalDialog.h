#pragma once

#include <QDialog>
#include <QPointer>

// Runs one dialog modally as a heap object that may vanish while it is open: its parent may be
// destroyed inside its nested event loop, or the program may end. The main frame closes every
// open one before it goes, so a close, SIGTERM or hand-over during a modal ends cleanly.
class ModalDialog final {
public:
    // Takes over a heap dialog; it is deleted with this object unless it went earlier.
    explicit ModalDialog(QDialog* dialog);
    ~ModalDialog();
    ModalDialog(const ModalDialog&) = delete;
    ModalDialog& operator=(const ModalDialog&) = delete;

    // Shows the dialog modally and answers its result code: QDialog::Rejected when it was
    // closed from outside, went with its parent, or was refused because the program is ending.
    int Exec();

    // The dialog, for reading its answer after Exec; null once it has gone.
    template <class Dialog> Dialog* Get() const { return qobject_cast<Dialog*>(m_dialog.data()); }

    // While one of these lives every open modal is closed and no new one opens: the main frame
    // holds one while it shuts down.
    class ClosingAll final {
    public:
        ClosingAll();
        ~ClosingAll();
        ClosingAll(const ClosingAll&) = delete;
        ClosingAll& operator=(const ClosingAll&) = delete;
    };

private:
    QPointer<QDialog> m_dialog;
};
