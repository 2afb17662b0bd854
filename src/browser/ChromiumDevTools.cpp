#include "browser/ChromiumDevTools.h"

#include "util/LocalizedStrings.h"

#include <QDir>
#include <QFile>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>

namespace {

// The value of --name=value or "--name value" on a command line, null when absent.
QString option(const QStringList& arguments, const QString& name) {
    const QString prefix = name + QLatin1Char('=');
    for (qsizetype i = 1; i < arguments.size(); ++i) {
        if (arguments[i].startsWith(prefix))
            return arguments[i].mid(prefix.size());
        if (arguments[i] == name && i + 1 < arguments.size())
            return arguments[i + 1];
    }
    return {};
}

// Chromium writes a target's title HTML-escaped (its five characters &<>"'), its URL as it is.
QString unescapeTitle(QString title) {
    static const std::pair<QLatin1String, QLatin1Char> entities[] = {
        {QLatin1String("&lt;"), QLatin1Char('<')},    {QLatin1String("&gt;"), QLatin1Char('>')},
        {QLatin1String("&quot;"), QLatin1Char('"')},  {QLatin1String("&#39;"), QLatin1Char('\'')},
        {QLatin1String("&#x27;"), QLatin1Char('\'')}, {QLatin1String("&amp;"), QLatin1Char('&')}};
    for (const auto& [entity, character] : entities)
        title.replace(entity, QString(character));
    return title;
}

int portNumber(const QString& text) {
    bool ok = false;
    const int port = text.trimmed().toInt(&ok);
    return ok && port > 0 && port < 65536 ? port : 0;
}

} // namespace

int ChromiumDevTools::port(const RunningBrowser& browser, const QString& configHome) {
    const QStringList& arguments = browser.process.arguments;
    if (const int fixed = portNumber(option(arguments, QStringLiteral("--remote-debugging-port"))))
        return fixed;
    QString folder = option(arguments, QStringLiteral("--user-data-dir"));
    if (folder.isEmpty())
        folder = QDir(configHome).filePath(browser.kind->folder);
    QFile file(QDir(folder).filePath(QStringLiteral("DevToolsActivePort")));
    if (!file.open(QIODevice::ReadOnly))
        return 0;
    return portNumber(QString::fromLatin1(file.readLine(16)));
}

std::optional<FrontPage> ChromiumDevTools::frontPage(const QByteArray& json, QString* why) {
    QJsonParseError error;
    const QJsonDocument document = QJsonDocument::fromJson(json, &error);
    if (!document.isArray()) {
        *why = QStringLiteral("the DevTools reply is not a list of targets");
        return std::nullopt;
    }
    for (const QJsonValue target : document.array()) {
        const QJsonObject object = target.toObject();
        if (object.value(QLatin1String("type")).toString() != QLatin1String("page"))
            continue;
        const QString url = object.value(QLatin1String("url")).toString();
        if (url.isEmpty())
            break;
        const QJsonValue title = object.value(QLatin1String("title"));
        return FrontPage{url, title.isString() ? unescapeTitle(title.toString()) : QString()};
    }
    *why = QStringLiteral("the browser shows no page");
    return std::nullopt;
}

QString ChromiumDevTools::startHint(const BrowserKind& kind) {
    return LocalizedStringNS("To let Pelmo read %1's page, start it with "
                             "--remote-debugging-port=9222.")
        .arg(kind.name);
}
