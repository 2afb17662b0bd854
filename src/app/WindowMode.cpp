#include "app/WindowMode.h"

#include "addressbook/AddressBook.h"
#include "controller/PasswordStore.h"
#include "controller/PelmoController.h"
#include "gui/MainWindow.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"

#include <QApplication>
#include <QMessageBox>

#include <memory>

int runWindow() {
    std::unique_ptr<AddressBook> book;
    try {
        book = std::make_unique<AddressBook>();
    } catch (const PelmoException& failure) {
        QMessageBox::critical(nullptr, LocalizedStringNS("Pelmo cannot start"), failure.reason());
        return 1;
    }
    PasswordStore passwords;
    MainWindow window(*book, passwords);
    PelmoController& controller = window.controller();
    controller.startUp();
    controller.applicationWillFinishLaunching();
    window.show();
    QObject::connect(qApp, &QCoreApplication::aboutToQuit, &controller,
                     &PelmoController::applicationWillTerminate);
    return QApplication::exec();
}
