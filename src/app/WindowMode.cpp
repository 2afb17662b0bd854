#include "app/WindowMode.h"

#include "addressbook/AddressBook.h"
#include "app/SingleInstance.h"
#include "controller/MailSettings.h"
#include "controller/PasswordStore.h"
#include "controller/PelmoController.h"
#include "gui/MainWindow.h"
#include "gui/ToolWindows.h"
#include "update/SoftwareUpdateController.h"
#include "util/AppIdentity.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"
#include "util/Translations.h"

#include <QApplication>
#include <QLockFile>
#include <QMessageBox>
#include <QTextStream>

#include <memory>

void nameApplication() {
    QCoreApplication::setOrganizationName(QString::fromLatin1(kOrganisationName));
    QCoreApplication::setApplicationName(QString::fromLatin1(kApplicationName));
    QCoreApplication::setApplicationVersion(QStringLiteral(PELMO_VERSION));
}

void acceptHandOvers(SingleInstance& instance, MainWindow& window, PelmoController& controller) {
    QObject::connect(&instance, &SingleInstance::received, &window,
                     [&window, &controller](const QString& link) {
                         controller.handleGetURLEvent(link);
                         bringToFront(&window);
                     });
}

int runWindow(const QString& link, SingleInstance& instance) {
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
    controller.handleGetURLEvent(link);
    acceptHandOvers(instance, *window, controller);
    SoftwareUpdateController updates;
    window->setSoftwareUpdate(updates);
    window->show();
    if (const int mailed = controller.findInterruptedRun(); mailed > 0)
        window->offerInterruptedRun(mailed);
    updates.awake();
    QObject::connect(qApp, &QCoreApplication::aboutToQuit, &controller,
                     &PelmoController::applicationWillTerminate);
    const int status = QApplication::exec();
    window.reset();
    return status;
}

int startWindow(int argc, char** argv, const QString& link) {
    // Held until this start listens, or has handed its link over: of two starts at the same
    // moment, the second finds the first listening.
    QLockFile lock(SingleInstance::lockPath());
    lock.tryLock(10000);
    {
        QCoreApplication probe(argc, argv);
        switch (SingleInstance::handOver(link, std::chrono::seconds(5))) {
        case SingleInstance::HandOver::Taken:
            return 0;
        case SingleInstance::HandOver::NoAnswer:
            QTextStream(stderr) << "pelmo: the Pelmo already running does not answer\n";
            return 1;
        case SingleInstance::HandOver::NoneRunning:
            break;
        }
    }
    QApplication app(argc, argv);
    nameApplication();
    installTranslations(QLocale::system());
    QGuiApplication::setDesktopFileName(QStringLiteral("pelmo"));
    SingleInstance instance;
    if (!instance.listen())
        QTextStream(stderr) << "pelmo: cannot listen on " << SingleInstance::socketPath()
                            << "; links will open another Pelmo\n";
    lock.unlock();
    return runWindow(link, instance);
}
