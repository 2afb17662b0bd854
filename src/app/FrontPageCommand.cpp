#include "app/Commands.h"

#include "controller/PelmoController.h"

#include <QCoreApplication>
#include <QTextStream>

namespace Commands {

bool askFrontPage(PelmoController& controller) {
    bool found = false;
    const QMetaObject::Connection answered =
        QObject::connect(&controller, &PelmoController::webPageSettled, [&found](bool answer) {
            found = answer;
            QCoreApplication::exit(0);
        });
    QMetaObject::invokeMethod(&controller, &PelmoController::webPage, Qt::QueuedConnection);
    QCoreApplication::exec();
    QObject::disconnect(answered);
    return found;
}

int frontPage(const QStringList& args) {
    if (!args.isEmpty()) {
        QTextStream(args.first() == QLatin1String("--help") ? stdout : stderr)
            << "usage: pelmo front-page\n"
               "  prints the address and the title of the page the web browser shows\n";
        return args.first() == QLatin1String("--help") ? 0 : 2;
    }
    return onConsole("front-page", false, [](PelmoController& controller, AddressBook&) {
        if (!askFrontPage(controller))
            return 1;
        const PelmoView& view = controller.view();
        QTextStream(stdout) << view.webPageOrFile() << '\n' << view.subject() << '\n';
        return 0;
    });
}

} // namespace Commands
