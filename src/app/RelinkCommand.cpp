#include "app/Commands.h"

#include "relink/Relink.h"
#include "relink/SuffixMap.h"

#include <QFile>
#include <QTextStream>

#include <cstdio>

namespace Commands {

namespace {

// The whole of FILE, or of standard input for "-" or no file; null with a message on failure.
bool readPage(const QString& path, QByteArray& bytes) {
    QFile file(path);
    const bool opened = path.isEmpty() || path == QLatin1String("-")
                            ? file.open(stdin, QIODevice::ReadOnly)
                            : file.open(QIODevice::ReadOnly);
    if (!opened) {
        QTextStream(stderr) << "pelmo relink: cannot read " << path << ": " << file.errorString()
                            << '\n';
        return false;
    }
    bytes = file.readAll();
    return true;
}

} // namespace

int relink(const QStringList& args) {
    constexpr char usage[] = "usage: pelmo relink BASE-URL [FILE]\n";
    if (args == QStringList{QStringLiteral("--help")}) {
        QTextStream(stdout) << usage;
        return 0;
    }
    if (args.isEmpty() || args.size() > 2 || args.first().startsWith(QLatin1Char('-'))) {
        QTextStream(stderr) << usage;
        return 2;
    }
    const QByteArray base = args.first().toUtf8();
    if (base.size() > CString256::max_length) {
        QTextStream(stderr) << "pelmo relink: the base URL is longer than "
                            << CString256::max_length << " bytes\n";
        return 2;
    }
    QByteArray bytes;
    if (!readPage(args.value(1), bytes))
        return 1;

    InitializeSuffixMap();
    CText page;
    page.append(bytes.constData(), bytes.size());
    // A NUL would end the page for every scan; as in any page read from disk it becomes a blank.
    page.replace_nil_chars_by_space();
    ::relink(CString256(base.constData()), page);

    if (std::fwrite(page.buffer(), 1, page.length(), stdout) !=
            static_cast<size_t>(page.length()) ||
        std::fflush(stdout) != 0) {
        QTextStream(stderr) << "pelmo relink: cannot write the page\n";
        return 1;
    }
    return 0;
}

} // namespace Commands
