#pragma once

#include "libs/postwick/IPostwick.h"

#include <QDialog>
#include <QPointer>

#include <functional>

class CXmlRpcCall;
class QLabel;
class QLineEdit;
class QNetworkAccessManager;
class QPushButton;

// Asks for a blog account (name, blog address, XML-RPC address, user, password) and, on OK,
// checks it with the blog (blogger.getUsersBlogs) before it closes; a refusal is shown in
// the dialog, which stays open. Addresses without a scheme are https; an http address is
// accepted only after the user agreed to it once.
class CBlogAccountDlg final : public QDialog {
    Q_OBJECT
public:
    // The password field may stay empty when editing: `currentPassword` then supplies it.
    using PasswordSource = std::function<void(std::function<void(const QString&)>)>;

    CBlogAccountDlg(QNetworkAccessManager* network, int timeoutMs, QStringList takenNames,
                    QWidget* parent = nullptr);

    // Fills the fields from an account being edited.
    void SetAccount(const Postwick::AccountProperties& account, PasswordSource currentPassword);

    // After acceptance: the checked account and its password.
    const Postwick::AccountProperties& Account() const { return m_account; }
    const QString& Password() const { return m_password; }

    // The key recording that the user accepted an unencrypted address.
    static inline const QString kAllowHttp = QStringLiteral("blogAccountAllowHttp");

private:
    void OnOk();
    void Check(const QString& password);
    void ShowProblem(const QString& text);
    // The address as typed, made absolute (https when no scheme is given); invalid when it is
    // neither http nor https.
    static QUrl Address(const QString& text);
    bool AcceptScheme(const QUrl& url);

    QNetworkAccessManager* m_network;
    int m_timeoutMs;
    QStringList m_takenNames;
    QLineEdit* m_name;
    QLineEdit* m_blogAddress;
    QLineEdit* m_xmlRpcAddress;
    QLineEdit* m_user;
    QLineEdit* m_passwordEdit;
    QLabel* m_problem;
    QPushButton* m_ok;
    PasswordSource m_currentPassword;
    QPointer<CXmlRpcCall> m_check;
    Postwick::AccountProperties m_account;
    QString m_password;
};
