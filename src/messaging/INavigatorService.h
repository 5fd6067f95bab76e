#pragma once

#include "common/IUnicodeString.h"
#include "common/Result.h"

#include <QString>

class IWindowCallback;

namespace DataExchange {
class IProperties;
}

// The running navigator's item operations, for the message dispatcher and for modules loaded
// into the navigator's process.
class INavigatorService {
public:
    // "type" "note" makes a note, "document" a linked document (either in any letter case),
    // giving the new identifier to the sink; E_FAIL for a null set or any other type.
    virtual HRESULT CreateItem(DataExchange::IProperties* properties,
                               IUnicodeString* itemIdSink) = 0;
    virtual HRESULT UpdateItemProperties(const QString& itemId,
                                         DataExchange::IProperties* properties) = 0;
    // Copies the linked document into the notebook.
    virtual HRESULT SaveDocumentToNotebook(const QString& itemId) = 0;
    // Apply(window, 0) once with the navigator's main window (0 when there is none); answers
    // the callback's result.
    virtual HRESULT ForEachWindow(IWindowCallback* callback) = 0;

protected:
    virtual ~INavigatorService() = default;
};

// The service of the running application object, or null when there is none. Exported from
// the program, so that modules it loads find it.
extern "C" INavigatorService* GetNavigatorServiceInterface();
