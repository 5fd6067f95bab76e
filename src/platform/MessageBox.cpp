#include "platform/IMessageBox.h"

#include <QDebug>

namespace Platform {

namespace {

class StandardErrorMessageBox final : public IMessageBox {
public:
    int Show(const QString& text, const QString& caption, unsigned) override {
        qWarning().noquote() << caption << text;
        return MessageBoxAnswer::Ok;
    }
};

IMessageBox* g_messageBox = nullptr;

} // namespace

IMessageBox& MessageBox() {
    static StandardErrorMessageBox fallback;
    return g_messageBox != nullptr ? *g_messageBox : fallback;
}

void SetMessageBox(IMessageBox* messageBox) {
    g_messageBox = messageBox;
}

} // namespace Platform
