#include "common/ReleasePtr.h"
#include "notes/CHTMLBackgroundStyle.h"
#include "notes/FormatLength.h"
#include "notes/IHTMLContentTextConverter.h"
#include "support/AmbrelTest.h"

#include <QColor>

namespace {

class HTMLStylesTest : public AmbrelTest {};

constexpr std::uint32_t kWhite = 0x00FFFFFF;

QString Text(IHTMLBackgroundStyle& style) {
    QString text;
    EXPECT_EQ(style.GetText(&text), S_OK);
    return text;
}

std::uint32_t Color(IHTMLBackgroundStyle& style) {
    std::uint32_t color = 0x12345678;
    EXPECT_EQ(style.GetColor(&color), S_OK);
    return color;
}

QString Escaped(const QString& text) {
    ReleasePtr<IHTMLContentTextConverter> converter(CreateHTMLContentTextConverter());
    QString result;
    UnicodeStringPtr sink(&result);
    EXPECT_EQ(converter->Convert(text, &sink), S_OK);
    return result;
}

TEST_F(HTMLStylesTest, BackgroundTextPutsVerticalBeforeHorizontal) {
    CHTMLBackgroundStyle plain(kWhite, QStringLiteral("none"), 0, 0, 0, 0);
    EXPECT_EQ(Text(plain), QStringLiteral("#ffffff none repeat top left scroll"));

    CHTMLBackgroundStyle coded(kWhite, QStringLiteral("none"), 3, 1, 2, 1);
    EXPECT_EQ(Text(coded), QStringLiteral("#ffffff none repeat-y center right fixed"));

    CHTMLBackgroundStyle others(0x000000, QString(), 2, 7, 1, 2);
    EXPECT_EQ(Text(others), QStringLiteral("#000000  repeat-x bottom center scroll"));
    CHTMLBackgroundStyle unknown(0x000000, QStringLiteral("none"), 9, -1, 5, 3);
    EXPECT_EQ(Text(unknown), QStringLiteral("#000000 none repeat top left scroll"));
}

TEST_F(HTMLStylesTest, SetColorWritesRedGreenBlueInLowerCase) {
    CHTMLBackgroundStyle style(kWhite, QStringLiteral("none"), 0, 0, 0, 0);
    EXPECT_EQ(style.SetColor(0x1000FF), S_OK); // red 255, green 0, blue 16
    EXPECT_TRUE(Text(style).startsWith(QStringLiteral("#ff0010 ")));
    EXPECT_EQ(Color(style), 0x1000FFu);
    style.SetColor(0xABCDEF);
    EXPECT_TRUE(Text(style).startsWith(QStringLiteral("#efcdab ")));
}

TEST_F(HTMLStylesTest, ReadColorTakesHexWithBlanksAndKeywordsInAnyCase) {
    EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(QStringLiteral("#FF0010")), 0x1000FFu);
    EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(QStringLiteral(" #FF0010 ")), 0x1000FFu);
    EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(QStringLiteral("\t#00ff00\n")), 0x00FF00u);
    EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(QStringLiteral("RED")), 0x0000FFu);
    EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(QStringLiteral("Navy")), 0x800000u);

    for (const char* wrong : {"#ff00", "#ff00100", "#ff 0010", "#gg0010", "ff0010", "reddish",
                              " red", "", "transparent"})
        EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(QLatin1StringView(wrong)), kWhite) << wrong;
}

// Qt carries its own copy of the same keyword list; every one of its names (it adds only
// "transparent") must read as the same colour here.
TEST_F(HTMLStylesTest, EveryColorKeywordHasItsStandardValue) {
    int keywords = 0;
    for (const QString& name : QColor::colorNames()) {
        if (name == u"transparent")
            continue;
        ++keywords;
        const QColor expected = QColor::fromString(name);
        const std::uint32_t value = static_cast<std::uint32_t>(expected.red()) |
                                    (static_cast<std::uint32_t>(expected.green()) << 8) |
                                    (static_cast<std::uint32_t>(expected.blue()) << 16);
        EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(name), value) << name.toStdString();
    }
    EXPECT_EQ(keywords, 147);
}

TEST_F(HTMLStylesTest, GetColorOfParsedValues) {
    CHTMLBackgroundStyle style(0x000000, QStringLiteral("none"), 0, 0, 0, 0);
    style.Parse(QStringLiteral("#A0B0C0"));
    EXPECT_EQ(Color(style), 0xC0B0A0u);
    style.Parse(QStringLiteral("#abc")); // the short form is not read
    EXPECT_EQ(Color(style), kWhite);
    EXPECT_EQ(Text(style), QStringLiteral("#abc none repeat top left scroll"));
}

TEST_F(HTMLStylesTest, ParseSetsOnlyTheFieldsItFinds) {
    CHTMLBackgroundStyle style(kWhite, QStringLiteral("url(a.png)"), 0, 0, 2, 2);
    EXPECT_EQ(style.Parse(QStringLiteral("#000000 no-repeat center left fixed")), S_OK);
    EXPECT_EQ(Text(style), QStringLiteral("#000000 url(a.png) no-repeat center left fixed"));

    // Case-sensitive words, unknown tokens ignored, runs of blanks, the later token wins.
    style.Parse(QStringLiteral("  Repeat   bottom top   none rubbish right #1 #2 url(b) "));
    EXPECT_EQ(Text(style), QStringLiteral("#2 url(b) no-repeat top right fixed"));

    // An image with blanks inside its parentheses keeps only its first token.
    style.Parse(QStringLiteral("url( c.png )"));
    QString image;
    EXPECT_EQ(style.GetImage(&image), S_OK);
    EXPECT_EQ(image, QStringLiteral("url("));

    style.SetImage(QStringLiteral("url( d e )"));
    style.GetImage(&image);
    EXPECT_EQ(image, QStringLiteral("url( d e )"));
}

TEST_F(HTMLStylesTest, EscapingUsesTheFirstRowOfTheTable) {
    EXPECT_EQ(Escaped(QStringLiteral("a<b & \"c\" 100% #1")),
              QStringLiteral("a%3Cb%20&amp;%20&quot;c&quot;%20100%25%20%231"));
    EXPECT_EQ(Escaped(QStringLiteral("x>y")), QStringLiteral("x%3Ey"));
    EXPECT_EQ(Escaped(QStringLiteral("'\t\u00e9\u20ac/")), QStringLiteral("'\t\u00e9\u20ac/"));

    const QString empty = Escaped(QStringLiteral(""));
    EXPECT_TRUE(empty.isEmpty());
    EXPECT_FALSE(empty.isNull());
}

TEST_F(HTMLStylesTest, ConvertHandsItsResultToTheSink) {
    ReleasePtr<IHTMLContentTextConverter> converter(CreateHTMLContentTextConverter());
    EXPECT_EQ(converter->Convert(QStringLiteral("a b"), nullptr), E_INVALIDARG);

    QString text = QStringLiteral("start:");
    AppendUnicodeStringPtr append(&text);
    EXPECT_EQ(converter->Convert(QStringLiteral("a b"), &append), S_OK);
    EXPECT_EQ(text, QStringLiteral("start:a%20b"));

    UnicodeStringPtr broken(nullptr); // a sink that refuses answers its failure
    EXPECT_EQ(converter->Convert(QStringLiteral("a"), &broken), E_FAIL);
}

TEST_F(HTMLStylesTest, FormatLengthUnits) {
    EXPECT_EQ(FormatLength(12, LengthUnit::Pixels), QStringLiteral("12 px"));
    EXPECT_EQ(FormatLength(5, LengthUnit::Percent), QStringLiteral("5 %"));
    EXPECT_EQ(FormatLength(12, LengthUnit::Inches), QStringLiteral("12 in"));
    EXPECT_EQ(FormatLength(12, LengthUnit::Points), QStringLiteral("12 pt"));
    EXPECT_EQ(FormatLength(12, LengthUnit::Millimeters), QStringLiteral("12 mm"));
    EXPECT_EQ(FormatLength(12, LengthUnit::Picas), QStringLiteral("12 pc"));
    EXPECT_EQ(FormatLength(0, LengthUnit::Ems), QStringLiteral("0 em"));
    EXPECT_EQ(FormatLength(5, 9), QStringLiteral("5"));
    EXPECT_EQ(FormatLength(4294967295u, -1), QStringLiteral("4294967295"));
}

} // namespace
