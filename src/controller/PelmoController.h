#pragma once

#include "addressbook/Person.h"
#include "browser/FrontPageQuery.h"
#include "controller/MailingRun.h"
#include "controller/PelmoView.h"
#include "controller/RunPace.h"
#include "controller/SentLedger.h"

#include <QList>
#include <QObject>
#include <QPointer>
#include <QString>
#include <QStringList>

#include <optional>

class AddressBook;
class AttachmentsController;
class CopyPreview;
class PreflightCheck;
class MailSettings;
class MessageTemplate;
class NotMailedRecipients;
class PasswordStore;

class QTextDocument;
class RecipientSelection;
class SentRecipients;

/**
 * The mailing controller: what the window and the command line drive. It holds the message,
 * the recipient selection, the sent list and the attachments, starts a MailingRun at each
 * press of Send, and shows every status line on the view and in the activity log. The window
 * reaches it only through these calls and the models it hands out, and it reaches the window
 * only through PelmoView.
 *
 * The view, the address book, the password store and the settings are not owned and must
 * outlive the controller. Main thread only.
 */
class PelmoController : public QObject {
    Q_OBJECT

public:
    PelmoController(PelmoView& view, AddressBook& addressBook, PasswordStore& passwords,
                    MailSettings& settings, QObject* parent = nullptr);
    ~PelmoController() override;

    /**
     * Start-up, once the view stands: no pending selection, an empty sent list, the To and
     * Name fields filled from the default-recipient settings that are present, "Ready.".
     */
    void startUp();
    /** The application is about to finish launching: starts the activity log. */
    void applicationWillFinishLaunching();
    /** The application terminates: stops the activity log; a clean quit forgets the sent
     * ledger. */
    void applicationWillTerminate();

    // A run an earlier Pelmo did not finish (it was killed, crashed or lost power).

    /**
     * Looks for the sent ledgers that Pelmos which ended uncleanly left, and answers how many
     * recipients their unfinished runs mailed (0 when none). They stay claimed, for
     * restoreInterruptedRun() or discardInterruptedRun(), until this Pelmo ends.
     */
    int findInterruptedRun();
    /** Puts those recipients in the sent list, so that Send mails only the others. */
    void restoreInterruptedRun();
    /** Forgets those recipients: their ledgers are removed. */
    void discardInterruptedRun();

    PelmoView& view() const { return window; }
    MailSettings& settings() const { return defaults; }
    /** The message body, shared with the window's editor. */
    QTextDocument* message() const;
    MessageTemplate& messageTemplate() const { return *content; }
    RecipientSelection& selection() const { return *recipientSelection; }
    /** The sent-recipients list, a model the Sent Recipients window shows. */
    SentRecipients& sentRecipients() const { return *recipients; }
    /** The group members whose copy was not accepted, with why, a model the window shows. */
    NotMailedRecipients& notMailedRecipients() const { return *notMailed; }
    /** The files every message carries. */
    AttachmentsController& getAttachments() const { return *attachments; }

    // The run.

    /**
     * The Send/Stop button: stops the run when the button reads "Stop", else starts one over
     * the pending selection or to the To field.
     */
    void send();
    /** Stops the run after the delivery in progress; the persons not yet mailed stay pending. */
    void abort();
    /**
     * Copy number copy (from 1) of the pending group, or the To field's copy, made as it will
     * be sent; started, owned by owner. See CopyPreview.
     */
    CopyPreview* previewCopy(int copy, QObject* owner);
    /** "Name <address>" of each copy the next Send makes, for choosing one to preview. */
    QStringList copyChoices() const;
    /** The check before a group run, started, owned by owner. See PreflightCheck. */
    PreflightCheck* checkBeforeSend(QObject* owner);
    /**
     * Mails copy number copy, made for its member, to the sender's own address with "[Test] "
     * before the subject, through the same delivery as a run's copy. The sent list, the
     * not-mailed list and the pending members stay as they are. testSettled() follows.
     */
    void sendTest(int copy);
    /** The run of the latest press of Send, null before the first. */
    MailingRun* currentRun() const { return run; }
    /** Replaces how sessions are made (a dry run writes files; tests hand in their own). */
    void setSessionFactory(MailingRun::SessionFactory factory);
    /** Whether accepted copies go into the sent ledger (not for copies written to files). */
    void setLedgerKept(bool kept) { ledgerKept = kept; }
    /** The pace every run keeps to; its history spans the runs of this window. */
    RunPace& runPace() { return pace; }

    // Status, alerts, the log.

    /** Shows text on the status line and appends it to the activity log. */
    void statusMsg(const QString& text);
    /** Beeps, then shows an alert with the title and the explanation. */
    void doAlert(const QString& title, const QString& informativeText);
    /** Shows the activity log in the desktop's default application. */
    void openConsole();
    /** Makes Pelmo open links to e-mail addresses; a failure is logged, never shown. */
    void makePelmoDefaultEmailer();
    /** Clears the form for a new message: empty body and subject, default recipient. */
    void reset();

    // The web page.

    /**
     * The Web Page button: asks the browsers for the front page; its address goes into the web
     * page field and its title (when known) into the subject. Without one, an alert says so
     * and nothing changes. The answer comes later, then webPageSettled(); a press while a
     * question is under way is ignored.
     */
    void webPage();
    /**
     * A link handed to Pelmo (a click on a mailto: link anywhere on the desktop): a link that
     * begins with "mailto:", in exactly those letters, puts all that follows, query included
     * and nothing decoded, in the To field; any other is ignored. A pending group selection
     * stays, as only the user's typing drops it.
     */
    void handleGetURLEvent(const QString& url);
    /** Replaces where the browsers are looked for (tests hand in their own). */
    void setFrontPagePlaces(const FrontPageQuery::Places& places);

    // Settings and fields; those marked "throws" raise PelmoException with the failure's name
    // and reason.

    /** The sender's address; throws NoSenderEmailAddress. */
    QString getFrom();
    /** The sender's name; throws NoSenderName. */
    QString getFromName();
    /** The To field; throws NoRecipientsEmail. */
    QString getTo();
    /** The Name field; throws NoRecipientsName. */
    QString getToName();
    QString getSubject();
    /** The server's address; throws NoServer. */
    QString getServer();
    /** The server's port, 1 to 65365; throws BadPort. */
    int getPort();
    /** The login name; throws NoUsername. */
    QString getUsername();
    /** The default recipient's address, null when not set. */
    QString getDefaultTo();
    /** The default recipient's name, null when not set. */
    QString getDefaultToName();
    int getSelectedContentType();
    int getSelectedCharacterSet();
    int getSelectedLoginMechanism();
    bool useSSL();
    int completionAction();

    // Recipients.

    const std::optional<QList<Person>>& getPeople() const;
    bool recipientsContains(const QString& address) const;
    void resetRecipients();
    /**
     * Puts the not-mailed rows given (all when rows is empty) back in front of the pending
     * members, so that the next Send, or the run under way, mails them first.
     */
    void putBackNotMailed(const QList<int>& rows);

public Q_SLOTS:
    /** The picker's group selection changed; see RecipientSelection. */
    void abGroupSelected(const QList<qint64>& groupIds, bool pickerIsKeyWindow);
    /** The picker's person or address selection changed; see RecipientSelection. */
    void abRecordSelected(const QList<qint64>& personIds, const QStringList& selectedAddresses,
                          bool pickerIsKeyWindow);
    /** The user edited a field (never text the controller put there). */
    void textDidChange(PelmoView::Field field);

Q_SIGNALS:
    /** The latest run has nothing under way any more: it is over, stopped, stalled or halted. */
    void runSettled();
    /** The test copy was accepted, or not (refused, no connection, no such copy). */
    void testSettled(bool accepted);
    /** The Web Page button's question is answered; found is false when an alert was shown. */
    void webPageSettled(bool found);

private:
    SmtpSession* createSession(const QString& host, int port);
    void applyCompletionAction(int action);
    /** Puts the members refused in this run, if any, into a new "Not delivered" group. */
    void groupRefusedMembers();
    void frontPageAnswered(const QString& url, const QString& title, const QString& hint,
                           const QString& why);

    PelmoView& window;
    AddressBook& addressBook;
    PasswordStore& passwords;
    MailSettings& defaults;
    MessageTemplate* content;
    SentRecipients* recipients;
    NotMailedRecipients* notMailed;
    RecipientSelection* recipientSelection;
    AttachmentsController* attachments;
    MailingRun::SessionFactory sessionFactory;
    bool ledgerKept = true;
    RunPace pace;
    QPointer<MailingRun> run;
    std::optional<FrontPageQuery::Places> frontPagePlaces;
    QPointer<FrontPageQuery> frontPageQuery;
    SentLedger* ledger;
    QList<SentLedger::Entry> interrupted;
    /** The members whose copy was refused while the run went on, with the server's reason. */
    QList<QPair<Person, QString>> refusedMembers;
};
