#include "viewer/ViewerCommandLine.h"

#include "support/AmbrelTest.h"

namespace {

using namespace Qt::StringLiterals;

const QString kId = u"0A1B2C3D-4E5F-6789-ABCD-EF0123456789"_s;

struct Case {
    QStringList arguments;
    bool valid;
    bool openSwitch;
    QString file;
};

TEST(ViewerCommandLineTest, ReadsTheOpenSwitchTheFileAndTheItemId) {
    const Case cases[] = {
        {{u"/o"_s, u"/home/me/My Papers/a report.pdf"_s, u"/id:"_s + kId},
         true,
         true,
         u"/home/me/My Papers/a report.pdf"_s},
        // The navigator's form: the file comes later, over the bus.
        {{u"/o"_s, u"/id:"_s + kId}, true, true, {}},
        {{u"-ID:"_s + kId.toLower(), u"-O"_s, u"-odd name.doc"_s}, true, true, u"-odd name.doc"_s},
        {{u"/id:"_s + kId}, true, false, {}},
        {{u"/o"_s, u"/tmp/a.pdf"_s}, false, true, u"/tmp/a.pdf"_s},
        {{u"/id:"_s}, false, false, {}},
        {{u"/id:not-an-identifier"_s}, false, false, {}},
        {{u"/id:"_s + kId, u"stray.pdf"_s}, false, false, {}},
    };
    for (const Case& c : cases) {
        const ViewerCommandLine line = ViewerCommandLine::Parse(c.arguments);
        const std::string where = c.arguments.join(u' ').toStdString();
        EXPECT_EQ(line.IsValid(), c.valid) << where;
        EXPECT_EQ(line.HasOpenSwitch(), c.openSwitch) << where;
        EXPECT_EQ(line.File(), c.file) << where;
        if (c.valid)
            EXPECT_EQ(line.ItemId().toUpper(), kId) << where;
        else
            EXPECT_FALSE(line.Problem().isEmpty()) << where;
    }
}

} // namespace
