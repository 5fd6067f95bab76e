#pragma once

#include "common/Result.h"

#include <QString>

// A string sink: how an interface hands a string back to its caller. A null QString stands
// for a null pointer and is refused; an empty but non-null QString is a valid value.
class IUnicodeString {
public:
    virtual ~IUnicodeString() = default;
    virtual HRESULT Assign(const QString& value) = 0;
};

// Replaces the caller's string.
class UnicodeStringPtr final : public IUnicodeString {
public:
    explicit UnicodeStringPtr(QString* target) : m_target(target) {}
    HRESULT Assign(const QString& value) override {
        if (m_target == nullptr || value.isNull())
            return E_FAIL;
        *m_target = value;
        return S_OK;
    }

private:
    QString* m_target;
};

// Appends to the caller's string.
class AppendUnicodeStringPtr final : public IUnicodeString {
public:
    explicit AppendUnicodeStringPtr(QString* target) : m_target(target) {}
    HRESULT Assign(const QString& value) override {
        if (m_target == nullptr || value.isNull())
            return E_FAIL;
        if (m_target->isNull())
            *m_target = value; // keeps an empty value non-null
        else
            m_target->append(value);
        return S_OK;
    }

private:
    QString* m_target;
};
