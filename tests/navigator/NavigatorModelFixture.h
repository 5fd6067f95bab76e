#pragma once

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "navigator/WNavDS.h"
#include "support/AmbrelTest.h"
#include "support/RecordingItemWindowHub.h"
#include "support/RecordingProcessLauncher.h"

#include <QMap>

// A notebook catalog made through the data store service, and the data source over it.
class NavigatorModelFixture : public AmbrelTest {
protected:
    void SetUp() override;
    void TearDown() override;

    // Adds an item of the type under parentId ("root" or an identifier) with the properties;
    // answers its identifier.
    QString Add(const QString& type, const QString& parentId,
                const QMap<QString, QString>& properties = {});
    // Hands the host to the data source and loads the catalog.
    WNavDS* Load();
    // One property of a catalog item; null when the item does not have it.
    QString CatalogValue(const QString& itemId, const QString& name);
    // A property set holding the pairs; the caller releases it.
    static ReleasePtr<DataExchange::IProperties> Set(const QMap<QString, QString>& pairs);

    ReleasePtr<IDataStoreHost> host;
    IDataStoreService* service = nullptr;
    RecordingItemWindowHub hub;
    RecordingProcessLauncher launcher;
};
