#pragma once

#include "dataexchange/IDataStoreReporter.h"

#include <QStringList>

// Collects every item of a store walk, all descendants included, in the order reported.
class CRecursiveChildrenReporter final : public IDataStoreReporter {
public:
    HRESULT ReportItem(const QString& identifier) override {
        m_items.append(identifier);
        return S_OK;
    }
    int SkipChildren() override { return 0; }

    const QStringList& Items() const { return m_items; }

private:
    QStringList m_items;
};
