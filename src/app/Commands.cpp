#include "app/Commands.h"

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
     "  pelmo contacts list [--group NAME]  list everyone, or the members of one group"},
    {"send", send,
     "pelmo send [options]                one mailing run without a window (pelmo send --help)"},
    {"relink", relink,
     "pelmo relink BASE-URL [FILE]        print FILE (or standard input) relinked against "
     "BASE-URL"},
};

} // namespace

QString usage() {
    QString text = QStringLiteral("usage:\n");
    for (const Command& command : kCommands)
        text += QStringLiteral("  ") + QString::fromUtf8(command.synopsis) + QLatin1Char('\n');
    return text;
}

int run(const QStringList& args) {
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
