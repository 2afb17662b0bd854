#include "controller/PelmoController.h"

#include "addressbook/AddressBook.h"
#include "attachments/AttachmentsController.h"
#include "controller/CopyPreview.h"
#include "controller/MailSettings.h"
#include "controller/MessageTemplate.h"
#include "controller/NotMailedRecipients.h"
#include "controller/PreflightCheck.h"
#include "controller/RecipientSelection.h"
#include "controller/SentRecipients.h"
#include "smtp/SMTP.h"
#include "smtp/SmtpClient.h"
#include "util/CLog.h"
#include "util/DataFolder.h"
#include "util/DefaultMailClient.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"
#include "util/TextUtilities.h"

#include <QCoreApplication>
#include <QDateTime>
#include <QTextDocument>
#include <QUuid>

#include <utility>

using Key = MailSettings::Key;

namespace {

QString dataFolder() {
    std::filesystem::path folder;
    return GetOurApplicationSupportFolder(folder) ? QString::fromStdString(folder.string())
                                                  : QString();
}

} // namespace

PelmoController::PelmoController(PelmoView& view, AddressBook& book, PasswordStore& store,
                                 MailSettings& settings, QObject* parent)
    : QObject(parent), window(view), addressBook(book), passwords(store), defaults(settings),
      content(new MessageTemplate(view, settings, this)), recipients(new SentRecipients(this)),
      notMailed(new NotMailedRecipients(this)),
      recipientSelection(new RecipientSelection(book, view, *recipients, this)),
      attachments(new AttachmentsController(this)), ledger(new SentLedger(dataFolder(), this)) {
    connect(recipientSelection, &RecipientSelection::statusMessage, this,
            &PelmoController::statusMsg);
    connect(ledger, &SentLedger::statusMessage, this, &PelmoController::statusMsg);
    // Whoever the user let be mailed again must not come back after a crash.
    connect(recipients, &SentRecipients::modelReset, ledger, &SentLedger::forgetAll);
}

PelmoController::~PelmoController() = default;

void PelmoController::startUp() {
    recipientSelection->clear();
    recipients->resetRecipients();
    notMailed->clear();
    if (const QString defaultTo = getDefaultTo(); !defaultTo.isNull())
        window.setTo(defaultTo);
    if (const QString defaultToName = getDefaultToName(); !defaultToName.isNull())
        window.setName(defaultToName);
    statusMsg(LocalizedStringNS("Ready."));
}

void PelmoController::applicationWillFinishLaunching() {
    StartLogging();
}

void PelmoController::applicationWillTerminate() {
    ledger->close();
    StopLogging();
}

int PelmoController::findInterruptedRun() {
    interrupted = ledger->claimInterrupted();
    return static_cast<int>(interrupted.size());
}

void PelmoController::restoreInterruptedRun() {
    if (interrupted.isEmpty())
        return;
    // Kept in this session's ledger too, in case this Pelmo does not end cleanly either.
    const QString restoredRun = QUuid::createUuid().toString(QUuid::WithoutBraces);
    int restored = 0;
    for (const SentLedger::Entry& entry : std::as_const(interrupted)) {
        if (recipients->recipientsContains(entry.address))
            continue;
        recipients->addRecipient(entry.address);
        ledger->recordSent(restoredRun, entry.address, entry.messageId);
        ++restored;
    }
    ledger->removeClaimed();
    interrupted.clear();
    statusMsg(restored == 1 ? LocalizedStringNS("Restored 1 recipient mailed before Pelmo stopped "
                                                "unexpectedly; it is not mailed again.")
                            : LocalizedStringNS("Restored %1 recipients mailed before Pelmo "
                                                "stopped unexpectedly; they are not mailed again.")
                                  .arg(restored));
}

void PelmoController::discardInterruptedRun() {
    ledger->removeClaimed();
    interrupted.clear();
}

QTextDocument* PelmoController::message() const {
    return content->body();
}

// The run

void PelmoController::send() {
    window.showRecipientsWindow();
    if (window.sendButtonTitle() != LocalizedStringNS("Send"))
        return abort();
    // A stopped run whose last copy is still on its way finishes it on its own, then goes.
    if (run && !run->isDelivering())
        run->deleteLater();
    run = new MailingRun(
        {window, defaults, *content, *recipientSelection, *recipients, *notMailed, passwords,
         *attachments, [this](const QString& host, int port) { return createSession(host, port); },
         pace},
        this);
    MailingRun* started = run;
    const QString runId = QUuid::createUuid().toString(QUuid::WithoutBraces);
    connect(started, &MailingRun::statusMessage, this, &PelmoController::statusMsg);
    if (ledgerKept) {
        connect(started, &MailingRun::copyAccepted, ledger,
                [this, runId](const QString& recipient, const QString& messageId) {
                    ledger->recordSent(runId, recipient, messageId);
                });
        // The last accepted copy is on disk before the next one can be accepted; its sync
        // overlaps the next copy's connection and greeting.
        connect(started, &MailingRun::copyGoingOut, ledger, &SentLedger::waitUntilDurable,
                Qt::DirectConnection);
    }
    connect(started, &MailingRun::stateChanged, ledger, [this, runId](MailingRun::State state) {
        if (state == MailingRun::State::Completed)
            ledger->finishRun(runId);
    });
    connect(started, &MailingRun::copyRefused, this,
            [this](const Person& member, const QString& reason) {
                refusedMembers.append({member, reason});
            });
    connect(started, &MailingRun::completionActionWanted, this,
            &PelmoController::applyCompletionAction);
    connect(started, &MailingRun::settled, this, [this, started] {
        groupRefusedMembers();
        if (started == run)
            Q_EMIT runSettled();
        else if (!started->isDelivering())
            started->deleteLater();
    });
    started->start();
}

CopyPreview* PelmoController::previewCopy(int copy, QObject* owner) {
    auto* preview =
        new CopyPreview({window, defaults, *content, *recipientSelection, *attachments}, owner);
    preview->start(copy);
    return preview;
}

QStringList PelmoController::copyChoices() const {
    return CopyPreview::choices(window, *recipientSelection);
}

PreflightCheck* PelmoController::checkBeforeSend(QObject* owner) {
    auto* check =
        new PreflightCheck({window, defaults, *content, *recipientSelection, *attachments}, owner);
    check->start();
    return check;
}

void PelmoController::sendTest(int copy) {
    CopyPreview* preview = previewCopy(copy, this);
    connect(preview, &CopyPreview::finished, this, [this, preview] {
        preview->deleteLater();
        if (preview->state() != CopyPreview::State::Ready) {
            statusMsg(preview->failure());
            return Q_EMIT testSettled(false);
        }
        DeliveryRequest request = preview->request();
        try {
            request.server = getServer();
            request.port = getPort();
        } catch (const PelmoException& failure) {
            statusMsg(failure.statusText());
            return Q_EMIT testSettled(false);
        }
        statusMsg(LocalizedStringNS("Test copy for %1 <%2>, to %3.")
                      .arg(request.recipientName, request.recipient, request.sender));
        request.recipientName = request.senderName;
        request.recipient = request.sender;
        request.subject = QStringLiteral("[Test] ") + request.subject;
        request.credentials = MailingRun::credentialsFrom(defaults, passwords, this);
        // Its acceptance is not connected to the sent list: the member is still to be mailed.
        auto* delivery = new SMTP(request, createSession(request.server, request.port), this);
        connect(delivery, &SMTP::statusMessage, this, &PelmoController::statusMsg);
        // A refusal or an unknown login mechanism leaves the connection open: it is closed here.
        for (auto signal : {&SMTP::refused, &SMTP::stalled, &SMTP::finished})
            connect(delivery, signal, this, [this, delivery] {
                disconnect(delivery, nullptr, this, nullptr);
                delivery->deleteLater();
                Q_EMIT testSettled(delivery->succeeded());
            });
        delivery->start();
    });
}

void PelmoController::abort() {
    if (run)
        run->abort();
}

void PelmoController::applyCompletionAction(int action) {
    if (action == 1)
        QCoreApplication::quit();
    else if (action == 2)
        reset();
}

void PelmoController::groupRefusedMembers() {
    if (refusedMembers.isEmpty())
        return;
    const QList<QPair<Person, QString>> refused = std::exchange(refusedMembers, {});
    const QString stem =
        LocalizedStringNS("Not delivered %1").arg(DateDescription(QDateTime::currentDateTime()));
    QString name = stem;
    for (int n = 2; addressBook.groupNamed(name); ++n)
        name = QStringLiteral("%1 (%2)").arg(stem).arg(n);
    try {
        const qint64 group = addressBook.addGroup(name);
        for (const auto& [member, reason] : refused) {
            addressBook.addMember(group, member.id);
            statusMsg(LocalizedStringNS("Not delivered to %1 <%2>: %3")
                          .arg(member.fullName(), member.primaryEmail(), reason));
        }
    } catch (const PelmoException& failure) {
        return statusMsg(LocalizedStringNS("The group \"%1\" could not be made: %2")
                             .arg(name, failure.reason()));
    }
    statusMsg(refused.size() == 1
                  ? LocalizedStringNS("1 recipient refused is in the group \"%1\": send to it "
                                      "to try again.")
                        .arg(name)
                  : LocalizedStringNS("%1 recipients refused are in the group \"%2\": send to "
                                      "it to try again.")
                        .arg(refused.size())
                        .arg(name));
}

SmtpSession* PelmoController::createSession(const QString& host, int port) {
    if (sessionFactory)
        return sessionFactory(host, port);
    // Port 465 is implicit TLS by itself; the implicit-TLS setting is for servers that use it
    // elsewhere. A session that will not go TLS does without the TLS library.
    const bool implicitTLS = defaults.boolean(Key::ImplicitTLS);
    const bool tls = implicitTLS || port == 465 || defaults.boolean(Key::UseSSL);
    auto* client = new SmtpClient(
        host, static_cast<quint16>(port), std::chrono::seconds(defaults.integer(Key::SmtpTimeout)),
        nullptr, tls ? SmtpClient::Transport::TlsCapable : SmtpClient::Transport::PlainOnly);
    if (implicitTLS)
        client->setImplicitTLS(true);
    // What the server announces as its SIZE is kept for the check before the next group run.
    connect(client, &SmtpSession::serviceInitialized, this, [this, client, host, port] {
        defaults.rememberSizeLimit(host, port, client->sizeLimit());
    });
    return client;
}

void PelmoController::setSessionFactory(MailingRun::SessionFactory factory) {
    sessionFactory = std::move(factory);
}

// Status, alerts, the log

void PelmoController::statusMsg(const QString& text) {
    window.setStatus(text);
    LogEntry(text.toUtf8().constData());
}

void PelmoController::doAlert(const QString& title, const QString& informativeText) {
    window.beep();
    window.alert(title, informativeText);
}

void PelmoController::openConsole() {
    OpenConsole();
}

void PelmoController::makePelmoDefaultEmailer() {
    MakePelmoDefaultMailClient(); // a failure is in the log already
}

void PelmoController::reset() {
    content->clearBody();
    statusMsg(LocalizedStringNS("Ready."));
    window.setSubject(QString());
    // An unset default recipient leaves the fields empty.
    window.setTo(getDefaultTo());
    window.setName(getDefaultToName());
}

// The web page

void PelmoController::webPage() {
    if (frontPageQuery)
        return;
    frontPageQuery =
        frontPagePlaces ? new FrontPageQuery(*frontPagePlaces, this) : new FrontPageQuery(this);
    connect(frontPageQuery, &FrontPageQuery::finished, this, &PelmoController::frontPageAnswered);
    frontPageQuery->start();
}

void PelmoController::handleGetURLEvent(const QString& url) {
    static const QLatin1String scheme("mailto:");
    if (url.startsWith(scheme))
        window.setTo(url.mid(scheme.size()));
}

void PelmoController::setFrontPagePlaces(const FrontPageQuery::Places& places) {
    frontPagePlaces = places;
}

void PelmoController::frontPageAnswered(const QString& url, const QString& title,
                                        const QString& hint, const QString& why) {
    frontPageQuery->deleteLater();
    frontPageQuery.clear();
    if (!why.isEmpty())
        LogEntry(QStringLiteral("Front page: %1").arg(why).toUtf8().constData());
    if (url.isNull()) {
        QString informative =
            QStringLiteral("Please make sure your browser is running and displaying a web page.");
        if (!hint.isEmpty())
            informative += QLatin1Char('\n') + hint;
        doAlert(QStringLiteral("The front browser web page could not be retreived"), informative);
    } else {
        window.setWebPageOrFile(url);
        if (!title.isNull())
            window.setSubject(title);
    }
    Q_EMIT webPageSettled(!url.isNull());
}

// Settings and fields

QString PelmoController::getFrom() {
    return content->getFrom();
}

QString PelmoController::getFromName() {
    return content->getFromName();
}

QString PelmoController::getTo() {
    return content->getTo();
}

QString PelmoController::getToName() {
    return content->getToName();
}

QString PelmoController::getSubject() {
    return content->getSubject();
}

QString PelmoController::getServer() {
    return defaults.required(Key::ServerAddress);
}

int PelmoController::getPort() {
    return defaults.port();
}

QString PelmoController::getUsername() {
    return defaults.required(Key::LoginUsername);
}

QString PelmoController::getDefaultTo() {
    return defaults.string(Key::DefaultRecipientEmail);
}

QString PelmoController::getDefaultToName() {
    return defaults.string(Key::DefaultRecipientName);
}

int PelmoController::getSelectedContentType() {
    return defaults.integer(Key::SelectedContentType);
}

int PelmoController::getSelectedCharacterSet() {
    return defaults.integer(Key::SelectedCharacterSet);
}

int PelmoController::getSelectedLoginMechanism() {
    return defaults.integer(Key::SelectedAuthentication);
}

bool PelmoController::useSSL() {
    return defaults.boolean(Key::UseSSL);
}

int PelmoController::completionAction() {
    return defaults.integer(Key::CompletionAction);
}

// Recipients

const std::optional<QList<Person>>& PelmoController::getPeople() const {
    return recipientSelection->getPeople();
}

bool PelmoController::recipientsContains(const QString& address) const {
    return recipients->recipientsContains(address);
}

void PelmoController::resetRecipients() {
    recipients->resetRecipients();
}

void PelmoController::putBackNotMailed(const QList<int>& rows) {
    const QList<Person> persons = notMailed->takePersons(rows);
    if (persons.isEmpty())
        return;
    recipientSelection->putBack(persons);
    statusMsg(
        persons.size() == 1
            ? LocalizedStringNS("1 recipient put back, to be mailed first.")
            : LocalizedStringNS("%1 recipients put back, to be mailed first.").arg(persons.size()));
}

void PelmoController::abGroupSelected(const QList<qint64>& groupIds, bool pickerIsKeyWindow) {
    recipientSelection->abGroupSelected(groupIds, pickerIsKeyWindow);
}

void PelmoController::abRecordSelected(const QList<qint64>& personIds,
                                       const QStringList& selectedAddresses,
                                       bool pickerIsKeyWindow) {
    recipientSelection->abRecordSelected(personIds, selectedAddresses, pickerIsKeyWindow);
}

void PelmoController::textDidChange(PelmoView::Field field) {
    recipientSelection->textDidChange(field);
}
