#include "Transcript.h"

#include "E2eSupport.h"

#include <QDir>
#include <QRegularExpression>
#include <gtest/gtest.h>

#include <memory>

#include <sys/stat.h>

namespace {

QByteArray bytes(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : "(no file)";
}

QString cli(const QString& file) {
    return QString::fromUtf8(bytes(QStringLiteral(PELMO_TEST_DATA "/cli/") + file));
}

// A message as its reader sees it, its line ends shown.
QString outline(const QByteArray& bytes) {
    const ReceivedMessage message = parseMessage(bytes);
    EXPECT_FALSE(message.bareLineFeed || message.date.isEmpty() || message.messageId.isEmpty());
    QStringList lines = {"From: " + message.from, "To: " + message.to,
                         "Subject: " + message.subject, message.topType};
    if (!message.listUnsubscribe.isEmpty())
        lines.insert(3, "List-Unsubscribe: " + message.listUnsubscribe);
    for (const ReceivedPart& part : message.parts)
        lines << QStringLiteral("  %1 %2 %3%4: \"%5\"")
                     .arg(
                         part.mimeType, part.charset, part.encoding,
                         part.filename.isEmpty() ? QString() : ' ' + part.filename,
                         QString::fromUtf8(part.content).replace("\r", "\\r").replace("\n", "\\n"));
    return lines.join('\n');
}

class Terminal {
public:
    Terminal() {
        environment.insert("XDG_DATA_HOME", home.filePath("data"));
        environment.insert("XDG_CONFIG_HOME", home.filePath("config"));
        environment.insert("XDG_RUNTIME_DIR", home.path()); // private, as Qt wants it
        environment.remove("SSL_CERT_FILE");
    }

    // What one line does and prints, with what changes from run to run made placeholders.
    QString play(const QString& line) {
        const QStringList words = QProcess::splitCommand(expand(line));
        const QString& what = words.value(words.value(0) == "$" ? 1 : 0);
        QString out;
        if (what == "server") {
            server =
                std::make_unique<ServerProcess>(PELMO_TEST_DATA "/../" + words[1], words.mid(2));
            EXPECT_NE(server->port(), 0);
        } else if (what == "env") {
            environment.insert(words[1].section('=', 0, 0), words[1].section('=', 1));
        } else if (what == "pelmo") {
            const PelmoRun run = runPelmo(words.mid(2), environment);
            out = run.out;
            for (const QString& error : run.err.split('\n', Qt::SkipEmptyParts))
                out += "! " + error + '\n';
            out += run.status == 0 ? QString() : QStringLiteral("[exit %1]").arg(run.status);
            secrets << words.filter(QRegularExpression("^loginPassword=."))
                           .replaceInStrings("loginPassword=", "");
        } else if (what == "received") {
            for (const QByteArray& record : server->records())
                out += outline(messageOf(record)) + '\n';
        } else if (what == "eml") {
            for (const QString& name : QDir(words[2]).entryList(QDir::Files, QDir::Name))
                out += name + '\n' + outline(bytes(words[2] + '/' + name)) + '\n';
        } else if (what == "cat") {
            out = QString::fromUtf8(bytes(words[2])).replace("\r", "\\r");
        } else if (what == "mode") {
            struct stat status {};
            out = ::stat(QFile::encodeName(words[2]).constData(), &status) == 0
                      ? QString::number(status.st_mode & 07777, 8)
                      : QStringLiteral("(no file)");
        } else if (what == "log") {
            out = QString::fromUtf8(bytes(home.filePath("data/Orvale Software/Pelmo/Pelmo.log")));
            EXPECT_FALSE(out.contains('\n')) << "log lines end in a carriage return";
            out.replace('\r', '\n');
        }
        for (const QString& secret : secrets)
            EXPECT_FALSE(out.contains(secret)) << "a password was shown: " << line.toStdString();
        static const QRegularExpression date(R"(\d{4}-\d\d-\d\d \d\d:\d\d:\d\d [+-]\d{4})");
        out.replace(home.path(), "{home}").replace(PELMO_TEST_DATA "/cli", "{data}");
        return out.replace(date, "{date}").trimmed();
    }

private:
    QString expand(QString line) {
        if (!pki && (line.contains("{ca}") || line.contains("{cert}")))
            pki = std::make_unique<Certificates>(home.path());
        if (pki)
            line.replace("{ca}", pki->ca).replace("{cert}", pki->cert).replace("{key}", pki->key);
        return line.replace("{home}", home.path())
            .replace("{data}", PELMO_TEST_DATA "/cli")
            .replace("{samples}", PELMO_TEST_DATA "/../../samples")
            .replace("{port}", QString::number(server ? server->port() : 0));
    }

    QTemporaryDir home;
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    std::unique_ptr<ServerProcess> server;
    std::unique_ptr<Certificates> pki;
    QStringList secrets;
};

} // namespace

std::vector<Session> sessionsOf(const QString& file) {
    std::vector<Session> names;
    static const QRegularExpression header("^== (\\w+)$", QRegularExpression::MultilineOption);
    for (const QRegularExpressionMatch& match : header.globalMatch(cli(file)))
        names.push_back({match.captured(1).toStdString()});
    return names;
}

void playSession(const QString& file, const std::string& name) {
    const QString written = cli(file)
                                .section(QString::fromStdString("\n== " + name + '\n'), 1)
                                .section("\n== ", 0, 0)
                                .trimmed();
    Terminal terminal;
    QStringList played;
    static const QRegularExpression command("^(\\$ |server |env |#)");
    for (const QString& line : written.split('\n')) {
        if (command.match(line).hasMatch()) // the rest is what the line above printed
            played << line << (line.startsWith('#') ? QString() : terminal.play(line));
    }
    played.removeAll(QString());
    EXPECT_EQ(played.join('\n').toStdString(), written.toStdString());
}
