#include "common/ReleasePtr.h"
#include "notes/CHTMLBackgroundStyle.h"
#include "notes/IHTMLContentTextConverter.h"
#include "support/AmbrelTest.h"

#include <QColor>

namespace {

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

TEST(HTMLStylesTest, BackgroundTextPutsVerticalBeforeHorizontal) {
    const struct {
        std::uint32_t color;
        const char* image;
        int repeat, attachment, horizontal, vertical;
        const char* text;
    } cases[] = {{kWhite, "none", 0, 0, 0, 0, "#ffffff none repeat top left scroll"},
                 {kWhite, "none", 3, 1, 2, 1, "#ffffff none repeat-y center right fixed"},
                 {0, nullptr, 2, 7, 1, 2, "#000000  repeat-x bottom center scroll"},
                 {0, "none", 9, -1, 5, 3, "#000000 none repeat top left scroll"},
                 {0x1000FF, "none", 0, 0, 0, 0, "#ff0010 none repeat top left scroll"}};
    for (const auto& c : cases) {
        CHTMLBackgroundStyle style(c.color, QLatin1StringView(c.image), c.repeat, c.attachment,
                                   c.horizontal, c.vertical);
        EXPECT_EQ(Text(style), QLatin1StringView(c.text));
    }
}

TEST(HTMLStylesTest, ReadColorTakesHexWithBlanksAndKeywordsInAnyCase) {
    EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(QStringLiteral(" #FF0010 ")), 0x1000FFu);
    EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(QStringLiteral("\t#00ff00\n")), 0x00FF00u);
    EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(QStringLiteral("RED")), 0x0000FFu);
    EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(QStringLiteral("Navy")), 0x800000u);
    for (const char* wrong : {"#ff00", "#ff00100", "#ff 0010", "#gg0010", "ff0010", "reddish",
                              " red", "", "transparent"})
        EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(QLatin1StringView(wrong)), kWhite) << wrong;

    CHTMLBackgroundStyle style(0x000000, QStringLiteral("none"), 0, 0, 0, 0);
    style.Parse(QStringLiteral("#A0B0C0"));
    EXPECT_EQ(Color(style), 0xC0B0A0u);
    style.Parse(QStringLiteral("#abc")); // the short form is kept but not read
    EXPECT_EQ(Color(style), kWhite);
    EXPECT_EQ(Text(style), QStringLiteral("#abc none repeat top left scroll"));
}

// Qt carries its own copy of the same keyword list; every one of its names (it adds only
// "transparent") must read as the same colour here.
TEST(HTMLStylesTest, EveryColorKeywordHasItsStandardValue) {
    int keywords = 0;
    for (const QString& name : QColor::colorNames()) {
        if (name == u"transparent")
            continue;
        ++keywords;
        const QColor expected = QColor::fromString(name);
        const QRgb value = qRgb(expected.blue(), expected.green(), expected.red()) & 0xFFFFFF;
        EXPECT_EQ(CHTMLBackgroundStyle::ReadColor(name), value) << name.toStdString();
    }
    EXPECT_EQ(keywords, 147);
}

TEST(HTMLStylesTest, ParseSetsOnlyTheFieldsItFinds) {
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
}

TEST(HTMLStylesTest, EscapingUsesTheFirstRowOfTheTable) {
    ReleasePtr<IHTMLContentTextConverter> converter(CreateHTMLContentTextConverter());
    const auto escaped = [&](const QString& text) {
        QString result = QStringLiteral("start:");
        AppendUnicodeStringPtr sink(&result);
        EXPECT_EQ(converter->Convert(text, &sink), S_OK);
        return result;
    };
    EXPECT_EQ(escaped(QStringLiteral("a<b & \"c\" 100% #1")),
              QStringLiteral("start:a%3Cb%20&amp;%20&quot;c&quot;%20100%25%20%231"));
    EXPECT_EQ(escaped(QStringLiteral("x>y")), QStringLiteral("start:x%3Ey"));
    EXPECT_EQ(escaped(QStringLiteral("'\t\u00e9\u20ac/")),
              QStringLiteral("start:'\t\u00e9\u20ac/"));
    EXPECT_EQ(converter->Convert(QStringLiteral("a b"), nullptr), E_INVALIDARG);
}

} // namespace
