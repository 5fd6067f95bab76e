#include "messaging/SearchForViewerFile.h"

#include "dataexchange/IProperties.h"

#include <QDir>

QString SearchForViewerFile::FullPath(const QString& path) {
    if (path.isEmpty())
        return {};
    return QDir::cleanPath(QDir::current().absoluteFilePath(path));
}

void SearchForViewerFile::SetTarget(const QString& path) {
    m_target = FullPath(path);
}

bool SearchForViewerFile::Visit(DataExchange::IProperties* properties) {
    if (properties == nullptr || m_target.isEmpty())
        return false;
    QString path;
    UnicodeStringPtr sink(&path);
    if (properties->GetProperty(QStringLiteral("path"), &sink) != S_OK || path.isEmpty())
        return false;
    return FullPath(path) == m_target;
}
