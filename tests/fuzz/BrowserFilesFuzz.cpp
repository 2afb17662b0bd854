// What the browsers leave behind or answer, as read for the page in front. The first byte picks
// the reader: a mozLz4 file read through to its session, a session's JSON, profiles.ini (with
// installs.ini after a "--" line) in a home whose profile folder "a" is locked by pid 7, or (from
// 0xF0 on) Chromium's /json/list reply, the same bytes being its DevToolsActivePort file. A
// decoded file is exactly as long as its header says, a front page found has an address, a port
// is one, and whatever fails says why.

#include "FuzzSupport.h"

#include "browser/ChromiumDevTools.h"
#include "browser/FirefoxSession.h"

#include <QDir>
#include <QFile>
#include <QTemporaryDir>

namespace {

void readSession(const QByteArray& json) {
    QString why;
    const std::optional<FrontPage> page = FirefoxSession::frontPage(json, &why);
    fuzz::require(page ? !page->url.isEmpty() : !why.isEmpty(), "a front page without address");
}

void write(const QString& path, const QByteArray& text) {
    QFile file(path);
    fuzz::require(file.open(QIODevice::WriteOnly) && file.write(text) == text.size(), "write");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    if (size == 0)
        return 0;
    const QByteArray input = fuzz::bytesOf(data + 1, size - 1);
    QString why;
    if (data[0] >= 0xF0) {
        const std::optional<FrontPage> page = ChromiumDevTools::frontPage(input, &why);
        fuzz::require(page ? !page->url.isEmpty() : !why.isEmpty(), "no page and no reason");
        static QTemporaryDir userData;
        write(userData.filePath("DevToolsActivePort"), input);
        static const BrowserKind chromium{"Chromium", BrowserFamily::Chromium, {}, {}};
        const int port = ChromiumDevTools::port(
            {&chromium, {1, 0, 0, {}, {}, {"chromium", "--user-data-dir=" + userData.path()}}}, {});
        fuzz::require(port >= 0 && port < 65536, "a port out of range");
    } else if (data[0] % 3 == 0) {
        const QByteArray json = FirefoxSession::decodeMozLz4(input, &why);
        fuzz::require(json.isNull() != why.isEmpty(), "a decoding that fails without a reason");
        if (json.isNull())
            return 0;
        const auto byte = [&](int i) { return quint32(uchar(input[i])) << (8 * (i - 8)); };
        fuzz::require(json.size() == (byte(8) | byte(9) | byte(10) | byte(11)),
                      "a payload of another size than its header's");
        readSession(json);
    } else if (data[0] % 3 == 1) {
        readSession(input);
    } else {
        static QTemporaryDir home;
        static const bool locked =
            QDir(home.path()).mkdir(QStringLiteral("a")) &&
            QFile::link(QStringLiteral("127.0.0.1:+7"), home.filePath("a/lock"));
        fuzz::require(locked, "the lock symlink");
        const qsizetype split = input.indexOf("\n--\n");
        write(home.filePath("profiles.ini"), input.left(split));
        write(home.filePath("installs.ini"), split < 0 ? QByteArray() : input.mid(split + 4));
        static const QStringList calls[] = {{"ff"}, {"ff", "-P", "x"}, {"ff", "--profile", "/p"}};
        const QString folder =
            FirefoxSession::profileFolder(home.path(), calls[data[0] / 3 % 3], 7, &why);
        fuzz::require(folder.isNull() ? !why.isEmpty() : !folder.isEmpty(),
                      "no profile folder and no reason");
    }
    return 0;
}
