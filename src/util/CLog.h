#pragma once

#include <QString>

class CString256;

/**
 * The activity log: one append-only file, "Pelmo.log" in the data folder, whose lines end in a
 * single carriage return. Each launch adds a start marker, its lines and a stop marker; the
 * file is never truncated. Nothing here reports to the user: a log that cannot be opened
 * turns every write into a no-op. Main thread only.
 */
class CLog {
public:
    CLog() = default;
    /** Closes the file (writing the stop marker) if it is still open. */
    ~CLog();
    CLog(const CLog&) = delete;
    CLog& operator=(const CLog&) = delete;

    /**
     * Opens path for appending, creating it with mode 0600 when missing, and writes the start
     * marker. Answers 0 or an errno value; on failure the log stays closed.
     */
    int open_log_file(const char* path);
    /** Appends the string's bytes (no terminator, no line end added). 0 or an errno value. */
    int write_entry(const CString256& line);
    /** Writes the stop marker and closes the file; 0 when already closed. 0 or an errno value. */
    int close_log_file();
    bool is_open() const { return fileRef >= 0; }

private:
    int write_marker(const char* key);

    int fileRef = -1;
};

/** The process's log, owned by StartLogging/StopLogging; null while logging is off. */
extern CLog* gLogger;

/**
 * Opens <data folder>/Pelmo.log and makes it the process's log. Logging stays off when the
 * folder cannot be made or the path does not fit in 255 bytes. Called once per launch; a
 * second call first closes the log it replaces, stop marker included.
 */
void StartLogging();
/** Writes the stop marker, closes the log and turns logging off; nothing when it is off. */
void StopLogging();
/**
 * Appends text (UTF-8) and a carriage return while logging is on. The line is held in a
 * CString256, so text past 255 bytes is cut and a 255-byte text loses its carriage return.
 */
void LogEntry(const char* text);
/** The log file's path, <data folder>/Pelmo.log; null when the data folder cannot be had. */
QString LogFilePath();
/** Shows the log file in the desktop's default application; nothing when there is none yet. */
void OpenConsole();
