#include "libs/toolwell/Formats.h"
#include "support/AmbrelTest.h"

#include <algorithm>

namespace {

TEST(FormatsTest, TimeTextIsUtcIsoRoundTripsWholeSecondsAndRefusesMalformedText) {
    QString text;
    ASSERT_EQ(FormatTime(&text, 1796541169), S_OK);
    EXPECT_EQ(text, QStringLiteral("2026-12-06T07:12:49Z"));
    for (std::int64_t time :
         {std::int64_t{0}, std::int64_t{951782400} /* 29 Feb 2000 */, std::int64_t{4102444799}}) {
        ASSERT_EQ(FormatTime(&text, time), S_OK);
        std::int64_t back = -1;
        EXPECT_EQ(ParseTime(&back, text), S_OK) << text.toStdString();
        EXPECT_EQ(back, time);
    }

    for (const char* bad :
         {"", "yesterday", "2026-12-06", "2026-12-06 07:12:49", "2026-12-06T07:12:49",
          "2026-13-06T07:12:49Z", "2026-02-30T07:12:49Z", "2026-12-06T07:12:49Z junk",
          " 2026-12-06T07:12:49Z", "2026-12-06T07:12:49+01:00"}) {
        std::int64_t time = 42;
        EXPECT_EQ(ParseTime(&time, QString::fromLatin1(bad)), E_FAIL) << bad;
        EXPECT_EQ(time, 42) << bad;
    }
}

TEST(FormatsTest, ColourTextKeepsRedInTheLowByte) {
    QString text;
    ASSERT_EQ(FormatColor(&text, 0x00336699u), S_OK);
    EXPECT_EQ(text, QStringLiteral("153,102,51"));
    EXPECT_EQ(ParseColor(text), 0x00336699u);
    EXPECT_EQ(ParseColor(QStringLiteral(" 1 , 2 , 255 ")), 0x00FF0201u);
    for (const char* bad : {"", "1,2", "1,2,3,4", "256,0,0", "-1,0,0", "a,b,c", "1,,3"})
        EXPECT_EQ(ParseColor(QString::fromLatin1(bad)), 0u) << bad;
}

TEST(FormatsTest, IntegerListsReadUpToTheFirstMalformedPiece) {
    const struct {
        const char* text;
        QList<int> numbers;
    } cases[] = {{"100,50,400,300", {100, 50, 400, 300}},
                 {" -5000 , +7,\t10 ", {-5000, 7, 10}},
                 {"1,2,x,4", {1, 2}},
                 {"1,2 3", {1}},
                 {"1.5", {}},
                 {"99999999999", {}},
                 {"   ", {}}};
    for (const auto& c : cases) {
        QList<int> numbers{9};
        EXPECT_EQ(ParseIntegerList(QString::fromLatin1(c.text), &numbers), c.numbers.size())
            << c.text;
        // Qt's own list comparison hands memcmp a null pointer for two empty lists, which
        // the undefined-behaviour checker stops at; compare the numbers one by one instead.
        EXPECT_TRUE(std::ranges::equal(numbers, c.numbers)) << c.text;
    }
}

} // namespace
