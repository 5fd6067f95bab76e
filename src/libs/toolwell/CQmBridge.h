#pragma once

#include "libs/toolwell/IQmBridge.h"
#include "libs/toolwell/WordProcessor.h"

class QTemporaryDir;

// The bridge on this platform: the word processor is a program started with the files to open.
class CQmBridge final : public IQmBridge {
public:
    HRESULT ConnectToQm(Platform::WindowHandle owner, IUnicodeString* target) override;
    HRESULT CreateDocument(int templateIndex, const QString& target, int show) override;
    HRESULT SendNotesToQm(const QStringList& notePaths, const QString& title,
                          const QString& target) override;
    HRESULT SendDocumentToQm(const QString& path, const QString& target, bool inNotebook) override;
    HRESULT SendPictureToQm(const QString& picturePath, const QString& target) override;
    HRESULT PasteClipboardToQm() override;
    int GetSendToChoice() override;
    HRESULT SetSendToChoice(int choice) override;
    void Release() override { delete this; }

private:
    ~CQmBridge() override = default;

    // The word processor that `target` stands for: E_FAIL when there is none, E_INVALIDARG
    // when the target names another program.
    static HRESULT Resolve(const QString& target, WordProcessor* processor);
    // Starts the word processor on the files. A hand-over folder is kept for it only when it
    // started; otherwise the folder goes away with its files.
    static HRESULT Open(const WordProcessor& processor, const QStringList& paths,
                        QTemporaryDir* handOver = nullptr);
};
