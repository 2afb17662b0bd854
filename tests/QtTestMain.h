#pragma once

#include "TestEnvironment.h"

#include <QByteArray>
#include <QTemporaryDir>
#include <gtest/gtest.h>

#include <functional>

// Runs the tests inside an App (QGuiApplication, QApplication) on the offscreen platform, with
// the configuration and data homes in a temporary folder. QSettings fixes its folders on first
// use, so they are set before the application exists. started runs once the application
// exists, before any test.
template <class App>
int runTestsIn(int argc, char** argv, const std::function<void()>& started = {}) {
    useTestEnvironment();
    QTemporaryDir home;
    if (!home.isValid())
        return 1;
    qputenv("XDG_CONFIG_HOME", (home.path() + QStringLiteral("/config")).toUtf8());
    qputenv("XDG_DATA_HOME", (home.path() + QStringLiteral("/data")).toUtf8());
    // Test discovery runs the program without the tests' environment.
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM"))
        qputenv("QT_QPA_PLATFORM", "offscreen");
    App app(argc, argv);
    if (started)
        started();
    ::testing::InitGoogleTest(&argc, argv);
    return RUN_ALL_TESTS();
}
