#include "QtTestMain.h"

#include <QGuiApplication>

// A message body is a QTextDocument, whose HTML export needs a QGuiApplication.
int main(int argc, char** argv) {
    return runTestsIn<QGuiApplication>(argc, argv);
}
