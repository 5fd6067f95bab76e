#pragma once

// Realistic notebooks for the benchmarks: folders nested up to three deep, notes and documents
// with a dozen properties each, a few linked documents and some deleted items. Written the way
// the catalog store writes them (UTF-16 with byte-order mark, indented).

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "libs/toolwell/CDataStoreHost.h"

#include <QDir>
#include <QString>
#include <QTemporaryDir>

#include <pugixml.hpp>

#include <cstdio>
#include <functional>
#include <map>
#include <memory>
#include <random>
#include <string>
#include <vector>

namespace Bench {

struct GeneratedCatalog {
    // The application data folder: the catalog is "Catalog/catalog.xml" below it, as the data
    // store host expects.
    QString appDataFolder;
    QString catalogPath;
    std::vector<QString> folders;
    std::vector<QString> notes;
    std::vector<QString> documents;
};

inline std::string RandomIdentifier(std::mt19937& random) {
    char text[37];
    std::snprintf(text, sizeof text, "%08X-%04X-%04X-%04X-%04X%08X",
                  static_cast<unsigned>(random()), static_cast<unsigned>(random() & 0xFFFF),
                  static_cast<unsigned>(random() & 0xFFFF),
                  static_cast<unsigned>(random() & 0xFFFF),
                  static_cast<unsigned>(random() & 0xFFFF), static_cast<unsigned>(random()));
    return text;
}

inline void AddProperty(pugi::xml_node properties, const char* name, const std::string& value) {
    properties.append_child(name).text().set(value.c_str());
}

// Writes a catalog of itemCount items to catalogPath (its folder must exist).
inline GeneratedCatalog WriteCatalog(const QString& catalogPath, int itemCount, unsigned seed) {
    GeneratedCatalog result;
    result.catalogPath = catalogPath;
    std::mt19937 random(seed);
    pugi::xml_document document;
    pugi::xml_node declaration = document.append_child(pugi::node_declaration);
    declaration.append_attribute("version") = "1.0";
    declaration.append_attribute("encoding") = "UTF-16";
    pugi::xml_node archive = document.append_child("archive");
    archive.append_attribute("majorversion") = "1";
    archive.append_attribute("minorversion") = "0";
    pugi::xml_node organization = archive.append_child("organization");
    organization.append_attribute("scheme") = "folders";
    pugi::xml_node root = organization.append_child("root");
    pugi::xml_node items = archive.append_child("items");

    const int folderCount = std::max(3, itemCount / 20);
    const int linkedCount = std::min(100, itemCount / 100 + 1);
    std::vector<pugi::xml_node> folderNodes; // organization nodes of folders above level 3
    std::vector<pugi::xml_node> allFolderNodes;
    std::vector<int> folderLevels;
    const std::string date = "2024-06-11T09:30:00Z";

    for (int i = 0; i < itemCount; ++i) {
        const std::string id = RandomIdentifier(random);
        const QString qid = QString::fromStdString(id);
        const bool deleted = random() % 50 == 0;
        std::string kind;
        if (i < folderCount)
            kind = "folder";
        else if (random() % 5 == 0)
            kind = "document";
        else
            kind = "note";

        pugi::xml_node item = items.append_child(kind.c_str());
        item.append_attribute("uuid") = id.c_str();
        pugi::xml_node properties = item.append_child("properties");
        AddProperty(properties, "type", kind);
        AddProperty(properties, "title", kind + " number " + std::to_string(i) + " & more");
        if (deleted)
            AddProperty(properties, "deleted", "true");

        // Folders form the upper levels; the first few sit at the top.
        pugi::xml_node parent = root;
        int level = 1;
        if (kind == "folder") {
            if (i >= 3 && !folderNodes.empty()) {
                const std::size_t at = random() % folderNodes.size();
                parent = folderNodes[at];
                level = folderLevels[at] + 1;
            }
        } else if (random() % 10 != 0) {
            parent = allFolderNodes[random() % allFolderNodes.size()];
        }
        pugi::xml_node child = parent.append_child("child");
        child.append_attribute("uuidref") = id.c_str();

        if (kind == "folder") {
            AddProperty(properties, "expanded", random() % 2 ? "true" : "false");
            allFolderNodes.push_back(child);
            if (level < 3) {
                folderNodes.push_back(child);
                folderLevels.push_back(level);
            }
            result.folders.push_back(qid);
        } else if (kind == "document") {
            const bool linked = static_cast<int>(result.documents.size()) < linkedCount;
            static const char* const subtypes[] = {"qmd", "doc", "pdf"};
            const std::string file = "Document " + std::to_string(i) + ".pdf";
            AddProperty(properties, "subtype", subtypes[random() % 3]);
            AddProperty(properties, "path", linked ? "/home/user/Documents/" + file : "");
            AddProperty(properties, "filename", file);
            AddProperty(properties, "linked", linked ? "true" : "false");
            AddProperty(properties, "open", "false");
            AddProperty(properties, "datecreated", date);
            AddProperty(properties, "dateaccessed", date);
            AddProperty(properties, "author", "A. Writer");
            AddProperty(properties, "pages", std::to_string(1 + random() % 40));
            AddProperty(properties, "size", std::to_string(10000 + random() % 1000000));
            result.documents.push_back(qid);
        } else {
            AddProperty(properties, "filename", "note.htm");
            AddProperty(properties, "open", "false");
            AddProperty(properties, "datecreated", date);
            AddProperty(properties, "dateaccessed", date);
            AddProperty(properties, "font", "Segoe Print");
            AddProperty(properties, "fontsize", "12");
            AddProperty(properties, "backgroundcolor", "255,255,204");
            AddProperty(properties, "backgroundimage", "");
            AddProperty(properties, "size", "525,400");
            AddProperty(properties, "keepontop", "false");
            result.notes.push_back(qid);
        }
    }
    document.save_file(catalogPath.toLocal8Bit().constData(), "\t",
                       pugi::format_default | pugi::format_write_bom, pugi::encoding_utf16_le);
    return result;
}

// A catalog of itemCount items in a temporary application data folder, made once per size
// and kept for the life of the benchmark program.
inline const GeneratedCatalog& PrepareCatalog(int itemCount) {
    static QTemporaryDir home;
    static std::map<int, GeneratedCatalog> made;
    const auto it = made.find(itemCount);
    if (it != made.end())
        return it->second;
    const QString appData = home.path() + QStringLiteral("/") + QString::number(itemCount);
    QDir().mkpath(appData + QStringLiteral("/Catalog"));
    GeneratedCatalog catalog =
        WriteCatalog(appData + QStringLiteral("/Catalog/catalog.xml"), itemCount, 20240611u);
    catalog.appDataFolder = appData;
    return made.emplace(itemCount, std::move(catalog)).first->second;
}

// The data store service over the catalog, loaded once and kept while the benchmarks of that
// size run. onNewCatalog gets the host whenever another catalog had to be opened.
inline IDataStoreService*
ServiceFor(const GeneratedCatalog& catalog,
           const std::function<void(IDataStoreHost*)>& onNewCatalog = {}) {
    static QString loaded;
    IDataStoreService* service = GetDataStoreService();
    if (service != nullptr && loaded == catalog.appDataFolder)
        return service;
    if (service != nullptr)
        service->Shutdown(0);
    ReleasePtr<IDataStoreHost> host(new CDataStoreHost(catalog.appDataFolder));
    loaded = catalog.appDataFolder;
    IDataStoreService* created = CreateDataStoreService(host.get());
    if (onNewCatalog)
        onNewCatalog(host.get());
    return created;
}

} // namespace Bench
