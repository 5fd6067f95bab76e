#pragma once

#include <QObject>
#include <QString>

#include <functional>

// Where the blog passwords go: the desktop's secret store when one is running, otherwise a
// file that only the user may read. Passwords are never written anywhere else.
class CPasswordStore final : public QObject {
    Q_OBJECT
public:
    // fallbackFile is the file used without a secret store.
    CPasswordStore(const QString& fallbackFile, QObject* parent = nullptr);

    bool UsesSecretStore() const { return m_secretStore; }
    QString FallbackFile() const { return m_fallbackFile; }

    // done runs later (never inside the call) unless this object went first.
    void Read(const QString& account, std::function<void(bool found, const QString&)> done);
    void Write(const QString& account, const QString& password, std::function<void(bool)> done);
    void Remove(const QString& account);

private:
    QString ReadFile(const QString& account, bool* found) const;
    bool WriteFile(const QString& account, const QString* password) const;

    QString m_fallbackFile;
    bool m_secretStore = false;
};
