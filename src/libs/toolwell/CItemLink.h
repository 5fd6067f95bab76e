#pragma once

#include "libs/toolwell/IItemLink.h"

// A recently used list kept in the registry stand-in under one key, as JSON text, so titles
// with any characters survive the settings file.
class CItemLink final : public IItemLink {
public:
    // The most entries a list keeps; the oldest drop out beyond it.
    static constexpr int MaxEntries = 10;

    explicit CItemLink(const QString& valueName);

    HRESULT AnnounceItem(const QString& itemId, const QString& title) override;
    HRESULT SetTitle(const QString& itemId, const QString& title) override;
    HRESULT ForgetItem(const QString& itemId) override;
    QList<ItemLinkEntry> Items() override;
    void Release() override { delete this; }

private:
    ~CItemLink() override = default;
    bool Write(const QList<ItemLinkEntry>& entries);

    QString m_valueName;
};
