#pragma once

#include <QFile>
#include <QNetworkAccessManager>
#include <QObject>
#include <QPointer>
#include <QString>
#include <QUrl>

#include <chrono>

class QNetworkReply;

/**
 * Tells the user when a newer Pelmo has been published, and downloads it. The version document
 * is an XML property list (a "Pelmo" dictionary with "CurrentVersion", a number, and
 * "CurrentVersionString"); versions compare as plain numbers, the dots removed. The automatic
 * check, 5 seconds after awake() when "checkForSoftwareUpdates" is on (absent: on), says
 * nothing unless a newer version is published; the manual check reports in status lines; the
 * download goes to the desktop folder under a name no file has yet. Everything runs on the main
 * loop without blocking it; a check and a download may run side by side.
 *
 * The addresses are compiled in and may be replaced by the settings "softwareUpdateVersionURL"
 * and "softwareUpdateDownloadURL" (the settings file Pelmo shares with its preferences). Main
 * thread only.
 */
class SoftwareUpdateController : public QObject {
    Q_OBJECT

public:
    explicit SoftwareUpdateController(QObject* parent = nullptr);
    ~SoftwareUpdateController() override;

    /** The application's own version ("0.1.0"), the CMake project version. */
    static QString getOurVersionString();
    /**
     * A version as a number: the dots removed, then the leading decimal digits ("1.2.3" is 123,
     * "2.0" is 20, "1.2b4" is 12, "" is 0); at most 255 bytes of the text are read.
     */
    static int getVersionNumber(const QString& version);

    /** Whether the automatic check is on: the stored setting, absent = on. */
    bool checkForSoftwareUpdates() const;
    /** Start-up: arms the one-shot automatic check 5 seconds later when it is on. */
    void awake();
    /** The automatic check: silent on every failure; updateAvailable() when newer. */
    void checkForSoftwareUpdate();
    /** The manual check (the window's Check button): its steps in statusChanged(). */
    void checkVersion();
    /** The window's Download button; ignored while a download runs, which has one file. */
    void clickSoftwareUpdateButton();

    bool checkInProgress() const { return m_softwareUpdateCheckInProgress; }
    bool downloadInProgress() const { return m_softwareDownloadInProgress; }
    /** Replaces the check's 10 s and the download's 20 s time-outs (tests). */
    void setTimeouts(std::chrono::milliseconds check, std::chrono::milliseconds download);

Q_SIGNALS:
    /** The automatic check found a newer version: the alert's message and informative text. */
    void updateAvailable(const QString& message, const QString& informativeText);
    /** The window's status line (every text also goes to the activity log when it says so). */
    void statusChanged(const QString& text);
    /** The published version string, once a manual check has read it. */
    void currentVersionChanged(const QString& version);
    /** The manual check started (true) or ended (false): the spinner. */
    void checkBusyChanged(bool busy);
    /** The download indicator: shown or hidden, at percent (0 to 100). */
    void downloadProgressChanged(bool visible, double percent);
    /** A manual check or a download ended (for the command line and tests). */
    void checkFinished(bool ok);
    void downloadFinished(bool ok, const QString& path);

private:
    static QUrl settingOr(const char* key, const char* compiledIn);
    QNetworkReply* get(const QUrl& url, std::chrono::milliseconds timeout);
    /** Asks for the version document, finished taking the reply; false when it cannot ask. */
    bool fetchVersion(void (SoftwareUpdateController::*finished)(QNetworkReply*));
    void automaticCheckFinished(QNetworkReply* reply);
    void manualCheckFinished(QNetworkReply* reply);
    void status(const QString& text, bool logged);
    bool allowRedirect(const QUrl& to) const;
    bool createDestination();
    void downloadReadyRead();
    void downloadDone();
    /** Ends the download, its partial file removed; url: the failing one, when not the reply's. */
    void downloadFailed(const QString& description, const QUrl& url = {});

    QNetworkAccessManager m_network;
    std::chrono::milliseconds m_checkTimeout{10000};
    std::chrono::milliseconds m_downloadTimeout{20000};
    QPointer<QNetworkReply> m_download;
    QUrl m_downloadUrl;    // as first asked for: redirects stay on its host unless https
    int m_redirects = 0;   // followed so far for this download
    QFile m_file;          // open from the first byte of the body to the end
    qint64 m_received = 0; // bytes of the body written so far
    bool m_softwareUpdateCheckInProgress = false;
    bool m_softwareDownloadInProgress = false;
};
