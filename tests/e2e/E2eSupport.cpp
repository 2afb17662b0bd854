#include "E2eSupport.h"

#include <QDir>
#include <QFile>
#include <QJsonDocument>
#include <QJsonObject>
#include <QRegularExpression>

#include <gmime/gmime.h>

#include <functional>

ServerProcess::ServerProcess(const QString& script, const QStringList& arguments) {
    m_process.setProgram(QStringLiteral(PELMO_PYTHON3));
    m_process.setArguments(QStringList{QStringLiteral("-u"), script} + arguments);
    m_process.start();
    static const QRegularExpression portLine(QStringLiteral(R"(^PORT (\d+)\r?\n)"));
    while (m_port == 0 && m_process.waitForReadyRead(10000)) {
        m_output += m_process.readAllStandardOutput();
        const QRegularExpressionMatch match = portLine.match(QString::fromLatin1(m_output));
        if (match.hasMatch()) {
            m_port = match.captured(1).toInt();
            m_output = m_output.mid(match.capturedLength());
        }
    }
}

ServerProcess::~ServerProcess() {
    m_process.closeWriteChannel(); // the server stops when its input closes
    if (!m_process.waitForFinished(3000))
        m_process.kill();
    m_process.waitForFinished();
}

QList<QByteArray> ServerProcess::records() {
    m_process.waitForReadyRead(200);
    m_output += m_process.readAllStandardOutput();
    QList<QByteArray> lines = m_output.split('\n');
    lines.removeAll(QByteArray());
    return lines;
}

Certificates::Certificates(const QString& folder)
    : ca(folder + QStringLiteral("/ca.pem")), cert(folder + QStringLiteral("/server.pem")),
      key(folder + QStringLiteral("/server.key")) {
    const char* script =
        "cd \"$0\" && echo subjectAltName=DNS:localhost,IP:127.0.0.1 >san.cnf && "
        "openssl req -x509 -newkey rsa:2048 -nodes -days 2 -subj /CN=Pelmo-Test-CA -keyout ca.key "
        "-out ca.pem && openssl req -newkey rsa:2048 -nodes -subj /CN=localhost -keyout server.key "
        "-out server.csr && openssl x509 -req -in server.csr -CA ca.pem -CAkey ca.key "
        "-CAcreateserial -days 2 -extfile san.cnf -out server.pem";
    QProcess openssl;
    openssl.start(QStringLiteral("sh"),
                  {QStringLiteral("-c"), QString::fromLatin1(script), folder});
    ok = openssl.waitForFinished(60000) && openssl.exitCode() == 0;
}

// The session is written every 200 ms instead of every 15 s; no first-run pages.
constexpr char kFirefoxPrefs[] = R"(user_pref("browser.sessionstore.interval", 200);
user_pref("browser.shell.checkDefaultBrowser", false);
user_pref("browser.startup.homepage_override.mstone", "ignore");
user_pref("datareporting.policy.dataSubmissionEnabled", false);
user_pref("toolkit.telemetry.reportingpolicy.firstRun", false);
)";

HeadlessBrowser::HeadlessBrowser(Kind kind, const QStringList& urls) {
    const QString dir = m_profile.path();
    if (kind == Kind::Chromium) {
        // Tests run as root in CI, where Chromium's sandbox cannot start, often in a container
        // whose /dev/shm is small.
        m_process.start(QStringLiteral("chromium"),
                        QStringList{QStringLiteral("--headless=new"),
                                    QStringLiteral("--no-sandbox"),
                                    QStringLiteral("--disable-dev-shm-usage"),
                                    QStringLiteral("--remote-debugging-port=0"),
                                    QStringLiteral("--user-data-dir=") + dir} +
                            urls);
        m_process.waitForStarted();
        return;
    }
    QFile prefs(dir + QStringLiteral("/user.js"));
    if (prefs.open(QIODevice::WriteOnly))
        prefs.write(kFirefoxPrefs);
    m_process.start(QStringLiteral("firefox-esr"),
                    QStringList{QStringLiteral("--headless"), QStringLiteral("--no-remote"),
                                QStringLiteral("--profile"), dir} +
                        urls);
    m_process.waitForStarted();
}

HeadlessBrowser::~HeadlessBrowser() {
    m_process.terminate();
    if (!m_process.waitForFinished(10000))
        m_process.kill();
    m_process.waitForFinished();
}

void HeadlessBrowser::openTab(const QString& url) {
    QFile port(m_profile.filePath(QStringLiteral("DevToolsActivePort")));
    if (port.open(QIODevice::ReadOnly))
        QProcess::execute(QStringLiteral(PELMO_PYTHON3),
                          {QStringLiteral("-c"),
                           QStringLiteral("import sys, urllib.request as u; u.urlopen(u.Request("
                                          "sys.argv[1], method='PUT'))"),
                           QStringLiteral("http://127.0.0.1:%1/json/new?%2")
                               .arg(QString::fromLatin1(port.readLine().trimmed()), url)});
}

PelmoRun runPelmo(const QStringList& arguments, const QProcessEnvironment& environment) {
    QProcess process;
    process.setProcessEnvironment(environment);
    process.start(QStringLiteral(PELMO_EXECUTABLE), arguments);
    process.closeWriteChannel();
    PelmoRun run;
    if (!process.waitForFinished(60000)) {
        process.kill();
        process.waitForFinished();
        return run;
    }
    run.status = process.exitStatus() == QProcess::NormalExit ? process.exitCode() : -1;
    run.out = QString::fromUtf8(process.readAllStandardOutput());
    run.err = QString::fromUtf8(process.readAllStandardError());
    return run;
}

QByteArray messageOf(const QByteArray& record) {
    const QJsonObject object = QJsonDocument::fromJson(record).object();
    return QByteArray::fromBase64(object.value(QStringLiteral("data")).toString().toLatin1());
}

namespace {

QString owned(char* text) {
    const QString copy = QString::fromUtf8(text);
    g_free(text);
    return copy;
}

ReceivedPart partOf(GMimeObject* object) {
    ReceivedPart part;
    part.mimeType =
        owned(g_mime_content_type_get_mime_type(g_mime_object_get_content_type(object)));
    part.charset = QString::fromUtf8(g_mime_object_get_content_type_parameter(object, "charset"));
    if (!GMIME_IS_PART(object))
        return part;
    GMimePart* leaf = GMIME_PART(object);
    part.encoding = QString::fromLatin1(
        g_mime_content_encoding_to_string(g_mime_part_get_content_encoding(leaf)));
    part.filename = QString::fromUtf8(g_mime_part_get_filename(leaf));
    GMimeStream* sink = g_mime_stream_mem_new();
    g_mime_data_wrapper_write_to_stream(g_mime_part_get_content(leaf), sink);
    GByteArray* bytes = g_mime_stream_mem_get_byte_array(GMIME_STREAM_MEM(sink));
    part.content =
        QByteArray(reinterpret_cast<const char*>(bytes->data), static_cast<qsizetype>(bytes->len));
    g_object_unref(sink);
    return part;
}

QString addresses(InternetAddressList* list) {
    return list == nullptr ? QString()
                           : owned(internet_address_list_to_string(list, nullptr, FALSE));
}

} // namespace

ReceivedMessage parseMessage(const QByteArray& bytes) {
    static const bool ready = (g_mime_init(), true);
    (void)ready;
    ReceivedMessage message;
    message.bareLineFeed = QRegularExpression(QStringLiteral("[^\\r]\\n"))
                               .match(QString::fromLatin1(bytes))
                               .hasMatch();
    GMimeStream* stream =
        g_mime_stream_mem_new_with_buffer(bytes.constData(), static_cast<size_t>(bytes.size()));
    GMimeParser* parser = g_mime_parser_new_with_stream(stream);
    GMimeMessage* parsed = g_mime_parser_construct_message(parser, nullptr);
    if (parsed != nullptr) {
        message.subject = QString::fromUtf8(g_mime_message_get_subject(parsed));
        message.from = addresses(g_mime_message_get_from(parsed));
        message.to = addresses(g_mime_message_get_to(parsed));
        message.date = QString::fromUtf8(g_mime_object_get_header(GMIME_OBJECT(parsed), "Date"));
        message.messageId = QString::fromUtf8(g_mime_message_get_message_id(parsed));
        message.mimeVersion =
            QString::fromUtf8(g_mime_object_get_header(GMIME_OBJECT(parsed), "MIME-Version"));
        GMimeObject* top = g_mime_message_get_mime_part(parsed);
        message.topType = top == nullptr ? QString() : partOf(top).mimeType;
        message.listUnsubscribe =
            QString::fromUtf8(g_mime_object_get_header(GMIME_OBJECT(parsed), "List-Unsubscribe"));
        // A nested multipart stands in the list, followed by its own parts.
        const std::function<void(GMimeObject*)> addParts = [&](GMimeObject* object) {
            GMimeMultipart* multipart = GMIME_MULTIPART(object);
            for (int i = 0; i < g_mime_multipart_get_count(multipart); ++i) {
                GMimeObject* child = g_mime_multipart_get_part(multipart, i);
                message.parts << partOf(child);
                if (GMIME_IS_MULTIPART(child))
                    addParts(child);
            }
        };
        if (top != nullptr && GMIME_IS_MULTIPART(top))
            addParts(top);
        g_object_unref(parsed);
    }
    g_object_unref(parser);
    g_object_unref(stream);
    return message;
}
