#pragma once

#include <QObject>
#include <QPointer>
#include <QString>

#include <chrono>

class QNetworkAccessManager;
class QNetworkReply;

/**
 * A downloaded page's text: UTF-8 when the bytes are valid UTF-8, else the charset that
 * contentType (the Content-Type header) or else the page's own meta element declares, else
 * Mac OS Roman. Null when none of them reads the bytes.
 */
QString DecodePage(const QByteArray& bytes, const QString& contentType);

/**
 * One web page fetched in the background, never from a cache, following redirects. Its text is
 * decoded as UTF-8 when the bytes are valid UTF-8, else in the charset the server or the page
 * declares, else as Mac OS Roman. finished() comes once, on the main loop, never from inside
 * start(); abort() ends the download without it.
 */
class PageDownload : public QObject {
    Q_OBJECT

public:
    enum class State {
        Idle,        ///< start() not yet called
        Downloading, ///< the request is under way
        Finished,    ///< finished() was emitted
        Aborted,     ///< abort() ended it; nothing more is emitted
    };
    Q_ENUM(State)

    explicit PageDownload(QObject* parent = nullptr);
    ~PageDownload() override;

    /** Fetches url; gives up after timeout without progress. */
    void start(const QString& url, std::chrono::milliseconds timeout = std::chrono::seconds(30));
    void abort();
    State state() const { return m_state; }

Q_SIGNALS:
    /**
     * The page's text, or a null text when the address is no valid URL, the fetch failed or
     * timed out, nothing came back or its characters cannot be read; error says why.
     */
    void finished(const QString& text, const QString& error);

private:
    void replied();
    void finish(const QString& text, const QString& error);

    QNetworkAccessManager* m_network;
    QPointer<QNetworkReply> m_reply;
    State m_state = State::Idle;
};
