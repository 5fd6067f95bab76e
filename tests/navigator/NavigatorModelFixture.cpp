#include "NavigatorModelFixture.h"

#include "dataexchange/WProperties.h"
#include "libs/toolwell/Formats.h"

void NavigatorModelFixture::SetUp() {
    AmbrelTest::SetUp();
    Platform::SetProcessLauncher(&launcher);
    Platform::SetMessageBox(&messages);
    Platform::SetForeignWindows(&windows);
    SetItemWindowHub(&hub);
    host.reset(GetDataStoreHost());
    service = CreateDataStoreService(host.get());
    ASSERT_NE(service, nullptr);
}

ReleasePtr<DataExchange::IProperties> NavigatorModelFixture::Set(const Props& pairs) {
    ReleasePtr<DataExchange::IProperties> set(DataExchange::CreateProperties());
    for (auto pair = pairs.cbegin(); pair != pairs.cend(); ++pair)
        set->SetProperty(pair.key(), pair.value());
    return set;
}

QString NavigatorModelFixture::Time(std::int64_t seconds) {
    QString text;
    FormatTime(&text, seconds);
    return text;
}

QString NavigatorModelFixture::Add(const QString& type, const QString& parentId, Props properties) {
    if (!type.isEmpty())
        properties.insert(u"type"_s, type);
    if (!properties.contains(u"title"_s))
        properties.insert(u"title"_s, type + u" item"_s);
    auto create = type == u"folder"_s     ? &IDataStoreService::CreateFolder
                  : type == u"document"_s ? &IDataStoreService::CreateDocument
                                          : &IDataStoreService::CreateNote;
    QString id;
    UnicodeStringPtr sink(&id);
    EXPECT_EQ((service->*create)(Set(properties).get(), &sink), S_OK);
    if (parentId != u"root"_s) {
        EXPECT_EQ(service->MoveItem(id, parentId), S_OK);
    }
    return id;
}

QString NavigatorModelFixture::Linked(const QString& path, std::int64_t accessed, bool deleted) {
    Props properties{{u"linked"_s, u"true"_s},
                     {u"path"_s, path},
                     {u"subtype"_s, u"pdf"_s},
                     {u"dateaccessed"_s, Time(accessed)}};
    if (deleted)
        properties.insert(kDeleted);
    return Add(u"document"_s, u"root"_s, properties);
}

WNavDS* NavigatorModelFixture::Load() {
    WNavDS* model = WNavDS::Instance();
    model->SetDataStoreHost(host.get());
    model->Initialize();
    return model;
}

QString NavigatorModelFixture::CatalogValue(const QString& itemId, const QString& name) {
    ReleasePtr<DataExchange::IProperties> set(DataExchange::CreateProperties());
    service->GetProperties(itemId, set.get());
    QString value;
    UnicodeStringPtr sink(&value);
    return set->GetProperty(name, &sink) == S_OK ? value : QString();
}
