#include "common/ReleasePtr.h"
#include "dataexchange/IPropertyReporter.h"
#include "dataexchange/ParsePipeDelimitedString.h"
#include "dataexchange/PipeDelimitedStringReporter.h"
#include "dataexchange/WProperties.h"
#include "support/AmbrelTest.h"

#include <QList>
#include <QPair>

using namespace DataExchange;

namespace {

class PropertiesTest : public AmbrelTest {
protected:
    ReleasePtr<IProperties> m_set{CreateProperties()};
};

using Pairs = QList<QPair<QString, QString>>;

// Records every pair and answers a chosen code per call.
class RecordingReporter final : public IPropertyReporter {
public:
    HRESULT ReportProperty(const QString& name, const QString& value) override {
        pairs.append({name, value});
        return answers.isEmpty() ? S_OK : answers.takeFirst();
    }
    Pairs pairs;
    QList<HRESULT> answers;
};

Pairs PairsOf(IProperties& set) {
    RecordingReporter reporter;
    set.ReportProperties(&reporter);
    return reporter.pairs;
}

QString TextOf(IProperties& set) {
    PipeDelimitedStringReporter writer;
    set.ReportProperties(&writer);
    QString text;
    UnicodeStringPtr sink(&text);
    EXPECT_EQ(writer.GetString(&sink), S_OK);
    return text;
}

Pairs Parse(const QString& text) {
    ReleasePtr<IProperties> set(CreateProperties());
    ParsePipeDelimitedString(text, set.get());
    return PairsOf(*set);
}

QString S(const char16_t* text) {
    return QString::fromUtf16(text);
}

} // namespace

TEST_F(PropertiesTest, GetPropertyAnswersZeroWithTheValueAndOneWhenAbsent) {
    m_set->SetProperty(S(u"title"), S(u"Groceries"));
    m_set->SetProperty(S(u"empty"), QString());

    QString value = S(u"untouched");
    UnicodeStringPtr sink(&value);
    EXPECT_EQ(m_set->GetProperty(S(u"missing"), &sink), S_FALSE);
    EXPECT_EQ(value, S(u"untouched"));
    EXPECT_EQ(m_set->GetProperty(S(u"Title"), &sink), S_FALSE) << "names are case-sensitive";
    EXPECT_EQ(m_set->GetProperty(S(u"title"), nullptr), S_FALSE);

    EXPECT_EQ(m_set->GetProperty(S(u"title"), &sink), S_OK);
    EXPECT_EQ(value, S(u"Groceries"));
    // A null value is stored as the empty text, and a sink accepts it.
    EXPECT_EQ(m_set->GetProperty(S(u"empty"), &sink), S_OK);
    EXPECT_TRUE(value.isEmpty());

    EXPECT_EQ(m_set->SetProperty(S(u"title"), S(u"Errands")), S_OK);
    EXPECT_EQ(m_set->GetProperty(S(u"title"), &sink), S_OK);
    EXPECT_EQ(value, S(u"Errands"));
    EXPECT_EQ(m_set->SetProperty(QString(), S(u"x")), E_INVALIDARG);
}

TEST_F(PropertiesTest, ReportPropertiesVisitsNamesInCodeUnitOrder) {
    RecordingReporter reporter;
    EXPECT_EQ(m_set->ReportProperties(&reporter), S_FALSE);
    EXPECT_TRUE(reporter.pairs.isEmpty());

    m_set->SetProperty(S(u"a"), S(u"1"));
    m_set->SetProperty(S(u"Z"), S(u"2"));
    m_set->SetProperty(S(u"\U00010000"), S(u"3")); // surrogates D800 DC00
    m_set->SetProperty(S(u"\uFF00"), S(u"4"));
    m_set->SetProperty(S(u"ab"), S(u"5"));
    reporter.answers = {S_OK, E_FAIL, S_OK, S_OK, 7};
    EXPECT_EQ(m_set->ReportProperties(&reporter), 7) << "the last call's answer";
    EXPECT_EQ(reporter.pairs, (Pairs{{S(u"Z"), S(u"2")},
                                     {S(u"a"), S(u"1")},
                                     {S(u"ab"), S(u"5")},
                                     {S(u"\U00010000"), S(u"3")},
                                     {S(u"\uFF00"), S(u"4")}}));
}

TEST_F(PropertiesTest, CopyPropertiesOverwritesAndKeepsTheRest) {
    m_set->SetProperty(S(u"a"), S(u"old"));
    m_set->SetProperty(S(u"keep"), S(u"k"));
    ReleasePtr<IProperties> source(CreateProperties());
    source->SetProperty(S(u"a"), S(u"new"));
    source->SetProperty(S(u"b"), S(u""));

    EXPECT_EQ(m_set->CopyProperties(source.get()), S_OK);
    EXPECT_EQ(PairsOf(*m_set),
              (Pairs{{S(u"a"), S(u"new")}, {S(u"b"), S(u"")}, {S(u"keep"), S(u"k")}}));

    EXPECT_EQ(m_set->CopyProperties(m_set.get()), S_OK);
    EXPECT_EQ(PairsOf(*m_set).size(), 3);
    EXPECT_EQ(m_set->CopyProperties(nullptr), E_INVALIDARG);
}

TEST_F(PropertiesTest, WritesPipeDelimitedTextWithEscapes) {
    EXPECT_EQ(TextOf(*m_set), S(u"")) << "an empty set is the empty text";
    EXPECT_FALSE(TextOf(*m_set).isNull());

    m_set->SetProperty(S(u"b"), S(u""));
    m_set->SetProperty(S(u"a"), S(u"x|y"));
    EXPECT_EQ(TextOf(*m_set), S(u"a|x\\|y|b||"));

    m_set->SetProperty(S(u"c\\d|"), S(u"\\|\\\\"));
    EXPECT_EQ(TextOf(*m_set), S(u"a|x\\|y|b||c\\\\d\\||\\\\\\|\\\\\\\\|"));

    PipeDelimitedStringReporter writer;
    EXPECT_EQ(writer.GetString(nullptr), E_INVALIDARG);
}

TEST_F(PropertiesTest, EscapedTextRoundTrips) {
    const Pairs pairs{{S(u""), S(u"empty name")}, {S(u"\\"), S(u"|")},   {S(u"a|b"), S(u"c\\d")},
                      {S(u"end\\"), S(u"\\")},    {S(u"plain"), S(u"")}, {S(u"x"), S(u"||\\\\|")}};
    for (const auto& [name, value] : pairs)
        m_set->SetProperty(name, value);
    EXPECT_EQ(Parse(TextOf(*m_set)), pairs);
}

TEST_F(PropertiesTest, ParserDropsPendingTextAndReadsOddEscapes) {
    EXPECT_EQ(Parse(S(u"a|1|b")), (Pairs{{S(u"a"), S(u"1")}}));
    EXPECT_EQ(Parse(S(u"a|1|b|")), (Pairs{{S(u"a"), S(u"1")}}));
    EXPECT_EQ(Parse(S(u"a|1|b|2")), (Pairs{{S(u"a"), S(u"1")}}));
    EXPECT_EQ(Parse(S(u"a|1\\")), Pairs{});
    EXPECT_EQ(Parse(S(u"a|x\\qy|")), (Pairs{{S(u"a"), S(u"x|y")}}))
        << "a backslash and a letter read as one \"|\"";
    EXPECT_EQ(Parse(S(u"|v|")), (Pairs{{S(u""), S(u"v")}}));
    EXPECT_EQ(Parse(S(u"a|1|a|2|")), (Pairs{{S(u"a"), S(u"2")}}));
    EXPECT_EQ(Parse(S(u"")), Pairs{});

    // Parsing adds to what the target already holds.
    m_set->SetProperty(S(u"kept"), S(u"1"));
    ParsePipeDelimitedString(S(u"new|2|"), m_set.get());
    EXPECT_EQ(PairsOf(*m_set), (Pairs{{S(u"kept"), S(u"1")}, {S(u"new"), S(u"2")}}));
    ParsePipeDelimitedString(S(u"x|y|"), nullptr);
}
