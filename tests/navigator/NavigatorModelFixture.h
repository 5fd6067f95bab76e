#pragma once

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "navigator/WNavDS.h"
#include "support/AmbrelTest.h"
#include "support/RecordingForeignWindows.h"
#include "support/RecordingItemWindowHub.h"
#include "support/RecordingMessageBox.h"
#include "support/RecordingProcessLauncher.h"

#include <QMap>

using namespace Qt::StringLiterals;
using Props = QMap<QString, QString>;

inline const Props kOpen{{u"open"_s, u"true"_s}};
inline const Props kDeleted{{u"deleted"_s, u"true"_s}};
inline const Props kLinked{{u"linked"_s, u"true"_s}};

// A notebook catalog made through the data store service, and the data source over it.
class NavigatorModelFixture : public AmbrelTest {
protected:
    void SetUp() override;

    // Adds a "folder", a "document" or else a note under parentId ("root" or an identifier);
    // answers its identifier.
    QString Add(const QString& type, const QString& parentId = u"root"_s, Props properties = {});
    QString Folder(const QString& parentId = u"root"_s) { return Add(u"folder"_s, parentId); }
    // A linked PDF document at the path, last used at the time (in seconds).
    QString Linked(const QString& path, std::int64_t accessed, bool deleted = false);
    // Hands the host to the data source and loads the catalog.
    WNavDS* Load();
    NavListItemData* Item(const QString& itemId) { return WNavDS::Instance()->FindItem(itemId); }
    // Writes the properties through the data source, as the other programs do.
    void Update(const QString& itemId, const Props& pairs, bool notify = true) {
        WNavDS::Instance()->UpdateItem(itemId, Set(pairs).get(), notify);
    }
    // One property of a catalog item; null when the item does not have it.
    QString CatalogValue(const QString& itemId, const QString& name);
    // Where the store keeps a file of an item.
    QString ItemFile(const QString& itemId, const QString& name = u"note.htm"_s) const {
        return AppDataFolder() + u"/Catalog/"_s + itemId + u'/' + name;
    }
    // A property set holding the pairs.
    static ReleasePtr<DataExchange::IProperties> Set(const Props& pairs);
    // A catalog time stamp.
    static QString Time(std::int64_t seconds);

    ReleasePtr<IDataStoreHost> host;
    IDataStoreService* service = nullptr;
    RecordingItemWindowHub hub;
    RecordingProcessLauncher launcher;
    RecordingMessageBox messages;
    RecordingForeignWindows windows;
};
