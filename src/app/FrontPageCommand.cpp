#include "app/Commands.h"

#include "addressbook/AddressBook.h"
#include "app/ConsoleView.h"
#include "controller/MailSettings.h"
#include "controller/PasswordStore.h"
#include "controller/PelmoController.h"
#include "util/PelmoException.h"

#include <QCoreApplication>
#include <QTextStream>

namespace Commands {

bool askFrontPage(PelmoController& controller) {
    bool found = false;
    QObject::connect(&controller, &PelmoController::webPageSettled, [&found](bool answer) {
        found = answer;
        QCoreApplication::exit(0);
    });
    QMetaObject::invokeMethod(&controller, &PelmoController::webPage, Qt::QueuedConnection);
    QCoreApplication::exec();
    return found;
}

int frontPage(const QStringList& args) {
    if (!args.isEmpty()) {
        QTextStream(args.first() == QLatin1String("--help") ? stdout : stderr)
            << "usage: pelmo front-page\n"
               "  prints the address and the title of the page the web browser shows\n";
        return args.first() == QLatin1String("--help") ? 0 : 2;
    }
    try {
        ConsoleView view;
        AddressBook book;
        MailSettings settings;
        PasswordStore passwords;
        PelmoController controller(view, book, passwords, settings);
        controller.applicationWillFinishLaunching();
        const bool found = askFrontPage(controller);
        controller.applicationWillTerminate();
        if (found)
            QTextStream(stdout) << view.webPageOrFile() << '\n' << view.subject() << '\n';
        return found ? 0 : 1;
    } catch (const PelmoException& failure) {
        QTextStream(stderr) << "pelmo front-page: " << failure.reason() << '\n';
        return 1;
    }
}

} // namespace Commands
