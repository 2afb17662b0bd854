#include "QtTestMain.h"

#include <QApplication>

// The windows need a QApplication.
int main(int argc, char** argv) {
    return runTestsIn<QApplication>(argc, argv);
}
