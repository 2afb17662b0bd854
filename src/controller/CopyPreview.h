#pragma once

#include "smtp/DeliveryRequest.h"
#include "smtp/SMTP.h"

#include <QByteArray>
#include <QFutureWatcher>
#include <QObject>
#include <QPointer>
#include <QString>
#include <QStringList>

class AttachmentsController;
class MailSettings;
class MessageTemplate;
class PageDownload;
class PelmoView;
class RecipientSelection;

/**
 * One copy of the message as it will be sent, made without a server: the n-th pending member's
 * copy of the group chosen, or the Recipient Address's copy when no group is. The web page is
 * downloaded and relinked as a run does it, and the copy is built by the same code as a run's
 * (MailingRun::requestFor, SMTP::assemble), so only Date, Message-ID and the boundaries differ
 * from what the server will receive. The server need not be set yet. Nothing is sent, and no
 * list or field changes.
 *
 * The parts are not owned and must outlive it.
 */
class CopyPreview : public QObject {
    Q_OBJECT

public:
    struct Parts {
        PelmoView& view;
        MailSettings& settings;
        MessageTemplate& message;
        const RecipientSelection& selection;
        const AttachmentsController& attachments;
    };

    enum class State {
        Idle,          ///< start() not yet called
        PreparingPage, ///< the web page is downloading
        Building,      ///< the copy is being built on a worker thread
        Ready,         ///< request() and bytes() hold the copy
        Failed,        ///< there is no such copy, or a setting is missing: failure() says why
    };
    Q_ENUM(State)

    explicit CopyPreview(const Parts& parts, QObject* parent = nullptr);
    ~CopyPreview() override;

    /** Makes copy number copy, from 1; finished() follows on the main loop, once. */
    void start(int copy);
    /** "Name <address>" of each copy there is to choose from, in the order they go. */
    static QStringList choices(PelmoView& view, const RecipientSelection& selection);

    State state() const { return m_state; }
    /** The copy's request, without credentials; valid when Ready. */
    const DeliveryRequest& request() const { return m_request; }
    /** The whole message as it goes in SMTP DATA; empty unless Ready. */
    const QByteArray& bytes() const { return m_bytes; }
    /** Why there is no copy, as the user reads it. */
    const QString& failure() const { return m_failure; }
    /** The page as downloaded and relinked, its tags not replaced; null without one. */
    const QString& page() const { return m_page; }
    /** The page's address when one was asked for and could not be had, else empty. */
    const QString& pageAddress() const { return m_failedPage; }
    /** Why the page could not be had. */
    const QString& pageError() const { return m_pageError; }

Q_SIGNALS:
    void finished();

private:
    void build();
    void built();
    void fail(const QString& why);

    Parts m_parts;
    State m_state = State::Idle;
    int m_copy = 1;
    QPointer<PageDownload> m_download;
    DeliveryRequest m_request;
    QByteArray m_bytes;
    QFutureWatcher<SMTP::Built> m_building;
    QString m_failure;
    QString m_page;
    QString m_failedPage;
    QString m_pageError;
};
