#include "common/ReleasePtr.h"
#include "libs/toolwell/CItemLink.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "support/AmbrelTest.h"

namespace {

QStringList Ids(IItemLink* link) {
    QStringList ids;
    for (const ItemLinkEntry& entry : link->Items())
        ids << entry.itemId;
    return ids;
}

class ItemLinkTest : public AmbrelTest {};

TEST_F(ItemLinkTest, ListsAreMostRecentFirstBoundedAndApart) {
    ReleasePtr<IDataStoreHost> host(GetDataStoreHost());
    ReleasePtr<IItemLink> notes(GetNoteToolLink(host.get()));
    ReleasePtr<IItemLink> documents(GetViewerLink(host.get()));
    notes->AnnounceItem(QStringLiteral("N1"), QStringLiteral("one"));
    notes->AnnounceItem(QStringLiteral("N2"), QStringLiteral("two"));
    notes->AnnounceItem(QStringLiteral("n1"), QStringLiteral("one again")); // the same item
    documents->AnnounceItem(QStringLiteral("D1"), QStringLiteral("doc"));
    EXPECT_EQ(Ids(notes.get()), QStringList({QStringLiteral("n1"), QStringLiteral("N2")}));

    const QString title = QStringLiteral("a, \"quoted\" | title\\ with ; everything=1");
    EXPECT_EQ(notes->SetTitle(QStringLiteral("N2"), title), S_OK);
    EXPECT_EQ(notes->SetTitle(QStringLiteral("D1"), title), S_FALSE);
    // A fresh link object reads what the registry holds.
    ReleasePtr<IItemLink> again(GetNoteToolLink(host.get()));
    ASSERT_EQ(again->Items().size(), 2);
    EXPECT_EQ(again->Items()[1].title, title);

    EXPECT_EQ(again->ForgetItem(QStringLiteral("n2")), S_OK);
    EXPECT_EQ(again->ForgetItem(QStringLiteral("N2")), S_FALSE);
    EXPECT_EQ(Ids(notes.get()), QStringList({QStringLiteral("n1")}));
    EXPECT_EQ(Ids(documents.get()), QStringList({QStringLiteral("D1")}));

    for (int i = 0; i < CItemLink::MaxEntries + 3; ++i)
        notes->AnnounceItem(QString::number(i), QString());
    const QStringList ids = Ids(notes.get());
    EXPECT_EQ(ids.size(), CItemLink::MaxEntries);
    EXPECT_EQ(ids.first(), QString::number(CItemLink::MaxEntries + 2));
}

} // namespace
