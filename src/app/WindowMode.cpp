#include "app/WindowMode.h"

#include "addressbook/AddressBook.h"
#include "controller/MailSettings.h"
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
    MailSettings settings;
    PasswordStore passwords;
    // The window is the controller's view, and shows what the controller holds: it is made
    // first and goes first.
    auto window = std::make_unique<MainWindow>(*book, passwords, settings);
    PelmoController controller(*window, *book, passwords, settings);
    window->setController(controller);
    controller.startUp();
    controller.applicationWillFinishLaunching();
    window->show();
    QObject::connect(qApp, &QCoreApplication::aboutToQuit, &controller,
                     &PelmoController::applicationWillTerminate);
    const int status = QApplication::exec();
    window.reset();
    return status;
}
