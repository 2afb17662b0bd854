#include "TestEnvironment.h"

#include <QCoreApplication>
#include <gtest/gtest.h>

// Qt's translators and settings need an application object, as in the real program.
int main(int argc, char** argv) {
    useTestEnvironment();
    QCoreApplication app(argc, argv);
    ::testing::InitGoogleTest(&argc, argv);
    return RUN_ALL_TESTS();
}
