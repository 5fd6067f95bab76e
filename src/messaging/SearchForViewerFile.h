#pragma once

#include "messaging/IDataIteration.h"

#include <QString>

// Finds the document item whose "path" names a given file. Both paths are made absolute and
// clean first; the comparison then follows the file system (case-sensitive here).
class SearchForViewerFile final : public IDataIteration {
public:
    void SetTarget(const QString& path);
    const QString& Target() const { return m_target; }
    bool Visit(DataExchange::IProperties* properties) override;

    // The absolute, clean form in which paths are compared; empty for an empty path.
    static QString FullPath(const QString& path);

private:
    QString m_target;
};
