#include "common/ReleasePtr.h"
#include "dataexchange/IPropertyReporter.h"
#include "dataexchange/ParsePipeDelimitedString.h"
#include "dataexchange/PipeDelimitedStringReporter.h"
#include "dataexchange/WProperties.h"
#include "support/AmbrelTest.h"

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
    EXPECT_EQ(m_set->SetProperty(S(u"title"), S(u"Errands")), S_OK);
    EXPECT_EQ(m_set->SetProperty(QString(), S(u"x")), E_INVALIDARG);

    QString value = S(u"untouched");
    UnicodeStringPtr sink(&value);
    EXPECT_EQ(m_set->GetProperty(S(u"Title"), &sink), S_FALSE) << "names are case-sensitive";
    EXPECT_EQ(value, S(u"untouched"));
    EXPECT_EQ(m_set->GetProperty(S(u"title"), &sink), S_OK);
    EXPECT_EQ(value, S(u"Errands"));
}

TEST_F(PropertiesTest, ReportPropertiesVisitsNamesInCodeUnitOrder) {
    RecordingReporter reporter;
    EXPECT_EQ(m_set->ReportProperties(&reporter), S_FALSE) << "an empty set";
    // U+10000 is the surrogates D800 DC00, before U+FF00.
    const QStringList order{S(u"Z"), S(u"a"), S(u"ab"), S(u"\U00010000"), S(u"\uFF00")};
    for (int i : {1, 0, 4, 3, 2})
        m_set->SetProperty(order[i], order[i]);
    reporter.answers = {S_OK, E_FAIL, S_OK, S_OK, 7};
    EXPECT_EQ(m_set->ReportProperties(&reporter), 7) << "the last call's answer";
    QStringList names;
    for (const auto& pair : reporter.pairs)
        names.append(pair.first);
    EXPECT_EQ(names, order);
}

TEST_F(PropertiesTest, CopyPropertiesOverwritesAndKeepsTheRest) {
    m_set->SetProperty(S(u"a"), S(u"old"));
    m_set->SetProperty(S(u"keep"), S(u"k"));
    ReleasePtr<IProperties> source(CreateProperties());
    source->SetProperty(S(u"a"), S(u"new"));
    EXPECT_EQ(m_set->CopyProperties(source.get()), S_OK);
    EXPECT_EQ(m_set->CopyProperties(m_set.get()), S_OK) << "a set copied into itself";
    EXPECT_EQ(PairsOf(*m_set), (Pairs{{S(u"a"), S(u"new")}, {S(u"keep"), S(u"k")}}));
}

TEST_F(PropertiesTest, PipeDelimitedTextEscapesAndRoundTrips) {
    EXPECT_TRUE(TextOf(*m_set).isEmpty() && !TextOf(*m_set).isNull()) << "empty, not null";
    m_set->SetProperty(S(u"b"), S(u""));
    m_set->SetProperty(S(u"a"), S(u"x|y"));
    EXPECT_EQ(TextOf(*m_set), S(u"a|x\\|y|b||"));
    m_set->SetProperty(S(u"c\\d|"), S(u"\\|\\\\"));
    EXPECT_EQ(TextOf(*m_set), S(u"a|x\\|y|b||c\\\\d\\||\\\\\\|\\\\\\\\|"));

    const Pairs pairs{{S(u""), S(u"empty name")}, {S(u"\\"), S(u"|")},   {S(u"a|b"), S(u"c\\d")},
                      {S(u"end\\"), S(u"\\")},    {S(u"plain"), S(u"")}, {S(u"x"), S(u"||\\\\|")}};
    ReleasePtr<IProperties> set(CreateProperties());
    for (const auto& [name, value] : pairs)
        set->SetProperty(name, value);
    EXPECT_EQ(Parse(TextOf(*set)), pairs);
}

TEST_F(PropertiesTest, ParserDropsPendingTextAndReadsOddEscapes) {
    for (const char16_t* pending : {u"a|1|b", u"a|1|b|", u"a|1|b|2"})
        EXPECT_EQ(Parse(S(pending)), (Pairs{{S(u"a"), S(u"1")}})) << S(pending).toStdString();
    EXPECT_EQ(Parse(S(u"a|1\\")), Pairs{});
    EXPECT_EQ(Parse(S(u"a|x\\qy|")), (Pairs{{S(u"a"), S(u"x|y")}}))
        << "a backslash and a letter read as one \"|\"";
    EXPECT_EQ(Parse(S(u"|v|")), (Pairs{{S(u""), S(u"v")}}));
    EXPECT_EQ(Parse(S(u"a|1|a|2|")), (Pairs{{S(u"a"), S(u"2")}}));
    EXPECT_EQ(Parse(S(u"")), Pairs{});
}
