#pragma once

#include "common/IUnicodeString.h"
#include "common/Result.h"
#include "platform/IForeignWindows.h"

#include <QString>
#include <QStringList>

// Hands notes, documents, pictures and the clipboard to the word processor. Every operation
// finds the word processor afresh, so a bridge that connected and another that sends agree
// as long as the configuration did not change in between.
//
// The target text is the word processor's program path as the connect step found it. An
// empty target means "whichever word processor is configured now"; a target naming any other
// program is refused, so that a target arriving in a message can never choose what is run.
//
// Files are opened in the word processor by starting it detached with their paths; it takes
// its time to read them, so the temporary files the bridge writes for it (clipboard, pictures,
// copies) stay in their own folder under the temporary folder.
class IQmBridge {
public:
    // S_OK and the target text in `target` (when given) when a word processor is there,
    // E_FAIL otherwise. The bridge asks nothing of the user here, so `owner` only names the
    // window on whose behalf it connects.
    virtual HRESULT ConnectToQm(Platform::WindowHandle owner, IUnicodeString* target) = 0;
    // Starts the word processor with a new, empty document. Only the blank template (0) exists,
    // and the document is always shown (`show` must be 1).
    virtual HRESULT CreateDocument(int templateIndex, const QString& target, int show) = 0;
    // Opens the note files in the word processor, in list order. Missing files are left out;
    // S_FALSE when the list is empty, E_FAIL when none of the files exists. The word processor
    // shows each note under the title its file carries, so `title` is not needed to open them.
    virtual HRESULT SendNotesToQm(const QStringList& notePaths, const QString& title,
                                  const QString& target) = 0;
    // Opens the document in the word processor: a linked document in place, a document that
    // lives in the notebook as a copy, so that the notebook's file changes only through the
    // navigator.
    virtual HRESULT SendDocumentToQm(const QString& path, const QString& target,
                                     bool inNotebook) = 0;
    // Opens a picture in the word processor as a document that shows it.
    virtual HRESULT SendPictureToQm(const QString& picturePath, const QString& target) = 0;
    // Opens the clipboard's rich text, picture or plain text (the first there is) in the word
    // processor; E_FAIL when the clipboard holds none of them.
    virtual HRESULT PasteClipboardToQm() = 0;
    // Where the user prefers items sent: 0 the product's word processor, 1 the other office
    // word processor, 2 ask each time. Kept in the registry stand-in beside the command; 0 until
    // the user chose. SetSendToChoice refuses anything else with E_INVALIDARG.
    virtual int GetSendToChoice() = 0;
    virtual HRESULT SetSendToChoice(int choice) = 0;
    virtual void Release() = 0;

protected:
    virtual ~IQmBridge() = default;
};

// A new bridge for each call, ended with Release(); never null on this platform (whether a
// word processor is there is the connect step's answer).
IQmBridge* GetQmBridge();
