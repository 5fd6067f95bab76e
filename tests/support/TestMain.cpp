#include <gtest/gtest.h>

#include <QApplication>

// Every test program runs offscreen with a real application object, so widgets, screens and
// event loops behave as in the program.
int main(int argc, char* argv[]) {
    qputenv("QT_QPA_PLATFORM", "offscreen");
    ::testing::InitGoogleTest(&argc, argv);
    QApplication application(argc, argv);
    return RUN_ALL_TESTS();
}
