#include "app/Commands.h"

#include "util/CLog.h"
#include "util/DefaultMailClient.h"

#include <QTextStream>

#include <cstdio>
#include <cstring>

namespace Commands {

int defaultClient(const QStringList& args) {
    const bool set = args == QStringList{QStringLiteral("--set")};
    if (!args.isEmpty() && !set) {
        const bool help = args == QStringList{QStringLiteral("--help")};
        QTextStream(help ? stdout : stderr)
            << "usage: pelmo default-client [--set]\n"
               "  prints the application that opens links to e-mail addresses; --set makes it "
               "Pelmo\n";
        return help ? 0 : 2;
    }
    if (set) {
        StartLogging(); // where a failure is written down
        const int error = MakePelmoDefaultMailClient();
        StopLogging();
        if (error != 0)
            QTextStream(stderr) << "pelmo default-client: cannot write " << UserMimeAppsList()
                                << ": " << std::strerror(error) << '\n';
        return error == 0 ? 0 : 1;
    }
    const QString client = DefaultMailClient();
    QTextStream(stdout) << client << '\n';
    return client == QLatin1String("pelmo.desktop") ? 0 : 1;
}

} // namespace Commands
