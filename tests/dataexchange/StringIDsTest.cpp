#include "common/ReleasePtr.h"
#include "dataexchange/CBasicStringIDReporter.h"
#include "dataexchange/WStringIDs.h"
#include "support/AmbrelTest.h"

using namespace DataExchange;

namespace {

class AnsweringReporter final : public IStringIDReporter {
public:
    HRESULT ReportStringID(const QString&) override { return ++calls; }
    int calls = 0;
};

TEST(StringIDsTest, ReportsInInsertionOrderKeepingDuplicates) {
    ReleasePtr<IStringIDs> list(CreateStringIDs());
    CBasicStringIDReporter collected;
    EXPECT_EQ(list->ReportStringIDs(&collected), S_FALSE) << "an empty list";
    for (const char* id : {"b", "a", "b", ""})
        EXPECT_EQ(list->AddStringID(QString::fromLatin1(id)), S_OK);
    EXPECT_EQ(list->AddStringID(QString()), E_INVALIDARG);
    EXPECT_EQ(list->ReportStringIDs(&collected), S_OK);
    EXPECT_EQ(collected.StringIDs(),
              (QStringList{QStringLiteral("b"), QStringLiteral("a"), QStringLiteral("b"), {}}));
    AnsweringReporter answering;
    EXPECT_EQ(list->ReportStringIDs(&answering), 4) << "the last call's answer";
}

} // namespace
