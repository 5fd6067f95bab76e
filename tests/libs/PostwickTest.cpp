#include "BlogServer.h"
#include "support/AmbrelTest.h"
#include "support/RecordingMessageBox.h"

#include "common/ReleasePtr.h"
#include "libs/postwick/CPostwick.h"
#include "settings/CNavigatorBloggingSettingsDlg.h"
#include "ui/CBmpButton.h"

#include <QApplication>
#include <QDialog>
#include <QFile>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QPushButton>
#include <QTest>

using namespace Qt::StringLiterals;

namespace {

QByteArray Response(const QByteArray& value) {
    return "<?xml version=\"1.0\"?><methodResponse><params><param><value>" + value +
           "</value></param></params></methodResponse>";
}

QByteArray Fault(const QByteArray& text) {
    return "<?xml version=\"1.0\"?><methodResponse><fault><value><struct>"
           "<member><name>faultCode</name><value><int>403</int></value></member>"
           "<member><name>faultString</name><value><string>" +
           text + "</string></value></member></struct></value></fault></methodResponse>";
}

const QByteArray kUsersBlogs = Response(
    "<array><data><value><struct><member><name>blogid</name><value><string>7</string></value>"
    "</member><member><name>url</name><value><string>https://travel.example/</string></value>"
    "</member></struct></value></data></array>");

// The password with the characters that XML and encodings get wrong.
const QString kPassword = u"p&<\u00DF\u20ACss"_s;

QStringList Entries(const QListWidget* list) {
    QStringList texts;
    for (int row = 0; row < list->count(); ++row)
        texts.append(list->item(row)->text());
    return texts;
}

class PostwickTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        Platform::SetMessageBox(&boxes);
        boxes.answer = Platform::MessageBoxAnswer::Yes;
        postwick.reset(new CPostwick);
        postwick->SetWorkingFolder(AppDataFolder() + u'/');
    }

    // Adds an account through the page's Add button and the account dialog.
    void AddThroughPage(CNavigatorBloggingSettingsDlg& page, const QString& name) {
        server.answers.append(BlogServer::Body(kUsersBlogs));
        QTimer::singleShot(0, [name, this] {
            QWidget* dialog = QApplication::activeModalWidget();
            ASSERT_NE(dialog, nullptr);
            const auto set = [dialog](const char* field, const QString& text) {
                dialog->findChild<QLineEdit*>(QLatin1StringView(field))->setText(text);
            };
            set("accountName", name);
            set("xmlRpcAddress", QString::fromLatin1(server.Url()));
            set("user", u"ann"_s);
            set("password", kPassword);
            for (QPushButton* button : dialog->findChildren<QPushButton*>())
                if (button->text().contains(u"OK"_s))
                    button->click();
        });
        page.Button(1094)->click();
    }

    // Posts a note with the given body from a note folder and waits for the outcome.
    Postwick::PostResult Post(const QByteArray& body) {
        const QString note = WriteFile(
            u"note/note.htm"_s,
            "<!DOCTYPE HTML PUBLIC \"-//W3C//DTD HTML 4.0 Transitional//EN\"><HTML><HEAD>"
            "<TITLE>Trip</TITLE><STYLE type=\"text/css\" > BODY { COLOR : black; } </STYLE>"
            "</HEAD><BODY><DIV>" +
                body + "</DIV></BODY></HTML>" + QByteArray(1, '\0'));
        Postwick::PostResult outcome;
        bool done = false;
        EXPECT_EQ(postwick->PostNote(u"Trip & Co"_s, note,
                                     [&](const Postwick::PostResult& result) {
                                         outcome = result;
                                         done = true;
                                     }),
                  S_OK);
        EXPECT_TRUE(QTest::qWaitFor([&] { return done; }, 15000));
        return outcome;
    }

    // An account "Travel" on the test server, the default, as the account dialog keeps it.
    void AddDefaultAccount() {
        CNavigatorBloggingSettingsDlg page(postwick->GetAccountManager());
        AddThroughPage(page, u"Travel"_s);
        ASSERT_EQ(Entries(page.AccountList()), QStringList{u"Travel (Default)"_s});
        server.requests.clear();
        boxes.shown.clear();
    }

    RecordingMessageBox boxes;
    BlogServer server;
    ReleasePtr<CPostwick> postwick;
};

TEST_F(PostwickTest, AccountsAreCheckedWithTheBlogKeptWithoutTheirPasswordAndRemoved) {
    CNavigatorBloggingSettingsDlg page(postwick->GetAccountManager());
    EXPECT_FALSE(page.Button(1092)->isEnabled());
    EXPECT_TRUE(page.Button(1094)->isEnabled());
    EXPECT_EQ(page.Button(1095)->toolTip(), u"Remove blog account"_s);

    AddThroughPage(page, u"Travel"_s);
    // The check went to the blog with the password escaped, and the plain http address was
    // agreed to once.
    ASSERT_EQ(server.requests.size(), 1);
    const QByteArray check = server.requests[0].body;
    EXPECT_TRUE(check.contains("<methodName>blogger.getUsersBlogs</methodName>"));
    EXPECT_TRUE(check.contains("<string>p&amp;&lt;\xC3\x9F\xE2\x82\xAC"
                               "ss</string>"))
        << check.toStdString();
    ASSERT_EQ(boxes.shown.size(), 1);
    EXPECT_EQ(boxes.shown[0].style & 0xF, Platform::MessageBoxStyle::YesNo);
    EXPECT_EQ(Entries(page.AccountList()), QStringList{u"Travel (Default)"_s});
    EXPECT_TRUE(page.Button(1092)->isEnabled());

    // The second account is not the default until it is made so; the list stays sorted.
    AddThroughPage(page, u"Food"_s);
    EXPECT_EQ(Entries(page.AccountList()), (QStringList{u"Food"_s, u"Travel (Default)"_s}));
    page.AccountList()->setCurrentRow(0);
    page.Button(1092)->click();
    EXPECT_EQ(Entries(page.AccountList()), (QStringList{u"Food (Default)"_s, u"Travel"_s}));

    // The password is in the owner-only file and nowhere else.
    QTest::qWait(50);
    QFile accounts(AppDataFolder() + u"/BlogAccounts.json"_s);
    ASSERT_TRUE(accounts.open(QIODevice::ReadOnly));
    const QByteArray stored = accounts.readAll();
    EXPECT_TRUE(stored.contains("https://travel.example/"));
    EXPECT_FALSE(stored.contains("p&<")) << stored.toStdString();
    EXPECT_FALSE(stored.contains("\xE2\x82\xAC"));
    const QString passwordFile = AppDataFolder() + u"/BlogPasswords.json"_s;
    EXPECT_EQ(QFile::permissions(passwordFile),
              QFile::ReadOwner | QFile::WriteOwner | QFile::ReadUser | QFile::WriteUser);
    EXPECT_TRUE(page.findChild<QLabel*>(u"passwordStorage"_s)->text().contains(passwordFile));

    // Removing asks first, then the default marker follows the accounts that remain.
    boxes.shown.clear();
    page.AccountList()->setCurrentRow(0);
    page.Button(1095)->click();
    ASSERT_EQ(boxes.shown.size(), 1);
    EXPECT_EQ(boxes.shown[0].caption, u"Delete Blog Account Settings"_s);
    EXPECT_EQ(boxes.shown[0].text, u"Are you sure that you want to delete the account\n "
                                   u"settings for blog \"Food\"?"_s);
    EXPECT_EQ(Entries(page.AccountList()), QStringList{u"Travel"_s});
    QFile passwords(passwordFile);
    ASSERT_TRUE(passwords.open(QIODevice::ReadOnly));
    EXPECT_FALSE(passwords.readAll().contains("Food"));
}

TEST_F(PostwickTest, PostUploadsThePicturesFirstAndSaysWhereThePostIs) {
    AddDefaultAccount();
    WriteFile(u"note/pic one.png"_s, "PNGDATA");
    server.answers = {
        BlogServer::Body(
            Response("<struct><member><name>url</name><value>https://media.example/p1.png"
                     "</value></member></struct>")),
        BlogServer::Body(Response("<string>42</string>")),
        BlogServer::Body(
            Response("<struct><member><name>link</name><value>https://travel.example/?p=42"
                     "</value></member></struct>")),
    };
    const Postwick::PostResult result =
        Post("Hi <img src=\"pic one.png\" alt=\"x\"> <img src=\"../elsewhere.png\">");

    EXPECT_TRUE(result.posted) << result.message.toStdString();
    EXPECT_EQ(result.link, u"https://travel.example/?p=42"_s);
    EXPECT_TRUE(result.message.contains(result.link));
    ASSERT_EQ(server.requests.size(), 3);
    const QByteArray media = server.requests[0].body;
    EXPECT_TRUE(media.contains("metaWeblog.newMediaObject"));
    EXPECT_TRUE(media.contains("<base64>" + QByteArray("PNGDATA").toBase64() + "</base64>"));
    const QByteArray post = server.requests[1].body;
    EXPECT_TRUE(post.contains("metaWeblog.newPost"));
    EXPECT_TRUE(post.contains("<string>Trip &amp; Co</string>"));
    // The body only, with the uploaded picture's address; a picture outside the note's folder
    // is left as it was.
    EXPECT_TRUE(post.contains(
        "<string>&lt;DIV&gt;Hi &lt;img src=&quot;https://media.example/p1.png&quot;"
        " alt=&quot;x&quot;&gt; &lt;img src=&quot;../elsewhere.png&quot;&gt;&lt;/DIV&gt;"
        "</string>"))
        << post.toStdString();
    EXPECT_FALSE(post.contains("STYLE"));
}

TEST_F(PostwickTest, FailedPostsSayWhyInWords) {
    AddDefaultAccount();
    postwick->SetRequestTimeout(300);
    struct Row {
        const char* name;
        BlogServer::Answer answer;
        QString expected;
    };
    const Row rows[] = {
        {"fault", BlogServer::Body(Fault("Wrong password &amp; user.")),
         u"Wrong password & user."_s},
        {"not XML-RPC", BlogServer::Body("<html><body>Welcome</body></html>"),
         u"not an XML-RPC response"_s},
        {"declarations", BlogServer::Body("<!DOCTYPE x [<!ENTITY a \"b\">]><methodResponse/>"),
         u"not well-formed XML-RPC"_s},
        {"time-out", BlogServer::Silent(), u"did not answer in time"_s},
        {"50 MB", BlogServer::Streamed(50 * 1024 * 1024), u"larger than 1 MB"_s},
        {"other host", BlogServer::Redirect("http://127.0.0.2:9/xmlrpc.php"),
         u"was not followed"_s},
    };
    for (const Row& row : rows) {
        server.requests.clear();
        server.answers = {row.answer};
        const Postwick::PostResult result = Post("Hello");
        EXPECT_FALSE(result.posted) << row.name;
        EXPECT_TRUE(result.message.contains(row.expected))
            << row.name << ": " << result.message.toStdString();
        EXPECT_EQ(server.requests.size(), 1) << row.name;
    }
}

} // namespace
