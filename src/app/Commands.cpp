#include "app/Commands.h"

#include <QCoreApplication>
#include <QTextStream>

#include <cstdio>
#include <vector>

namespace Commands {

namespace {

struct Command {
    const char* name;
    int (*run)(const QStringList& args);
    const char* synopsis;
};

// One row per command, in the order the usage lists them.
const std::vector<Command> kCommands = {
    {"contacts", contacts,
     "pelmo contacts import FILE          add a vCard (.vcf) or CSV file to the address book\n"
     "  pelmo contacts export [--group NAME] FILE.vcf\n"
     "                                      write everyone, or one group, as a vCard 4.0 file\n"
     "  pelmo contacts list [--group NAME]  list everyone, or the members of one group\n"
     "  pelmo contacts groups               list the groups and how many members each has"},
    {"send", send,
     "pelmo send [options]                one mailing run without a window (pelmo send --help)"},
    {"relink", relink,
     "pelmo relink BASE-URL [FILE]        print FILE (or standard input) relinked against "
     "BASE-URL"},
    {"front-page", frontPage,
     "pelmo front-page                    print the address and title of the browser's page"},
    {"default-client", defaultClient,
     "pelmo default-client [--set]        print the mail client links open in, or make it Pelmo"},
    {"check-update", checkUpdate,
     "pelmo check-update                  ask whether a newer Pelmo has been published"},
};

} // namespace

QString usage() {
    QString text =
        QStringLiteral("usage:\n"
                       "  pelmo                               open the window, or bring "
                       "it to the front\n"
                       "  pelmo mailto:ADDRESS                the same, ADDRESS in its To "
                       "field\n");
    for (const Command& command : kCommands)
        text += QStringLiteral("  ") + QString::fromUtf8(command.synopsis) + QLatin1Char('\n');
    return text +
           QStringLiteral("  pelmo --help | --version            this text, or the version\n");
}

int run(const QStringList& args) {
    // Asked for, the usage and the version are the answer and go to standard output.
    if (args.size() == 1 &&
        (args.first() == QLatin1String("--help") || args.first() == QLatin1String("-h"))) {
        QTextStream(stdout) << usage();
        return 0;
    }
    if (args.size() == 1 && args.first() == QLatin1String("--version")) {
        QTextStream(stdout) << "Pelmo " << QCoreApplication::applicationVersion() << '\n';
        return 0;
    }
    if (!args.isEmpty()) {
        for (const Command& command : kCommands) {
            if (args.first() == QLatin1String(command.name))
                return command.run(args.mid(1));
        }
    }
    QTextStream(stderr) << usage();
    return 2;
}

} // namespace Commands
