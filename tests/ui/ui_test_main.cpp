// The main of the window tests: an offscreen QApplication with a pinned font, quiet traces.
#include <gtest/gtest.h>

#include <QApplication>
#include <QFont>

#include "platform/trace.h"

int main(int argc, char** argv) {
    // Test discovery runs this program too, without the test's environment.
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
    SetTraceSink([](TraceLevel, const char*, const char*) {});
    QApplication app(argc, argv);
    QFont font("DejaVu Sans");
    font.setPointSize(10);
    QApplication::setFont(font);
    testing::InitGoogleTest(&argc, argv);
    return RUN_ALL_TESTS();
}
