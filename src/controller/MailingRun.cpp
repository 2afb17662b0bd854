#include "controller/MailingRun.h"

#include "attachments/AttachmentsController.h"
#include "browser/PageDownload.h"
#include "controller/MailSettings.h"
#include "controller/MessageTemplate.h"
#include "controller/NotMailedRecipients.h"
#include "controller/PasswordStore.h"
#include "controller/PelmoView.h"
#include "controller/RecipientSelection.h"
#include "controller/RunPace.h"
#include "controller/SentRecipients.h"
#include "relink/Relink.h"
#include "relink/SuffixMap.h"
#include "smtp/EncodedAttachments.h"
#include "smtp/SMTP.h"
#include "smtp/SmtpSession.h"
#include "util/LocalizedStrings.h"
#include "util/TextUtilities.h"

#include <QDateTime>
#include <QRegularExpression>

namespace {

using Key = MailSettings::Key;

QString now() {
    return DateDescription(QDateTime::currentDateTime());
}

} // namespace

MailingRun::MailingRun(const Parts& parts, QObject* parent)
    : QObject(parent), m_parts(parts),
      m_encodedAttachments(std::make_shared<EncodedAttachments>()) {
    m_paceTimer.setSingleShot(true);
    // A coarse timer may fire a little early, and the copy would then wait once more.
    m_paceTimer.setTimerType(Qt::PreciseTimer);
    connect(&m_paceTimer, &QTimer::timeout, this, &MailingRun::paceElapsed);
}

MailingRun::~MailingRun() = default;

void MailingRun::enter(State state) {
    if (m_state == state)
        return;
    m_state = state;
    Q_EMIT stateChanged(state);
}

void MailingRun::settleUnlessDelivering() {
    const bool waiting = m_delivery && m_delivery->state() != SMTP::State::Aborted &&
                         m_delivery->state() != SMTP::State::Stalled;
    if (!waiting && !m_paceTimer.isActive() && m_state != State::PreparingPage)
        Q_EMIT settled();
}

// The page

void MailingRun::start() {
    m_typedAddress = m_parts.view.webPageOrFile();
    const QString address = m_typedAddress.toLower();
    if (!address.startsWith(QLatin1String("http://")) &&
        !address.startsWith(QLatin1String("https://")))
        return pageReady(QString());
    // Stop must be pressable while the page downloads.
    m_parts.view.setSendButtonTitle(LocalizedStringNS("Stop"));
    enter(State::PreparingPage);
    status(QStringLiteral("Downloading \"%1\"").arg(address));
    // The whole address is fetched lower-cased; links are resolved against it as typed.
    m_download = new PageDownload(this);
    connect(m_download, &PageDownload::finished, this,
            [this, address](const QString& page, const QString&) {
                m_download->deleteLater();
                if (page.isNull()) {
                    status(LocalizedStringNS("Could not download \"%1\"").arg(address));
                    return pageReady(QString());
                }
                status(LocalizedStringNS("Relinking web page..."));
                pageReady(relinkedPage(page, m_typedAddress));
            });
    m_download->start(address);
}

QString MailingRun::relinkedPage(const QString& page, const QString& typedAddress) {
    const QByteArray bytes = page.toUtf8();
    CText text("");
    text.append(bytes.constData(), bytes.size());
    // Reading the MIME database takes a tenth of a second: only runs with a page pay for it.
    EnsureSuffixMap();
    relink(CString256(typedAddress.toUtf8().constData()), text);
    return QString::fromUtf8(text.buffer(), text.length());
}

void MailingRun::pageReady(const QString& page) {
    m_parts.message.setPage(page);
    beginDeliveries();
}

// The run

void MailingRun::beginDeliveries() {
    m_parts.view.setSendButtonTitle(LocalizedStringNS("Stop"));
    m_stopSending = false;
    enter(State::Delivering);
    status(LocalizedStringNS("Sending mail."));
    if (const auto& people = m_parts.selection.getPeople()) {
        m_parts.view.setProgressCounting(0.0, static_cast<double>(people->size()), 0.0);
        sendMember();
    } else {
        m_parts.view.setProgressBusy();
        if (!waitForPace(1, 1))
            deliver();
    }
    settleUnlessDelivering();
}

bool MailingRun::sendMember() {
    if (m_stopSending)
        return false;
    const auto& people = m_parts.selection.getPeople();
    if (!people || people->isEmpty()) {
        endRun();
        return false;
    }
    if (waitForPace(static_cast<int>(people->size()),
                    static_cast<int>(m_parts.view.progressMaximum())))
        return true;
    PelmoView& view = m_parts.view;
    view.setProgressValue(view.progressMaximum() - static_cast<double>(people->size()) + 1.0);
    const Person person = m_parts.selection.takeFirst();
    m_member = person;
    view.setName(RecipientSelection::firstAndLastName(person));
    // A person without an address is taken off all the same: the run stalls there, since the
    // next person is only taken when a connection closes.
    if (person.emails.isEmpty()) {
        memberNotMailed(LocalizedStringNS("No e-mail address."));
        enter(State::Stalled);
    } else {
        view.setTo(person.primaryEmail());
        deliver();
    }
    return true;
}

bool MailingRun::nextCopy() {
    if (m_parts.selection.getPeople() || m_stopSending)
        return sendMember();
    if (!waitForPace(1, 1))
        deliver();
    return true;
}

bool MailingRun::waitForPace(int left, int total) {
    RunPace& pace = m_parts.pace;
    MailSettings& settings = m_parts.settings;
    try {
        settings.sync();
        pace.setDelay(std::chrono::round<RunPace::Duration>(
            std::chrono::duration<double>(settings.delayBetweenMessages())));
        pace.setHourlyLimit(settings.maxMessagesPerHour());
    } catch (const PelmoException& failure) {
        halt(failure);
        return true;
    }
    const auto now = RunPace::Clock::now();
    const RunPace::Duration wait = pace.waitBefore(now);
    if (wait.count() <= 0)
        return false;
    status(LocalizedStringNS("Waiting %1 before the next message: %2 of %3 left, about %4 to go.")
               .arg(RunPace::describe(wait))
               .arg(left)
               .arg(total)
               .arg(RunPace::describe(pace.timeFor(left, now))));
    m_paceTimer.start(wait);
    enter(State::Waiting);
    return true;
}

void MailingRun::paceElapsed() {
    enter(State::Delivering);
    if (!nextCopy())
        finishRun(false);
    settleUnlessDelivering();
}

// RFC 5321 4.2.1, 4.2.5: after a 4yz reply to RCPT or at the end of DATA the copy was not taken,
// and may be sent again; these four are the server's busy or full moments, worth waiting out.
bool MailingRun::retryLater(SMTP* delivery) {
    static const QStringList kTemporary{QStringLiteral("421"), QStringLiteral("450"),
                                        QStringLiteral("451"), QStringLiteral("452")};
    const QString& reply = delivery->failureReason();
    const QString recipient = delivery->request().recipient;
    if (recipient != m_retryRecipient) {
        m_retryRecipient = recipient;
        m_retries = 0;
    }
    const QList<RunPace::Duration>& backOffs = m_parts.pace.retrySchedule();
    if (m_stopSending || !m_parts.settings.boolean(Key::RetryTemporaryFailures) ||
        m_retries >= backOffs.size() || delivery->succeeded() ||
        !kTemporary.contains(reply.left(3)) ||
        (reply.size() > 3 && reply[3] != u' ' && reply[3] != u'-'))
        return false;
    const RunPace::Duration backOff = m_backOff = backOffs.at(m_retries++);
    status(LocalizedStringNS("The server refused the message for now: trying again in %1 "
                             "(retry %2 of %3).")
               .arg(RunPace::describe(backOff))
               .arg(m_retries)
               .arg(backOffs.size()));
    if (m_member)
        m_parts.selection.putBack({*m_member});
    m_member.reset();
    m_retried = delivery;
    delivery->closeAfterRefusal();
    return true;
}

void MailingRun::deliver() {
    status(LocalizedStringNS("[Mailing started at ") + now() + LocalizedStringNS("]"));
    if (!m_parts.selection.getPeople())
        m_parts.view.startProgressAnimation();
    // What another process saved since the last copy counts for this one.
    m_parts.settings.sync();
    DeliveryRequest request;
    try {
        request = buildRequest();
    } catch (const PelmoException& failure) {
        return halt(failure);
    }
    SmtpSession* open = openSessionFor(request);
    m_onOpenSession = open != nullptr;
    auto* delivery =
        new SMTP(request, open ? open : m_parts.createSession(request.server, request.port), this);
    delivery->setKeepSession(m_parts.settings.boolean(Key::ReuseConnection));
    m_delivery = delivery;
    m_parts.pace.copyStarted(RunPace::Clock::now());
    enter(State::Delivering);
    connect(delivery, &SMTP::statusMessage, this, &MailingRun::statusMessage);
    connect(delivery, &SMTP::accepted, this, [this, delivery](const QString& recipient) {
        Q_EMIT copyAccepted(recipient, delivery->messageId());
        m_member.reset();
        m_parts.sent.addRecipient(recipient);
        m_parts.notMailed.removeAddress(recipient);
    });
    connect(delivery, &SMTP::refused, this, [this, delivery] {
        if (retryOnNewSession(delivery) || retryLater(delivery) || skipRefusedCopy(delivery))
            return;
        memberNotMailed(delivery->failureReason());
        m_everyCopyAccepted = false;
        m_parts.view.beep();
        abort();
    });
    connect(delivery, &SMTP::stalled, this, [this, delivery] {
        memberNotMailed(delivery->failureReason());
        m_everyCopyAccepted = false;
        enter(State::Stalled);
        settleUnlessDelivering();
    });
    connect(delivery, &SMTP::finished, this, [this, delivery] { deliveryFinished(delivery); });
    connect(delivery, &SMTP::aboutToSend, this, &MailingRun::copyGoingOut, Qt::DirectConnection);
    if (open) {
        ++m_sessionCopies;
        delivery->startOnOpenSession();
    } else {
        m_openServer = request.server;
        m_openPort = request.port;
        m_sessionCopies = 1;
        delivery->start();
    }
}

SmtpSession* MailingRun::openSessionFor(const DeliveryRequest& request) {
    constexpr int kCopiesPerSession = 50;
    if (!m_openSession || m_sessionCopies >= kCopiesPerSession || request.server != m_openServer ||
        request.port != m_openPort || !m_parts.settings.boolean(Key::ReuseConnection)) {
        closeOpenSession();
        return nullptr;
    }
    SmtpSession* session = m_openSession;
    m_openSession = nullptr;
    return session;
}

// RFC 5321 4.2.2: 421 closes the transmission channel, whatever was asked; on a connection
// that has carried copies already it is most often the server's idle or per-connection limit.
bool MailingRun::retryOnNewSession(SMTP* delivery) {
    const bool closing = delivery->state() == SMTP::State::Aborted
                             ? delivery->failureReason().startsWith(QLatin1String("421"))
                             : delivery->state() != SMTP::State::Halted;
    if (!m_onOpenSession || !m_member || delivery->succeeded() || delivery->messageWritten() ||
        !closing)
        return false;
    m_onOpenSession = false;
    m_retried = delivery;
    m_parts.selection.putBack({*m_member});
    m_member.reset();
    return true;
}

// RFC 5321 4.2.1: a 5yz reply is a permanent refusal of this transaction only; a 4yz one may
// succeed later and is not skipped, and 421 concerns the connection. A refused sender would
// refuse every copy, so it stops the run as before.
bool MailingRun::skipRefusedCopy(SMTP* delivery) {
    static const QRegularExpression permanent(QStringLiteral("^5\\d\\d(?:[ -]|$)"));
    if (!m_member || !m_parts.settings.boolean(Key::ContinueAfterRefusal) ||
        !permanent.match(delivery->failureReason()).hasMatch() || delivery->senderRefused())
        return false;
    const Person member = *m_member;
    memberNotMailed(delivery->failureReason());
    m_everyCopyAccepted = false;
    Q_EMIT copyRefused(member, delivery->failureReason());
    // Its end hands over to the next member, as an accepted copy's does.
    delivery->closeAfterRefusal();
    return true;
}

void MailingRun::closeOpenSession() {
    if (!m_openSession)
        return;
    SmtpSession* session = m_openSession;
    m_openSession = nullptr;
    for (auto signal : {&SmtpSession::connectionTerminated, &SmtpSession::connectionLost,
                        &SmtpSession::connectionTimedOut})
        connect(session, signal, session, &QObject::deleteLater);
    session->close();
}

DeliveryRequest MailingRun::buildRequest() {
    DeliveryRequest request = requestFor(
        m_parts.message, m_parts.settings, m_parts.attachments, [this](const DeliveryRequest& to) {
            status(QLatin1Char('[') + now() + QLatin1Char(']') + LocalizedStringNS(" Mail to: ") +
                   to.recipientName + QLatin1String(" <") + to.recipient + QLatin1Char('>'));
        });
    request.credentials = credentialsFrom(m_parts.settings, m_parts.passwords, this);
    request.encodedAttachments = m_encodedAttachments;
    return request;
}

// The settings and texts are read in the order a message is built, so that the first missing
// one is the one reported.
DeliveryRequest MailingRun::requestFor(MessageTemplate& message, MailSettings& settings,
                                       const AttachmentsController& attachments,
                                       const std::function<void(const DeliveryRequest&)>& addressed,
                                       bool serverNeeded) {
    DeliveryRequest request;
    request.subject = message.getSubject();
    request.senderName = message.getFromName();
    request.sender = message.getFrom();
    request.recipientName = message.getToName();
    request.recipient = message.getTo();
    addressed(request);
    request.characterSet = settings.integer(Key::SelectedCharacterSet);
    switch (settings.integer(Key::SelectedContentType)) {
    case 0:
        request.bodyParts.append({message.getHTMLMessage(), QStringLiteral("text/html")});
        if (settings.boolean(Key::AddPlainTextAlternative))
            request.plainAlternative = message.getMessage();
        break;
    case 1:
        request.bodyParts.append({message.getMessage(), QStringLiteral("text/plain")});
        break;
    default:
        break;
    }
    if (const QString page = message.getWebPageOrFileContents(); !page.isNull())
        request.bodyParts.append({page, QStringLiteral("text/html")});
    request.attachments = attachments.getAttachments();
    request.listUnsubscribe = settings.string(Key::ListUnsubscribe);
    request.server =
        serverNeeded ? settings.required(Key::ServerAddress) : settings.string(Key::ServerAddress);
    request.port = serverNeeded ? settings.port() : settings.integer(Key::ServerPort);
    request.useSSL = settings.boolean(Key::UseSSL);
    request.loginMechanism = settings.integer(Key::SelectedAuthentication);
    return request;
}

// The user name, then the password: a password given for this run, else the keyring's, else
// the settings key's.
DeliveryRequest::CredentialsRequest
MailingRun::credentialsFrom(MailSettings& settings, PasswordStore& passwords, QObject* context) {
    return [&settings, &passwords, context](std::function<void(const Credentials&)> answer) {
        Credentials credentials;
        const auto passwordFromSettings = [&settings](Credentials& login) {
            try {
                login.password = settings.required(Key::LoginPassword);
            } catch (const PelmoException& failure) {
                login.failure = failure;
            }
        };
        try {
            credentials.user = settings.required(Key::LoginUsername);
        } catch (const PelmoException& failure) {
            credentials.failure = failure;
            return answer(credentials);
        }
        if (settings.isOverridden(Key::LoginPassword)) {
            passwordFromSettings(credentials);
            return answer(credentials);
        }
        passwords.readPassword(
            MailSettings::name(Key::LoginPassword), context,
            [credentials, answer, passwordFromSettings](const QString& fromKeyring) mutable {
                if (fromKeyring.isEmpty())
                    passwordFromSettings(credentials);
                else
                    credentials.password = fromKeyring;
                answer(credentials);
            });
    };
}

void MailingRun::deliveryFinished(SMTP* delivery) {
    m_parts.pace.copyEnded(RunPace::Clock::now());
    delivery->deleteLater();
    if (m_delivery == delivery)
        m_delivery = nullptr;
    if (delivery->state() == SMTP::State::Kept) {
        m_openSession = delivery->takeSession();
        m_openSession->setParent(this);
    } else if (delivery == m_retried || retryOnNewSession(delivery)) {
        // The copy goes again: this delivery neither failed the run nor mailed anyone. A
        // back-off counts from the end of the refused try.
        m_parts.pace.holdUntil(RunPace::Clock::now() + std::exchange(m_backOff, {}));
        if (!nextCopy())
            finishRun(false);
        return settleUnlessDelivering();
    }
    if (!delivery->succeeded())
        memberNotMailed(delivery->failureReason());
    switch (delivery->state()) {
    case SMTP::State::Kept:
    case SMTP::State::Ended:
        if (!delivery->succeeded())
            m_everyCopyAccepted = false;
        // The next person's delivery, if any, starts before this one is done with.
        if (!sendMember())
            finishRun(delivery->succeeded());
        break;
    case SMTP::State::TimedOut:
        // The run stops here with Stop showing: every later copy would fail alike.
        m_everyCopyAccepted = false;
        enter(State::Stalled);
        break;
    default:
        m_everyCopyAccepted = false;
        showHalted();
        break;
    }
    settleUnlessDelivering();
}

void MailingRun::halt(const PelmoException& failure) {
    m_everyCopyAccepted = false;
    const QString text = failure.statusText();
    status(text);
    memberNotMailed(text);
    showHalted();
}

void MailingRun::memberNotMailed(const QString& why) {
    if (!m_member)
        return;
    m_parts.notMailed.addPerson(
        *m_member, why.isEmpty() ? LocalizedStringNS("The connection closed before the message "
                                                     "was accepted.")
                                 : why);
    m_member.reset();
}

void MailingRun::showHalted() {
    closeOpenSession();
    PelmoView& view = m_parts.view;
    // Start, then stop at once: the indicator ends spinning and still, whatever it showed.
    if (m_parts.selection.getPeople()) {
        view.setProgressBusy();
        view.startProgressAnimation();
    }
    view.stopProgressAnimation();
    view.setSendButtonTitle(LocalizedStringNS("Send"));
    enter(State::Halted);
}

void MailingRun::endRun() {
    // Closed before the end is announced; finishRun() closes one a stopped run leaves.
    closeOpenSession();
    PelmoView& view = m_parts.view;
    view.setProgressBusy();
    view.startProgressAnimation();
    view.stopProgressAnimation();
    m_parts.selection.clear();
    status(LocalizedStringNS("[Mailing completed at ") + now() + QStringLiteral("]"));
    view.setSendButtonTitle(LocalizedStringNS("Send"));
    enter(State::Completed);
}

void MailingRun::finishRun(bool succeeded) {
    // A run stopped while a copy was on its way over a kept connection closes it here.
    closeOpenSession();
    if (!m_parts.selection.getPeople())
        m_parts.view.stopProgressAnimation();
    // A stopped run has persons left for the next Send: neither quitting nor clearing the
    // form may follow it.
    if (!succeeded || m_stopSending)
        return;
    const int action = m_parts.settings.integer(Key::CompletionAction);
    if (action == 1 || action == 2)
        Q_EMIT completionActionWanted(action);
}

void MailingRun::abort() {
    // A wait ends at once; whoever it held back stays pending.
    m_paceTimer.stop();
    closeOpenSession();
    m_parts.view.stopProgressAnimation();
    m_stopSending = true;
    m_parts.view.setSendButtonTitle(LocalizedStringNS("Send"));
    if (m_download) {
        m_download->abort();
        m_download->deleteLater();
    }
    enter(State::Stopped);
    settleUnlessDelivering();
}
