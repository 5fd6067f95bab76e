#include "common/ReleasePtr.h"
#include "libs/toolwell/CItemLink.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "support/AmbrelTest.h"

namespace {

class ItemLinkTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        host.reset(GetDataStoreHost());
    }
    static QStringList Ids(IItemLink* link) {
        QStringList ids;
        for (const ItemLinkEntry& entry : link->Items())
            ids << entry.itemId;
        return ids;
    }

    ReleasePtr<IDataStoreHost> host;
};

TEST_F(ItemLinkTest, AnnouncedItemsAreListedMostRecentFirstWithoutDuplicates) {
    ReleasePtr<IItemLink> notes(GetNoteToolLink(host.get()));
    notes->AnnounceItem(QStringLiteral("A"), QStringLiteral("first"));
    notes->AnnounceItem(QStringLiteral("B"), QStringLiteral("second"));
    notes->AnnounceItem(QStringLiteral("a"), QStringLiteral("first again"));
    EXPECT_EQ(Ids(notes.get()), QStringList({QStringLiteral("a"), QStringLiteral("B")}));

    for (int i = 0; i < CItemLink::MaxEntries + 3; ++i)
        notes->AnnounceItem(QString::number(i), QString());
    const QStringList ids = Ids(notes.get());
    EXPECT_EQ(ids.size(), CItemLink::MaxEntries);
    EXPECT_EQ(ids.first(), QString::number(CItemLink::MaxEntries + 2));
}

TEST_F(ItemLinkTest, RetitleAndForgetKeepTheOrderAndTheTwoListsApart) {
    ReleasePtr<IItemLink> notes(GetNoteToolLink(host.get()));
    ReleasePtr<IItemLink> documents(GetViewerLink(host.get()));
    notes->AnnounceItem(QStringLiteral("N1"), QStringLiteral("one"));
    notes->AnnounceItem(QStringLiteral("N2"), QStringLiteral("two"));
    documents->AnnounceItem(QStringLiteral("D1"), QStringLiteral("doc"));

    const QString title = QStringLiteral("a, \"quoted\" | title\\ with ; everything=1");
    EXPECT_EQ(notes->SetTitle(QStringLiteral("n1"), title), S_OK);
    EXPECT_EQ(notes->SetTitle(QStringLiteral("D1"), title), S_FALSE);

    // A fresh link object reads what the registry holds.
    ReleasePtr<IItemLink> again(GetNoteToolLink(host.get()));
    const QList<ItemLinkEntry> entries = again->Items();
    ASSERT_EQ(entries.size(), 2);
    EXPECT_EQ(entries[0].itemId, QStringLiteral("N2"));
    EXPECT_EQ(entries[1].title, title);

    EXPECT_EQ(again->ForgetItem(QStringLiteral("N2")), S_OK);
    EXPECT_EQ(again->ForgetItem(QStringLiteral("N2")), S_FALSE);
    EXPECT_EQ(Ids(notes.get()), QStringList({QStringLiteral("N1")}));
    EXPECT_EQ(Ids(documents.get()), QStringList({QStringLiteral("D1")}));

    EXPECT_EQ(GetNoteToolLink(nullptr), nullptr);
    EXPECT_EQ(GetViewerLink(nullptr), nullptr);
}

} // namespace
