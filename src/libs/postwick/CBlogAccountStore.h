#pragma once

#include "libs/postwick/IPostwick.h"

#include <QList>
#include <QString>

// The blog accounts file: every account's properties (never its password) and which account
// is the default. Each change is written at once, whole, over the old file.
class CBlogAccountStore final {
public:
    explicit CBlogAccountStore(const QString& file);

    const QList<Postwick::AccountProperties>& Accounts() const { return m_accounts; }
    // The index of the account of that name, or -1.
    qsizetype Find(const QString& name) const;
    QString DefaultName() const { return m_default; }

    bool SetDefault(const QString& name);
    // Adds, or replaces the account called `oldName`; a renamed default stays the default.
    bool Put(const QString& oldName, const Postwick::AccountProperties& account);
    bool Remove(const QString& name);

private:
    bool Save() const;

    QString m_file;
    QList<Postwick::AccountProperties> m_accounts;
    QString m_default;
};
