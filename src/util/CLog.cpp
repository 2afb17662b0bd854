#include "util/CLog.h"

#include "text/CString256.h"
#include "util/DataFolder.h"
#include "util/LocalizedStrings.h"
#include "util/TextUtilities.h"

#include <QDateTime>
#include <QDesktopServices>
#include <QUrl>

#include <cerrno>
#include <fcntl.h>
#include <unistd.h>

CLog* gLogger = nullptr;

namespace {

constexpr const char* kLogFileName = "Pelmo.log";

} // namespace

CLog::~CLog() {
    close_log_file();
}

int CLog::open_log_file(const char* path) {
    fileRef = -1;
    // O_APPEND puts every write at the end, as the log must never overwrite older runs; 0600
    // because the log tells who was mailed, which is for the user's eyes only.
    const int fd = ::open(path, O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0600);
    if (fd < 0)
        return errno;
    fileRef = fd;
    return write_marker(LocalizedKey("[Logging starting at "));
}

int CLog::write_entry(const CString256& line) {
    if (fileRef < 0)
        return 0;
    const char* bytes = line.c_str();
    ssize_t left = line.length();
    while (left > 0) {
        const ssize_t written = ::write(fileRef, bytes, static_cast<size_t>(left));
        if (written < 0) {
            if (errno == EINTR)
                continue;
            return errno;
        }
        bytes += written;
        left -= written;
    }
    return 0;
}

int CLog::close_log_file() {
    if (fileRef < 0)
        return 0;
    write_marker(LocalizedKey("[Logging stopping at "));
    const int result = ::close(fileRef) == 0 ? 0 : errno;
    fileRef = -1;
    return result;
}

int CLog::write_marker(const char* key) {
    const QString text = LocalizedString(key) + DateDescription(QDateTime::currentDateTime()) +
                         QStringLiteral("]\r");
    CString256 line;
    line = text.toUtf8();
    return write_entry(line);
}

void StartLogging() {
    std::filesystem::path folder;
    if (!GetOurApplicationSupportFolder(folder))
        return;
    const std::string path = (folder / kLogFileName).string();
    // The log path is a CString256 by design; a path it would cut is not opened at all
    // rather than a file of another name.
    if (path.size() > static_cast<size_t>(CString256::max_length))
        return;
    StopLogging();
    gLogger = new CLog;
    gLogger->open_log_file(path.c_str());
}

void StopLogging() {
    delete gLogger;
    gLogger = nullptr;
}

void LogEntry(const char* text) {
    if (!gLogger)
        return;
    CString256 line(text);
    line += "\r";
    gLogger->write_entry(line);
}

QString LogFilePath() {
    std::filesystem::path folder;
    if (!GetOurApplicationSupportFolder(folder))
        return {};
    return QString::fromStdString((folder / kLogFileName).string());
}

void OpenConsole() {
    const QString log = LogFilePath();
    std::error_code error;
    if (log.isNull() || !std::filesystem::is_regular_file(log.toStdString(), error))
        return;
    QDesktopServices::openUrl(QUrl::fromLocalFile(log));
}
