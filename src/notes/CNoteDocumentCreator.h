#pragma once

#include "notes/CHTMLBackgroundStyle.h"
#include "notes/INoteDocumentCreator.h"

class CNoteDocumentCreator final : public INoteDocumentCreator {
public:
    CNoteDocumentCreator();
    ~CNoteDocumentCreator() override = default;

    HRESULT SetTitle(const QString& title) override;
    HRESULT SetBackgroundImage(const QString& path) override;
    HRESULT SetBackgroundColor(std::uint32_t color) override;
    HRESULT SetFontFamily(const QString& family) override;
    HRESULT SetFontSize(std::uint32_t value, const QString& unit) override;
    HRESULT SetTextColor(std::uint32_t color) override;
    HRESULT SetReserved(std::uint32_t value) override;
    HRESULT SetMargin(std::uint32_t value) override;
    HRESULT SetContent(const QString& html) override;
    HRESULT SetFilePath(const QString& path) override;
    HRESULT Write() override;
    unsigned long Release() override;

    // The bytes of the note file as Write makes them: the UTF-8 document and one zero byte.
    QByteArray FileBytes();

private:
    QString DocumentText();

    QString m_title;
    QString m_filePath;
    QString m_fontFamily;
    QString m_fontSize;
    CHTMLBackgroundStyle m_background;
    QString m_textColor;
    QString m_content;
    QString m_margin;
};
