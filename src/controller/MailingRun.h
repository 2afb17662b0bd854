#pragma once

#include "addressbook/Person.h"
#include "controller/RunPace.h"
#include "smtp/DeliveryRequest.h"

#include <QObject>
#include <QPointer>
#include <QTimer>

#include <functional>
#include <memory>
#include <optional>

class AttachmentsController;
class EncodedAttachments;
class MailSettings;
class MessageTemplate;
class NotMailedRecipients;
class PageDownload;
class PasswordStore;
class PelmoView;
class RecipientSelection;
class SMTP;
class SentRecipients;
class SmtpSession;

/**
 * One press of Send: the web page is downloaded and relinked, then one copy is delivered to the
 * To field, or one to each pending person of the selection, strictly one after another: the
 * next person's delivery starts only when the previous connection has closed. Progress goes to
 * the view's bar and Send/Stop button, every step to statusMessage().
 *
 * The parts are not owned and must outlive the run. A run stopped by the user lets the copy on
 * its way finish and leaves the persons not yet mailed pending for the next Send. A member
 * taken off the list whose copy is not accepted goes to the not-mailed list with the reason.
 * With the setting reuseConnection, up to 50 copies go over one connection; a copy whose
 * reused connection is lost before it went out whole, or refused with 421, goes again over a
 * new one, so that nobody is lost or mailed twice. With continueAfterRefusal, a member's copy
 * refused with a permanent reply (5xx) is skipped and the run goes on; anything else that fails
 * stops it as before.
 *
 * The pace (see RunPace) may hold a copy back: the run then waits on a timer, says how long and
 * how much is left, and Stop ends it at once with the rest pending. With the setting
 * retryTemporaryFailures, a copy the server refuses for now (421, 450, 451 or 452, which say
 * it was not taken) goes again after each back-off of the pace's retry schedule, and the run
 * stops as for any refusal only when the last try is refused too. A 421 on a reused connection
 * first goes again at once over a new one, as above, without using up a retry.
 */
class MailingRun : public QObject {
    Q_OBJECT

public:
    /** A new session for one delivery to host:port; the caller takes it over. */
    using SessionFactory = std::function<SmtpSession*(const QString& host, int port)>;

    struct Parts {
        PelmoView& view;
        MailSettings& settings;
        MessageTemplate& message;
        RecipientSelection& selection;
        SentRecipients& sent;
        NotMailedRecipients& notMailed;
        PasswordStore& passwords;
        const AttachmentsController& attachments;
        SessionFactory createSession;
        /** Outlives runs, so that a run started again keeps to the same hour. */
        RunPace& pace;
    };

    enum class State {
        Idle,          ///< start() not yet called
        PreparingPage, ///< the web page is downloading; Stop ends the run at once
        Delivering,    ///< a copy is on its way (the To field's, or member n's)
        Waiting,       ///< the pace holds the next copy back until a timer fires
        Stalled,       ///< cannot go on by itself (no address, a time-out, an unknown login
                       ///< mechanism); the button still reads Stop
        Halted,        ///< a setting or the message failed: the button reads Send, nothing starts
        Stopped,       ///< Stop pressed or a copy refused; the rest wait for the next Send
        Completed,     ///< every member taken, the end-of-run line shown
    };
    Q_ENUM(State)

    MailingRun(const Parts& parts, QObject* parent = nullptr);
    ~MailingRun() override;

    /** Starts the run; the view's button must read "Send". */
    void start();
    /** Stops the run after the delivery in progress, or at once while the page downloads. */
    void abort();

    /**
     * The request for the copy that message makes now, without credentials: the same for a
     * run's copy, a preview and a test copy. addressed is told the recipient as soon as it is
     * known, before a later setting can fail. Throws PelmoException for a missing value; the
     * server's address and port only when needed (a preview does without them).
     */
    static DeliveryRequest requestFor(MessageTemplate& message, MailSettings& settings,
                                      const AttachmentsController& attachments,
                                      const std::function<void(const DeliveryRequest&)>& addressed,
                                      bool serverNeeded = true);
    /** The login as a run asks for it; answers on context's thread. */
    static DeliveryRequest::CredentialsRequest
    credentialsFrom(MailSettings& settings, PasswordStore& passwords, QObject* context);
    /** page, downloaded from typedAddress, with its links made absolute against it. */
    static QString relinkedPage(const QString& page, const QString& typedAddress);

    State state() const { return m_state; }
    /** Whether a delivery of this run has not ended yet. */
    bool isDelivering() const { return !m_delivery.isNull(); }
    /** False once any copy of this run was not accepted (refused, login failed, halted). */
    bool everyCopyAccepted() const { return m_everyCopyAccepted; }

Q_SIGNALS:
    /** A line for the status line and the activity log. */
    void statusMessage(const QString& text);
    void stateChanged(MailingRun::State state);
    /** The last copy was accepted and the run is over: action 1 quits, 2 resets the form. */
    void completionActionWanted(int action);
    /** Nothing of this run is under way any more unless the user or a server acts. */
    void settled();
    /** A copy is about to go to the server, once its connection is ready: a slot that must
     * finish with the copies before it (their record on disk) does so before it returns. */
    void copyGoingOut();
    /** The server accepted the copy to recipient, whose Message-ID is messageId. */
    void copyAccepted(const QString& recipient, const QString& messageId);
    /** With continueAfterRefusal: the member's copy was refused for reason, and the run goes
     * on. */
    void copyRefused(const Person& member, const QString& reason);

private:
    void pageReady(const QString& page);
    void beginDeliveries();
    bool sendMember();
    /** The next member's copy, or the To field's again after a temporary refusal. */
    bool nextCopy();
    /** Reads the pace settings and, when the next copy must wait, starts the timer and says how
     *  long and how many of total are left; answers whether the copy waits (or the run halted
     *  on a bad setting). */
    bool waitForPace(int left, int total);
    void paceElapsed();
    /** A copy refused for now goes again after the next back-off, if any is left. */
    bool retryLater(SMTP* delivery);
    void deliver();
    DeliveryRequest buildRequest();
    void deliveryFinished(SMTP* delivery);
    void endRun();
    void finishRun(bool succeeded);
    void halt(const PelmoException& failure);
    void showHalted();
    void enter(State state);
    void status(const QString& text) { Q_EMIT statusMessage(text); }
    void settleUnlessDelivering();
    /** The member on the way was not mailed, for why; once per member. */
    void memberNotMailed(const QString& why);
    /** The session an earlier copy left open, when the next copy may go over it; else null. */
    SmtpSession* openSessionFor(const DeliveryRequest& request);
    /** A copy lost with its reused session before it went out whole goes again, first. */
    bool retryOnNewSession(SMTP* delivery);
    void closeOpenSession();
    /** With continueAfterRefusal, a member's copy refused for good is skipped; true then. */
    bool skipRefusedCopy(SMTP* delivery);

    Parts m_parts;
    State m_state = State::Idle;
    bool m_stopSending = false;
    bool m_everyCopyAccepted = true;
    QString m_typedAddress;
    /** The member whose copy is on its way, until it is accepted or listed as not mailed. */
    std::optional<Person> m_member;
    QPointer<PageDownload> m_download;
    QPointer<SMTP> m_delivery;
    /** With reuseConnection: the session kept open between copies, its server, and how many
     * copies it has carried. */
    QPointer<SmtpSession> m_openSession;
    QString m_openServer;
    int m_openPort = 0;
    int m_sessionCopies = 0;
    bool m_onOpenSession = false;
    /** The delivery whose copy goes again over a new connection; its end is not a failure. */
    QPointer<SMTP> m_retried;
    QTimer m_paceTimer;
    /** The recipient whose copy was refused for now, and how often so far. */
    QString m_retryRecipient;
    int m_retries = 0;
    /** How long the copy going again waits once its refused try has ended; zero for none. */
    RunPace::Duration m_backOff{0};
    /** Every copy of the run carries the same files: each is encoded once. */
    std::shared_ptr<EncodedAttachments> m_encodedAttachments;
};
