#pragma once

// A test main for units that ask the host application for its settings
// store: runs the test object inside a Gui::Orba::ApplicationBase whose store
// is kept in memory, so no test touches the user's settings file.

#include "ApplicationBase.h"
#include "Settings.h"

#include <QStandardPaths>
#include <QTest>

#define FIF_HOST_TEST_MAIN(TestObject)                                         \
    int main(int argc, char** argv)                                            \
    {                                                                          \
        QStandardPaths::setTestModeEnabled(true);                              \
        Gui::Orba::ApplicationBase app(argc, argv);                            \
        Gui::Orba::Settings settings;                                          \
        app.setSettings(&settings);                                            \
        app.setAttribute(Qt::AA_Use96Dpi, true);                               \
        TestObject tc;                                                         \
        QTEST_SET_MAIN_SOURCE_PATH                                             \
        const int result = QTest::qExec(&tc, argc, argv);                      \
        app.setSettings(nullptr);                                              \
        return result;                                                         \
    }
