#pragma once

#include "common/IUnicodeString.h"

namespace Brindle::Application {

// Where the program's own files and its language files lie.
class IApplicationInfo {
public:
    virtual unsigned long AddRef() = 0;
    virtual unsigned long Release() = 0;
    virtual HRESULT SetLanguage(const QString& code) = 0;
    virtual HRESULT GetProgramFolder(IUnicodeString* sink) = 0;
    virtual HRESULT GetLanguageFolder(IUnicodeString* sink) = 0;

protected:
    virtual ~IApplicationInfo() = default;
};

} // namespace Brindle::Application
