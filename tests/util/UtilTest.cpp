#include "RowName.h"
#include "util/CLog.h"
#include "util/DataFolder.h"
#include "util/DefaultMailClient.h"
#include "util/LocalizedStrings.h"
#include "util/PrivateFiles.h"
#include "util/TextUtilities.h"

#include "text/CString256.h"

#include <QCoreApplication>
#include <QDateTime>
#include <QDesktopServices>
#include <QDir>
#include <QFile>
#include <QProcess>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <QTimeZone>
#include <QTranslator>
#include <QUrl>
#include <gtest/gtest.h>

#include <map>
#include <memory>

#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace {

// The rows of a file of tests/data/util/, whose head tells their form, named by their first word.
struct Row {
    std::string name, line;
};
void PrintTo(const Row& row, std::ostream* out) {
    *out << row.name;
}

std::vector<Row> rows(const char* file) {
    QFile data(QStringLiteral(PELMO_TEST_DATA "/util/") + QLatin1String(file));
    EXPECT_TRUE(data.open(QIODevice::ReadOnly));
    std::vector<Row> lines;
    for (const QByteArray& line : data.readAll().split('\n'))
        if (!line.isEmpty() && !line.startsWith('#'))
            lines.push_back({line.left(line.indexOf(' ')).toStdString(), line.toStdString()});
    return lines;
}

// The cases of a file of tests/data/util/, each its lines after the "== NAME" that starts it.
std::vector<Row> cases(const char* file) {
    QFile data(QStringLiteral(PELMO_TEST_DATA "/util/") + QLatin1String(file));
    EXPECT_TRUE(data.open(QIODevice::ReadOnly));
    std::vector<Row> all;
    for (const QString& text : QString::fromUtf8(data.readAll()).split("\n== ").mid(1))
        all.push_back(
            {text.section('\n', 0, 0).toStdString(), text.section('\n', 1).toStdString()});
    return all;
}

// The only entry a translator into French has.
class French : public QTranslator {
public:
    QString translate(const char* context, const char* key, const char*, int) const override {
        return QByteArray(context) + ':' + key == "LocalizedStrings:Sending message"
                   ? QStringLiteral("Envoi du message")
                   : QString();
    }
    bool isEmpty() const override { return false; }
};

QString made(const QString& function, const QStringList& args) {
    const QString a = args.value(0), b = args.value(1);
    char out[64];
    std::memset(out, 'Z', sizeof out);
    if (function == "reverse") {
        std::strcpy(out, a.toLatin1().constData());
        reverse(out);
    } else if (function == "itoa") {
        itoa(out, a.toShort(), b.toLong());
    } else if (function == "newitoa") {
        const std::unique_ptr<char[]> text(a == "unsigned" ? itoa(b.toULong())
                                           : a == "long"   ? itoa(b.toLong())
                                                           : itoa(b.toShort()));
        return QString::fromLatin1(text.get());
    } else if (function == "class") {
        const qsizetype k = QString("upper lower letter digit safe extra reserved punctuation "
                                    "national")
                                .split(' ')
                                .indexOf(a);
        bool (*const classes[])(unsigned char) = {isHiAlpha,  isLoAlpha,     isHiorLoAlpha,
                                                  isDig,      isSafe,        isExtra,
                                                  isReserved, isPunctuation, isNational};
        QString bytes;
        for (int c = 0; c < 256; ++c) {
            const auto byte = static_cast<unsigned char>(c);
            if (k >= 0 ? classes[k](byte) : !NeedsURLEncoding(byte))
                bytes += QChar(c);
        }
        return bytes;
    } else if (function == "urlencode" || function == "urlsafe") {
        QString text;
        for (const char byte : QByteArray::fromHex(a.toLatin1())) {
            (function == "urlencode" ? URLencode : URLSafeEncode)(out,
                                                                  static_cast<unsigned char>(byte));
            text += QString::fromLatin1(out);
        }
        return text;
    } else if (function == "elapsed") {
        CString256 text("took ");
        ElapsedTimeMessage(a.toUInt(), text);
        return QString::fromLatin1(text.c_str());
    } else if (function == "move") {
        QStringList list = {"a", "b", "c", "d"};
        MoveArrayItem(list, a.toLongLong(), b.toLongLong());
        return list.join(QString());
    } else if (function == "mime") {
        return MimeTypeForPath(a).isNull() ? "(none)" : MimeTypeForPath(a);
    } else if (function == "date") {
        return DateDescription(
            QDateTime(QDate(2024, 5, 1), QTime(14, 3, 22), QTimeZone(a.toInt())));
    } else if (function == "addrspec") {
        return IsAddrSpec(a) ? "address" : "not an address";
    } else if (function == "utf8") {
        const QString text = DecodeUtf8Strictly(QByteArray::fromHex(a.toLatin1()));
        return text.isNull() ? "(not UTF-8)" : text;
    } else if (function == "format") {
        return LocalizedFormat(a.toUtf8().constData(), args.mid(1));
    } else if (function == "french") {
        French french;
        QCoreApplication::installTranslator(&french);
        const QString translated = LocalizedString(a);
        QCoreApplication::removeTranslator(&french);
        return translated + " / " + LocalizedString(a);
    }
    return QString::fromLatin1(out);
}

class Texts : public ::testing::TestWithParam<Row> {};

TEST_P(Texts, Made) {
    const QString line = QString::fromStdString(GetParam().line);
    const QStringList words = QProcess::splitCommand(line.section(" => ", 0, 0));
    const QString expected = line.section(" => ", 1);
    const bool quoted = expected.size() > 1 && expected.startsWith('"') && expected.endsWith('"');
    EXPECT_EQ(made(words.value(1), words.mid(2)).toStdString(),
              (quoted ? expected.mid(1, expected.size() - 2) : expected).toStdString());
}

INSTANTIATE_TEST_SUITE_P(Util, Texts, ::testing::ValuesIn(rows("texts.txt")), RowName());

// A data home of its own, with no umask to narrow the modes asked for.
class Home : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(home.isValid());
        saved = qgetenv("XDG_DATA_HOME");
        qputenv("XDG_DATA_HOME", home.path().toUtf8());
        savedMask = ::umask(0);
    }
    void TearDown() override {
        StopLogging();
        ::umask(savedMask);
        qputenv("XDG_DATA_HOME", saved);
    }
    // "@" stands for the data folder's parent, "Orvale Software".
    std::string at(QString path) const {
        return (home.path() + '/' + path.trimmed().replace('@', "Orvale Software")).toStdString();
    }

    QTemporaryDir home;
    QByteArray saved;
    mode_t savedMask = 0;
};

// Stands in for the desktop's "open in the default application".
class Opener : public QObject {
    Q_OBJECT
public:
    QList<QUrl> opened;
public Q_SLOTS:
    void open(const QUrl& url) { opened << url; }
};

class Log : public Home {};

// The console shows the log once there is one.
TEST_F(Log, RunsAppendedAndShown) {
    Opener opener;
    QDesktopServices::setUrlHandler("file", &opener, "open");
    LogEntry("before"); // makes no file
    OpenConsole();
    StartLogging();
    StartLogging(); // closes the first log, stop marker included
    for (const std::string& line :
         {std::string(254, 'a'), std::string(255, 'b'), std::string(300, 'c'), std::string("end"),
          std::string("two\nparts caf\xc3\xa9")})
        LogEntry(line.c_str());
    StopLogging();
    LogEntry("dropped");
    StartLogging();
    LogEntry("second run");
    StopLogging();
    OpenConsole();
    QDesktopServices::unsetUrlHandler("file");
    QFile log(QString::fromStdString(at("@/Pelmo/Pelmo.log")));
    EXPECT_EQ(opener.opened, QList<QUrl>{QUrl::fromLocalFile(log.fileName())});
    ASSERT_TRUE(log.open(QIODevice::ReadOnly));
    // A line is held in 255 bytes: at 255 it has no room left for its carriage return.
    EXPECT_EQ(
        QString::fromUtf8(log.readAll())
            .replace(QRegularExpression(R"(\d{4}-\d\d-\d\d \d\d:\d\d:\d\d [+-]\d{4})"), "DATE")
            .toStdString(),
        "[Logging starting at DATE]\r[Logging stopping at DATE]\r[Logging starting at DATE]\r" +
            std::string(254, 'a') + '\r' + std::string(255, 'b') + std::string(255, 'c') +
            "end\rtwo\nparts caf\xc3\xa9\r[Logging stopping at DATE]\r"
            "[Logging starting at DATE]\rsecond run\r[Logging stopping at DATE]\r");
}

// MakePrivateFile by a user who owns nothing here (root reads any file).
bool privateFileAsNobody(const std::string& path) {
    if (::geteuid() != 0)
        return MakePrivateFile(path);
    ::chmod(std::filesystem::path(path).parent_path().c_str(), 0755);
    const pid_t child = ::fork();
    if (child == 0)
        ::_exit(::setgid(65534) == 0 && ::setuid(65534) == 0 && MakePrivateFile(path) ? 0 : 1);
    int status = 0;
    return ::waitpid(child, &status, 0) == child && WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

class Modes : public Home, public ::testing::WithParamInterface<Row> {};

TEST_P(Modes, Private) {
    const QStringList row = QString::fromStdString(GetParam().line).split(" | ");
    ASSERT_EQ(row.size(), 5);
    ASSERT_EQ(QProcess::execute("sh", {"-c",
                                       "cd \"$0\" && kept() { printf kept >\"$1\" && chmod \"$2\" "
                                       "\"$1\" && echo \"$1\" >>.kept; }\n" +
                                           QString(row[1]).replace('@', "'Orvale Software'"),
                                       home.path()}),
              0);
    const QString act = row[2].section(' ', 0, 0);
    const std::string on = at(row[2].section(' ', 1));
    std::filesystem::path folder;
    const bool done = act == "folder"  ? GetOurApplicationSupportFolder(folder)
                      : act == "log"   ? (StartLogging(), gLogger && gLogger->is_open())
                      : act == "mkdir" ? MakePrivateFolder(on)
                      : act == "file"  ? MakePrivateFile(on)
                                       : privateFileAsNobody(on);
    EXPECT_EQ(done ? "done" : "refused", row[3]);
    EXPECT_EQ(folder.string(), act == "folder" && done ? at("@/Pelmo") : "");
    for (const QString& item : row[4].split(", ")) {
        struct stat status {};
        const bool there = ::stat(at(item.section('=', 0, 0)).c_str(), &status) == 0;
        EXPECT_EQ((there ? QString::number(status.st_mode & 07777, 8) : "-").toStdString(),
                  item.section('=', 1).toStdString());
    }
    QFile kept(home.filePath(".kept"));
    for (const QByteArray& path :
         kept.open(QIODevice::ReadOnly) ? kept.readAll().split('\n') : QList<QByteArray>()) {
        QFile file(home.filePath(QString::fromUtf8(path)));
        EXPECT_TRUE(path.isEmpty() ||
                    (file.open(QIODevice::ReadOnly) && file.readAll().startsWith("kept")))
            << path.constData() << " lost its content";
    }
}

INSTANTIATE_TEST_SUITE_P(Files, Modes, ::testing::ValuesIn(rows("privacy.txt")), RowName());

// Catches a wrong lookup order or file name, and a reading of the files that xdg-mime does not
// share; a line, group or comment lost, a mailto line added twice or to the wrong group; the
// user's file made readable to others (no umask hides it here).
class MimeApps : public ::testing::TestWithParam<Row> {
protected:
    void TearDown() override { ::umask(mask); }
    void expectDefault(const std::string& expected, bool xdgMime) {
        const QString client = DefaultMailClient();
        EXPECT_EQ(client.isNull() ? "-" : client.toStdString(), expected);
        if (!xdgMime)
            return;
        QProcess query;
        query.start("xdg-mime", {"query", "default", "x-scheme-handler/mailto"});
        ASSERT_TRUE(query.waitForFinished());
        const std::string answer = query.readAllStandardOutput().trimmed().toStdString();
        EXPECT_EQ(answer.empty() ? "-" : answer, expected) << "xdg-mime's answer";
    }
    mode_t mask = ::umask(0);
    QTemporaryDir root;
};

TEST_P(MimeApps, MakePelmoDefault) {
    std::map<QString, QString> given, expected;
    std::map<QString, std::string> says;
    QString* text = nullptr;
    for (const QString& line : QString::fromStdString(GetParam().line).split('\n')) {
        const QString word = line.section(' ', 0, 0), rest = line.section(' ', 1);
        if (word == "<" || word == ">")
            text = &(word == "<" ? given : expected)[rest];
        else if (line.startsWith('|'))
            *text += line.mid(1) + '\n';
        for (const QString& app : word == "apps" ? rest.split(' ') : QStringList())
            given["share/applications/" + app] =
                "[Desktop Entry]\nType=Application\nName=M\nExec=sh\n";
        says[word] = rest.toStdString();
    }
    for (const QString pair : {"XDG_CONFIG_HOME=config", "XDG_CONFIG_DIRS=etc",
                               "XDG_DATA_HOME=data", "XDG_DATA_DIRS=share"})
        qputenv(pair.section('=', 0, 0).toUtf8(), root.filePath(pair.section('=', 1)).toUtf8());
    qputenv("XDG_CURRENT_DESKTOP", says["desktop"].c_str());
    for (const auto& [path, content] : given) {
        QFile file(root.filePath(path));
        ASSERT_TRUE(QDir().mkpath(QFileInfo(file).path()) && file.open(QIODevice::WriteOnly));
        file.write(content.toUtf8());
    }
    const QString list = root.filePath("config/mimeapps.list");
    const QFile::Permissions mine =
        QFile::ReadOwner | QFile::WriteOwner | QFile::ReadUser | QFile::WriteUser;
    const int mode =
        (QFile::exists(list) ? QFile::permissions(list) : mine).toInt(); // kept, or 0600
    expectDefault(says["before"], says.count("xdg-mime"));
    EXPECT_EQ(MakePelmoDefaultMailClient(), 0);
    for (const auto& [path, content] : expected) {
        QFile file(root.filePath(path));
        EXPECT_TRUE(file.open(QIODevice::ReadOnly));
        EXPECT_EQ(file.readAll().toStdString(), content.toStdString()) << path.toStdString();
    }
    EXPECT_EQ(QFile::permissions(list).toInt(), mode);
    expectDefault(says["after"], says.count("xdg-mime"));
}

INSTANTIATE_TEST_SUITE_P(Util, MimeApps, ::testing::ValuesIn(cases("mimeapps.txt")), RowName());

} // namespace

#include "UtilTest.moc"
