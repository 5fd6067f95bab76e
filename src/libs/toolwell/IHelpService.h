#pragma once

#include "common/Result.h"

// The help menu's services: the user guide, the product's website and the about box. The
// object stays the library's: callers never release it.
class IHelpService {
public:
    // Both open the user guide's contents page; E_FAIL when the guide is not installed.
    virtual HRESULT ShowHelpTopics() = 0;
    virtual HRESULT ShowUserGuide() = 0;
    // 1 when the user guide is installed, else 0 (the help menu then leaves it out).
    virtual int HasUserGuide() = 0;
    // Opens the website named by the machine's settings; E_FAIL without one.
    virtual HRESULT OpenWebsite() = 0;
    // True when the machine's settings name a website (the command is disabled otherwise).
    virtual bool HasWebsite() = 0;
    // The product's name, version and licence in an information box.
    virtual HRESULT ShowAbout() = 0;

protected:
    virtual ~IHelpService() = default;
};

IHelpService* GetHelpService();
