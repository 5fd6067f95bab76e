#include "NavigatorModelFixture.h"

#include "dataexchange/WProperties.h"
#include "messaging/CNoteToolService.h"
#include "messaging/CViewerService.h"
#include "settings/NavigatorSettings.h"

void NavigatorModelFixture::SetUp() {
    AmbrelTest::SetUp();
    Platform::SetProcessLauncher(&launcher);
    SetItemWindowHub(&hub);
    host.reset(GetDataStoreHost());
    service = CreateDataStoreService(host.get());
    ASSERT_NE(service, nullptr);
}

void NavigatorModelFixture::TearDown() {
    WNavDS::DestroyInstance();
    NavigatorSettings::DestroyInstance();
    CNoteToolService::ResetInstance();
    CViewerService::ResetInstance();
    if (IDataStoreService* current = GetDataStoreService())
        current->Release();
    SetItemWindowHub(nullptr);
    AmbrelTest::TearDown();
}

ReleasePtr<DataExchange::IProperties>
NavigatorModelFixture::Set(const QMap<QString, QString>& pairs) {
    ReleasePtr<DataExchange::IProperties> set(DataExchange::CreateProperties());
    for (auto pair = pairs.cbegin(); pair != pairs.cend(); ++pair)
        set->SetProperty(pair.key(), pair.value());
    return set;
}

QString NavigatorModelFixture::Add(const QString& type, const QString& parentId,
                                   const QMap<QString, QString>& properties) {
    QMap<QString, QString> pairs = properties;
    if (!type.isEmpty())
        pairs.insert(QStringLiteral("type"), type);
    if (!pairs.contains(QStringLiteral("title")))
        pairs.insert(QStringLiteral("title"), type + QStringLiteral(" item"));
    ReleasePtr<DataExchange::IProperties> set = Set(pairs);
    QString id;
    UnicodeStringPtr sink(&id);
    HRESULT hr = E_FAIL;
    if (type == QLatin1StringView("folder"))
        hr = service->CreateFolder(set.get(), &sink);
    else if (type == QLatin1StringView("document"))
        hr = service->CreateDocument(set.get(), &sink);
    else
        hr = service->CreateNote(set.get(), &sink);
    EXPECT_EQ(hr, S_OK);
    if (parentId != QLatin1StringView("root")) {
        EXPECT_EQ(service->MoveItem(id, parentId), S_OK);
    }
    return id;
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
    if (set->GetProperty(name, &sink) != S_OK)
        return {};
    return value;
}
