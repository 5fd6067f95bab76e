#pragma once

#include "common/Result.h"
#include "messaging/IWindowCallback.h"
#include "platform/IForeignWindows.h"

#include <QList>
#include <QMap>
#include <QString>

// The windows one of the product's programs has open, by item identifier compared without
// regard to case.
class ItemWindowMap {
public:
    void Clear() { m_windows.clear(); }
    void Set(const QString& itemId, Platform::WindowHandle window) {
        m_windows.insert(Key(itemId), window);
    }
    void Remove(const QString& itemId) { m_windows.remove(Key(itemId)); }
    // Forgets every item shown in the window.
    void RemoveWindow(Platform::WindowHandle window) {
        m_windows.removeIf([window](const auto& entry) { return entry.value() == window; });
    }
    bool Contains(const QString& itemId) const { return m_windows.contains(Key(itemId)); }
    int Count() const { return static_cast<int>(m_windows.size()); }

    // S_OK with the window, or S_FALSE when the item has none.
    HRESULT Find(const QString& itemId, Platform::WindowHandle* window) const {
        const auto found = m_windows.constFind(Key(itemId));
        if (found == m_windows.cend())
            return S_FALSE;
        if (window != nullptr)
            *window = found.value();
        return S_OK;
    }

    // Answers the callback's last result.
    HRESULT ForEach(IWindowCallback* callback) const {
        if (callback == nullptr)
            return E_INVALIDARG;
        HRESULT result = S_OK;
        // A copy: the callback may lead to windows being reported or removed meanwhile.
        const QList<Platform::WindowHandle> windows = m_windows.values();
        for (const Platform::WindowHandle window : windows)
            result = callback->Apply(window, 0);
        return result;
    }

    static QString Key(const QString& itemId) { return itemId.toCaseFolded(); }

private:
    QMap<QString, Platform::WindowHandle> m_windows;
};
