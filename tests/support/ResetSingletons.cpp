#include "support/ResetSingletons.h"

#include "catalog/IDataStoreService.h"
#include "libs/lustre/CVisualStyleManager.h"
#include "libs/sheen/ThemeUtilities.h"
#include "libs/toolwell/CHarborUtils.h"
#include "libs/toolwell/IItemWindowHub.h"
#include "libs/toolwell/ISnapshotService.h"
#include "messaging/CNoteToolService.h"
#include "messaging/CViewerService.h"
#include "navigator/WNavDS.h"
#include "platform/IForeignWindows.h"
#include "platform/IMessageBox.h"
#include "platform/IProcessLauncher.h"
#include "platform/IWaitCursor.h"
#include "platform/Registry.h"
#include "platform/SaveFailureNotice.h"
#include "settings/NavigatorSettings.h"

void ResetSingletons() {
    ReleaseHarborUtilsInterface();
    SetHarborUtilsForTesting(nullptr);
    Platform::SetMessageBox(nullptr);
    Platform::SaveFailureNotice::DestroyInstance();
    Platform::SetWaitCursor(nullptr);
    Platform::SetProcessLauncher(nullptr);
    Platform::Registry::SetMachineFile({});
    SetSnapshotNoteHandler({});
    WNavDS::DestroyInstance();
    if (IDataStoreService* service = GetDataStoreService())
        service->Shutdown(0);
    NavigatorSettings::DestroyInstance();
    CNoteToolService::ResetInstance();
    CViewerService::ResetInstance();
    SetItemWindowHub(nullptr);
    Platform::SetForeignWindows(nullptr);
    ShutdownThemeUtilities();
    DeleteVisualStyleManager();
}
