#include "libs/postwick/CBlogAccountDlg.h"

#include "libs/postwick/CXmlRpcCall.h"
#include "platform/IMessageBox.h"

#include <QDialogButtonBox>
#include <QFormLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QVBoxLayout>

using namespace Qt::StringLiterals;

namespace {

QLineEdit* Field(const QString& objectName, const QString& accessibleName, QWidget* parent) {
    auto* edit = new QLineEdit(parent);
    edit->setObjectName(objectName);
    edit->setAccessibleName(accessibleName);
    return edit;
}

} // namespace

CBlogAccountDlg::CBlogAccountDlg(QNetworkAccessManager* network, int timeoutMs,
                                 QStringList takenNames, QWidget* parent)
    : QDialog(parent), m_network(network), m_timeoutMs(timeoutMs),
      m_takenNames(std::move(takenNames)) {
    setWindowTitle(u"Blog Account"_s);
    m_name = Field(u"accountName"_s, u"Account name"_s, this);
    m_blogAddress = Field(u"blogAddress"_s, u"Blog address"_s, this);
    m_xmlRpcAddress = Field(u"xmlRpcAddress"_s, u"XML-RPC address"_s, this);
    m_user = Field(u"user"_s, u"User name"_s, this);
    m_passwordEdit = Field(u"password"_s, u"Password"_s, this);
    m_passwordEdit->setEchoMode(QLineEdit::Password);
    m_blogAddress->setPlaceholderText(u"https://example.org/"_s);
    m_xmlRpcAddress->setPlaceholderText(u"https://example.org/xmlrpc.php"_s);

    auto* form = new QFormLayout;
    form->addRow(u"Account &name:"_s, m_name);
    form->addRow(u"&Blog address:"_s, m_blogAddress);
    form->addRow(u"&XML-RPC address:"_s, m_xmlRpcAddress);
    form->addRow(u"&User name:"_s, m_user);
    form->addRow(u"&Password:"_s, m_passwordEdit);

    m_problem = new QLabel(this);
    m_problem->setObjectName(u"problem"_s);
    m_problem->setWordWrap(true);
    m_problem->setAccessibleName(u"Problem"_s);
    m_problem->hide();

    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel, this);
    m_ok = buttons->button(QDialogButtonBox::Ok);
    connect(m_ok, &QPushButton::clicked, this, &CBlogAccountDlg::OnOk);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);

    auto* layout = new QVBoxLayout(this);
    layout->addLayout(form);
    layout->addWidget(m_problem);
    layout->addWidget(buttons);
}

void CBlogAccountDlg::SetAccount(const Postwick::AccountProperties& account,
                                 PasswordSource currentPassword) {
    m_account = account;
    m_name->setText(account.value(Postwick::kAccountName));
    m_blogAddress->setText(account.value(Postwick::kAccountBlogHost));
    m_xmlRpcAddress->setText(account.value(Postwick::kAccountXmlRpcUrl));
    m_user->setText(account.value(Postwick::kAccountUser));
    m_passwordEdit->setPlaceholderText(u"(unchanged)"_s);
    m_takenNames.removeAll(m_name->text());
    m_currentPassword = std::move(currentPassword);
}

QUrl CBlogAccountDlg::Address(const QString& text) {
    const QString trimmed = text.trimmed();
    QUrl url = QUrl::fromUserInput(trimmed);
    if (!trimmed.contains(u"://"_s))
        url.setScheme(u"https"_s);
    if (!url.isValid() || url.host().isEmpty() ||
        (url.scheme() != u"https"_s && url.scheme() != u"http"_s))
        return {};
    return url;
}

bool CBlogAccountDlg::AcceptScheme(const QUrl& url) {
    if (url.scheme() == u"https"_s)
        return true;
    const QString host = url.host();
    const bool agreedBefore = m_account.value(kAllowHttp) == u"true"_s &&
                              Address(m_account.value(Postwick::kAccountXmlRpcUrl)).host() == host;
    if (agreedBefore)
        return true;
    const int answer = Platform::MessageBox().Show(
        u"The address %1 is not encrypted: the user name and password would cross the network "
        u"readable by anyone on the way.\n\nUse it anyway?"_s.arg(url.toDisplayString()),
        u"Blog Account"_s,
        Platform::MessageBoxStyle::YesNo | Platform::MessageBoxStyle::IconWarning);
    return answer == Platform::MessageBoxAnswer::Yes;
}

void CBlogAccountDlg::OnOk() {
    const QString name = m_name->text().trimmed();
    if (name.isEmpty())
        return ShowProblem(u"Give the account a name."_s);
    if (m_takenNames.contains(name))
        return ShowProblem(u"There is an account called \"%1\" already."_s.arg(name));
    const QUrl xmlRpc = Address(m_xmlRpcAddress->text());
    if (xmlRpc.isEmpty())
        return ShowProblem(u"The XML-RPC address is not an http or https address."_s);
    QUrl blog;
    if (!m_blogAddress->text().trimmed().isEmpty()) {
        blog = Address(m_blogAddress->text());
        if (blog.isEmpty())
            return ShowProblem(u"The blog address is not an http or https address."_s);
    }
    if (m_user->text().isEmpty())
        return ShowProblem(u"Give the user name of the blog."_s);
    if (!AcceptScheme(xmlRpc))
        return;

    m_account.insert(Postwick::kAccountName, name);
    m_account.insert(Postwick::kAccountXmlRpcUrl, xmlRpc.toString());
    m_account.insert(Postwick::kAccountBlogHost, blog.toString());
    m_account.insert(Postwick::kAccountUser, m_user->text());
    if (xmlRpc.scheme() == u"http"_s)
        m_account.insert(kAllowHttp, u"true"_s);
    else
        m_account.remove(kAllowHttp);

    m_ok->setEnabled(false);
    ShowProblem(u"Checking the account with the blog..."_s);
    if (m_passwordEdit->text().isEmpty() && m_currentPassword) {
        QPointer<CBlogAccountDlg> self(this);
        m_currentPassword([self](const QString& password) {
            if (self)
                self->Check(password);
        });
    } else {
        Check(m_passwordEdit->text());
    }
}

void CBlogAccountDlg::Check(const QString& password) {
    const QUrl url(m_account.value(Postwick::kAccountXmlRpcUrl));
    const QVariantList params{QString(), m_account.value(Postwick::kAccountUser), password};
    m_check = CXmlRpcCall::Start(
        m_network, url, u"blogger.getUsersBlogs"_s, params, m_timeoutMs, this,
        [this, password](const CXmlRpcCall::Result& result) {
            m_ok->setEnabled(true);
            const QVariantList blogs = result.value.toList();
            if (!result.ok)
                return ShowProblem(u"The blog refused the account: %1"_s.arg(result.error));
            if (blogs.isEmpty())
                return ShowProblem(u"The blog holds no blog for this user."_s);
            // The blog whose address was given, else the user's first.
            QVariantMap chosen = blogs.first().toMap();
            const QUrl wanted(m_account.value(Postwick::kAccountBlogHost));
            for (const QVariant& entry : blogs) {
                const QVariantMap blog = entry.toMap();
                if (!wanted.isEmpty() &&
                    QUrl(blog.value(u"url"_s).toString()).matches(wanted, QUrl::StripTrailingSlash))
                    chosen = blog;
            }
            m_account.insert(Postwick::kAccountBlogId, chosen.value(u"blogid"_s).toString());
            if (wanted.isEmpty()) {
                const QUrl address = Address(chosen.value(u"url"_s).toString());
                m_account.insert(Postwick::kAccountBlogHost, address.toString());
            }
            m_password = password;
            accept();
        });
}

void CBlogAccountDlg::ShowProblem(const QString& text) {
    m_problem->setText(text);
    m_problem->show();
}
