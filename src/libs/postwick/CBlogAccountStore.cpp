#include "libs/postwick/CBlogAccountStore.h"

#include <QFile>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QSaveFile>

using namespace Qt::StringLiterals;

CBlogAccountStore::CBlogAccountStore(const QString& file) : m_file(file) {
    QFile stored(m_file);
    if (!stored.open(QIODevice::ReadOnly))
        return;
    const QJsonObject root = QJsonDocument::fromJson(stored.readAll()).object();
    for (const QJsonValue& entry : root.value(u"accounts"_s).toArray()) {
        const QJsonObject object = entry.toObject();
        Postwick::AccountProperties account;
        for (auto it = object.begin(); it != object.end(); ++it)
            account.insert(it.key(), it.value().toString());
        const QString name = account.value(Postwick::kAccountName);
        if (!name.isEmpty() && Find(name) < 0)
            m_accounts.append(account);
    }
    m_default = root.value(u"default"_s).toString();
    if (Find(m_default) < 0)
        m_default.clear();
}

qsizetype CBlogAccountStore::Find(const QString& name) const {
    for (qsizetype i = 0; i < m_accounts.size(); ++i) {
        if (m_accounts[i].value(Postwick::kAccountName) == name)
            return i;
    }
    return -1;
}

bool CBlogAccountStore::SetDefault(const QString& name) {
    if (Find(name) < 0)
        return false;
    m_default = name;
    return Save();
}

bool CBlogAccountStore::Put(const QString& oldName, const Postwick::AccountProperties& account) {
    const QString name = account.value(Postwick::kAccountName);
    const qsizetype existing = Find(name);
    const qsizetype old = oldName.isEmpty() ? -1 : Find(oldName);
    if (name.isEmpty() || (existing >= 0 && existing != old))
        return false;
    if (old >= 0) {
        m_accounts[old] = account;
        if (m_default == oldName)
            m_default = name;
    } else {
        m_accounts.append(account);
    }
    return Save();
}

bool CBlogAccountStore::Remove(const QString& name) {
    const qsizetype index = Find(name);
    if (index < 0)
        return false;
    m_accounts.removeAt(index);
    if (m_default == name)
        m_default.clear();
    return Save();
}

bool CBlogAccountStore::Save() const {
    QJsonArray accounts;
    for (const Postwick::AccountProperties& account : m_accounts) {
        QJsonObject object;
        for (auto it = account.cbegin(); it != account.cend(); ++it)
            object.insert(it.key(), it.value());
        accounts.append(object);
    }
    QJsonObject root;
    root.insert(u"accounts"_s, accounts);
    root.insert(u"default"_s, m_default);
    QSaveFile file(m_file);
    if (!file.open(QIODevice::WriteOnly))
        return false;
    file.write(QJsonDocument(root).toJson());
    return file.commit();
}
