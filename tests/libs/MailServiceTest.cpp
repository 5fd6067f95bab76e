#include "ServicesTestSupport.h"

#include "libs/toolwell/IMailService.h"

namespace {

class MailServiceTest : public ServicesTest {
protected:
    // A mail program that writes the arguments it got, each ended by a NUL byte.
    void InstallMailProgram() const {
        WriteScript(QStringLiteral("bin/xdg-email"),
                    QStringLiteral("printf '%s\\0' \"$@\" > '%1.part' && /bin/mv '%1.part' '%1'\n")
                        .arg(Record())
                        .toUtf8());
    }
    QString Record() const { return Home() + QStringLiteral("/mail-arguments"); }

    // The arguments of the one mail program run since the last call.
    QStringList TakeArguments() const {
        if (!WaitForEvents([this] { return QFile::exists(Record()); }))
            return {QStringLiteral("(the mail program did not run)")};
        QStringList arguments = QString::fromUtf8(ReadAll(Record())).split(QChar(0));
        arguments.removeLast();
        QFile::remove(Record());
        return arguments;
    }
};

TEST_F(MailServiceTest, MailProgramGetsEachValueAsOneArgument) {
    InstallMailProgram();
    Platform::SetProcessLauncher(nullptr);
    IMailService* mail = GetMailService();
    ASSERT_TRUE(mail->CanSendMail());
    const QStringList utf8{QStringLiteral("--utf8")};

    // A note goes with its title as the subject.
    const QString note = WriteFile(QStringLiteral("Catalog/ABC/note.htm"), "<p>x</p>");
    ASSERT_EQ(mail->SendFileByMailWithSubject(note, QStringLiteral("Plans; \"big\" & $HOME"), 1),
              S_OK);
    EXPECT_EQ(TakeArguments(), (utf8 + QStringList{QStringLiteral("--subject"),
                                                   QStringLiteral("Plans; \"big\" & $HOME"),
                                                   QStringLiteral("--attach"), note}));

    // A document goes without one, however its path is spelt.
    const QString document =
        WriteFile(QStringLiteral("My Papers/Über die Brücke -- 2.pdf"), "%PDF-1.4");
    ASSERT_EQ(mail->SendFileByMail(document, 1), S_OK);
    EXPECT_EQ(TakeArguments(), (utf8 + QStringList{QStringLiteral("--attach"), document}));

    ASSERT_EQ(mail->TellAFriend(), S_OK);
    const QStringList friendly = TakeArguments();
    ASSERT_EQ(friendly.size(), 5) << friendly.join(u'|').toStdString();
    EXPECT_EQ(friendly.mid(0, 2), (utf8 + QStringList{QStringLiteral("--subject")}));
    EXPECT_TRUE(friendly[2].contains(QStringLiteral("Quillmark Ambrel")));
    EXPECT_EQ(friendly[3], QStringLiteral("--body"));
}

TEST_F(MailServiceTest, NothingIsSentWithoutAFileOrAMailProgram) {
    InstallMailProgram();
    IMailService* mail = GetMailService();
    const QString folder = Home() + QStringLiteral("/My Papers");
    QDir().mkpath(folder);
    for (const QString& path : {QString(), Home() + QStringLiteral("/gone.pdf"), folder}) {
        EXPECT_EQ(mail->SendFileByMail(path, 1), E_FAIL) << path.toStdString();
        EXPECT_EQ(mail->SendFileByMailWithSubject(path, QStringLiteral("Title"), 1), E_FAIL);
    }
    EXPECT_TRUE(launcher.starts.isEmpty());

    const QString document = WriteFile(QStringLiteral("a.pdf"), "%PDF-1.4");
    qputenv("PATH", "");
    EXPECT_FALSE(mail->CanSendMail());
    EXPECT_EQ(mail->SendFileByMail(document, 1), E_FAIL);
    EXPECT_EQ(mail->TellAFriend(), E_FAIL);
    EXPECT_TRUE(launcher.starts.isEmpty());
}

} // namespace
