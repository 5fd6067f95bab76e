#pragma once

#include <QString>

namespace Platform {

// Message box styles and answers, with the values the rest of the product uses.
namespace MessageBoxStyle {
enum : unsigned {
    Ok = 0x0,
    OkCancel = 0x1,
    YesNo = 0x4,
    IconError = 0x10,
    IconQuestion = 0x20,
    IconWarning = 0x30,
    IconInformation = 0x40,
    SystemModal = 0x1000,
    SetForeground = 0x10000,
};
}
namespace MessageBoxAnswer {
enum : int { Ok = 1, Cancel = 2, Yes = 6, No = 7 };
}

// Shows a message to the user and answers the button chosen.
class IMessageBox {
public:
    virtual ~IMessageBox() = default;
    virtual int Show(const QString& text, const QString& caption, unsigned style) = 0;
};

// The message box in use. Until the user interface installs its own, messages go to the
// standard error stream and are answered with Ok.
IMessageBox& MessageBox();
void SetMessageBox(IMessageBox* messageBox);

} // namespace Platform
