#include "ControllerFixture.h"
#include "ScriptedSession.h"

#include "addressbook/ImportedContact.h"
#include "attachments/AttachmentsController.h"
#include "controller/MessageTemplate.h"
#include "controller/NotMailedRecipients.h"
#include "controller/RecipientSelection.h"
#include "controller/SentRecipients.h"
#include "e2e/E2eSupport.h"

#include <QFile>
#include <QJsonDocument>
#include <QJsonObject>
#include <QMetaEnum>
#include <QStandardPaths>
#include <QTextDocument>

#include <atomic>
#include <chrono>
#include <thread>

#include <dlfcn.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

// A slow disk under the sent ledger, while a test wants one: each sync of a ledger takes a tenth
// of a second, and what it covered counts as on disk only once it is over.
std::atomic<bool> slowLedgerDisk{false};
std::atomic<off_t> ledgerBytesOnDisk{0};

bool isLedger(int fd) {
    char path[4096];
    const ssize_t size = ::readlink(
        QByteArray("/proc/self/fd/" + QByteArray::number(fd)).constData(), path, sizeof path);
    return size > 0 && QByteArray(path, size).endsWith(".ledger");
}

} // namespace

extern "C" int fdatasync(int fd) {
    static const auto systemSync = reinterpret_cast<int (*)(int)>(dlsym(RTLD_NEXT, "fdatasync"));
    if (!slowLedgerDisk || !isLedger(fd))
        return systemSync(fd);
    struct stat status {};
    ::fstat(fd, &status);
    std::this_thread::sleep_for(std::chrono::milliseconds(100));
    const int result = systemSync(fd);
    ledgerBytesOnDisk = status.st_size;
    return result;
}

namespace {

using Script = ScriptedSession::Script;

// Whole runs over scripted sessions. A scenario is what the user and the server do, step by
// step; the transcript of everything the controller shows, every session call and every
// address recorded as sent must match tests/data/runs/<name>.txt line by line.
class Run : public ControllerFixture {
public:
    void SetUp() override {
        ControllerFixture::SetUp();
        const QVariantMap settings{{"senderEmail", "me@example.org"},
                                   {"senderName", "Me"},
                                   {"serverAddress", "mail.example.org"},
                                   {"serverPort", 25},
                                   {"loginUsername", "me"},
                                   {"loginPassword", "secret"},
                                   {"selectedContentType", 1}};
        for (auto [key, value] : settings.asKeyValueRange())
            set(key.toLatin1().constData(), value);
        controller->message()->setPlainText(QStringLiteral("Hello {toName}"));
        controller->setSessionFactory([this](const QString& host, int port) -> SmtpSession* {
            note(QStringLiteral("smtp: open %1:%2").arg(host).arg(port));
            return new ScriptedSession(script, view.transcript);
        });
        QObject::connect(&controller->sentRecipients(), &SentRecipients::rowsInserted, [this] {
            note("sent: " + controller->sentRecipients().addresses().last());
        });
        const NotMailedRecipients& notMailed = controller->notMailedRecipients();
        QObject::connect(&notMailed, &NotMailedRecipients::rowsInserted, [this, &notMailed] {
            QStringList row;
            for (int column = 0; column < NotMailedRecipients::Time; ++column)
                row << notMailed.index(notMailed.rowCount() - 1, column).data().toString();
            note("not mailed: " + row.join(QLatin1String(" | ")));
        });
        QObject::connect(&controller->selection(), &RecipientSelection::summaryChanged, [this] {
            if (const QString now = controller->selection().summary(); now != summary)
                note("summary: " + (summary = now));
        });
        view.toText = QStringLiteral("ann@example.org");
        view.nameText = QStringLiteral("Ann");
        log.remove();
        controller->applicationWillFinishLaunching();
    }
    void note(const QString& line) { view.transcript << line; }
    void press() {
        note("user: presses " + view.buttonTitle);
        controller->send();
    }

    Script script;
    QString summary;
    std::unique_ptr<ServerProcess> pages; // tests/data/pages on 127.0.0.1, see page_server.py
    std::unique_ptr<ServerProcess> smtp;  // aiosmtpd on 127.0.0.1, see smtp_server.py
    int pagePort = 0;
    QFile log{QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation) +
              QStringLiteral("/Orvale Software/Pelmo/Pelmo.log")};
};

using Step = std::function<void(Run&)>;

Step setting(const char* key, const QVariant& value) {
    return [=](Run&) { TestSettings::set(key, value); };
}
template <class T>
Step with(T Script::*field, T value) {
    return [=](Run& run) { run.script.*field = value; };
}
// The group "Club" of these addresses ("" for a person without one), chosen in the picker.
Step group(const QStringList& addresses) {
    return [=](Run& run) {
        QList<ImportedContact> contacts;
        for (const QString& address : addresses)
            contacts << ImportedContact{
                Person{0, address.section(QLatin1Char('@'), 0, 0), QStringLiteral("Test"),
                       address.isEmpty() ? QStringList() : QStringList{address},
                       address.isEmpty() ? -1 : 0},
                {QStringLiteral("Club")}};
        run.book->add(contacts);
    };
}
const Step choose = [](Run& run) {
    run.note(QStringLiteral("user: chooses Club"));
    run.controller->abGroupSelected({run.book->groupNamed(QStringLiteral("Club"))->id}, true);
};
// Presses Send (or Stop) and waits until the run has nothing under way.
const Step send = [](Run& run) {
    run.note("user: presses " + run.view.buttonTitle);
    run.runUntilSettled();
    run.note(QStringLiteral("settled: ") + QMetaEnum::fromType<MailingRun::State>().valueToKey(
                                               int(run.controller->currentRun()->state())));
};
const Step press = [](Run& run) { run.press(); };
const Step putBack = [](Run& run) {
    run.note(QStringLiteral("user: puts back the not mailed"));
    run.controller->putBackNotMailed({});
};
// Types address into the Web Page field, "PORT" standing for the page server's.
Step page(const QString& address) {
    return [=](Run& run) {
        if (!run.pages && address.contains(QLatin1String("PORT"))) {
            run.pages = std::make_unique<ServerProcess>(
                QStringLiteral(PELMO_TEST_DIR "/controller/page_server.py"),
                QStringList{QStringLiteral(PELMO_TEST_DATA "/pages")});
            run.pagePort = run.pages->port();
        }
        run.view.pageText =
            QString(address).replace(QLatin1String("PORT"), QString::number(run.pagePort));
    };
}
const Step stopPageServer = [](Run& run) { run.pages.reset(); };
// The page as the current copy has it.
const Step showPage = [](Run& run) {
    const QString page = run.controller->messageTemplate().getWebPageOrFileContents();
    run.note("page: " + (page.isNull() ? QStringLiteral("(none)") : page));
};
const Step quickBackOffs = [](Run& run) {
    using namespace std::chrono_literals;
    run.controller->runPace().setRetrySchedule({10ms, 20ms, 40ms});
};
// Real SMTP sessions with aiosmtpd started with arguments, and back-offs of milliseconds.
Step server(const QStringList& arguments) {
    return [=](Run& run) {
        using namespace std::chrono_literals;
        run.smtp = std::make_unique<ServerProcess>(
            QStringLiteral(PELMO_TEST_DIR "/smtp/smtp_server.py"), arguments);
        TestSettings::set("serverAddress", "127.0.0.1");
        TestSettings::set("serverPort", run.smtp->port());
        run.controller->setSessionFactory(nullptr);
        quickBackOffs(run);
    };
}
// Whom the server took each message for, in order.
const Step received = [](Run& run) {
    for (const QByteArray& record : run.smtp->records())
        run.note("received: " + QJsonDocument::fromJson(record)["rcpt_tos"][0].toString());
};
const Step untilWaiting = [](Run& run) {
    ASSERT_TRUE(TestSettings::waitUntil(
        [&run] { return run.controller->currentRun()->state() == MailingRun::State::Waiting; }));
};
const Step pause = [](Run& run) {
    TestSettings::waitUntil([] { return false; }, 300);
    run.note(QStringLiteral("user: waits"));
};

struct Scenario {
    const char* name;
    QList<Step> steps;
};

const QStringList kClub = {"ann@example.org", "bob@example.org"};

const Scenario kScenarios[] = {
    // One copy to the To field: the bar spins, every step is shown, the address is recorded.
    {"single", {send}},
    // A group counts 1, 2, 3 of 3; chosen again, everyone is skipped and nobody is mailed.
    {"group_twice", {group(kClub + QStringList{"cy@example.org"}), choose, send, choose, send}},
    // A person without an address stalls the run with Stop showing; the rest stay pending.
    {"no_address", {group({"ann@example.org", "", "cy@example.org"}), choose, send}},
    // Stop lets the copy on its way finish and runs no completion action; Send goes on.
    {"stop_and_resume",
     {setting("completionAction", 2), group(kClub), choose,
      [](Run& run) { run.script.onSend = [&run] { run.press(); }; }, send,
      with<std::function<void()>>(&Script::onSend, nullptr), send}},
    // Values are used as they stand, spaces and all.
    {"login_plain",
     {setting("selectedAuthentication", 1), setting("loginUsername", " me, too "), send}},
    {"login_cram_md5", {setting("selectedAuthentication", 3), send}},
    // TLS wanted on a plain port: STARTTLS once, then the login.
    {"starttls", {setting("selectedAuthentication", 2), setting("useSSL", true), send}},
    {"implicit_tls", {setting("useSSL", true), with(&Script::implicitTls, true), send}},
    // The keyring's password (answering later) before the settings file's; none halts.
    {"password_sources",
     {setting("selectedAuthentication", 1), [](Run& run) { run.keyring.stored = "from-keyring"; },
      send, [](Run& run) { run.keyring.stored.clear(); }, send, setting("loginPassword", ""),
      send}},
    // An unknown mechanism shows the list and waits with the connection open.
    {"unknown_mechanism", {setting("selectedAuthentication", 4), send}},
    // A refused login closes, moves on, and no completion action follows.
    {"login_refused",
     {setting("selectedAuthentication", 2), setting("completionAction", 2),
      with(&Script::acceptLogin, false), group(kClub), choose, send}},
    {"reset_after_success", {setting("completionAction", 2), send}},
    // A refused message beeps, shows the reply when it is UTF-8, and stops the run.
    {"refused",
     {with<QByteArray>(&Script::refusal, "550 5.1.1 <ann@example.org>: no\r\n"), group(kClub),
      choose, send, with<QByteArray>(&Script::refusal, "550 \xff\xfe\r\n"), send}},
    // Who was refused is listed with the reply, and put back is mailed before the rest.
    {"put_back",
     {with<QByteArray>(&Script::refusal, "550 5.1.1 <ann@example.org>: no\r\n"),
      group(kClub + QStringList{"cy@example.org"}), choose, send,
      with<QByteArray>(&Script::refusal, {}), putBack, send}},
    // With reuseConnection the copies share one connection, closed when the run ends.
    {"reuse_connection",
     {setting("reuseConnection", true), group(kClub + QStringList{"cy@example.org"}), choose,
      send}},
    // Stop while Ann's copy goes: the kept connection is closed once it is accepted.
    {"reuse_connection_stopped",
     {setting("reuseConnection", true), group(kClub), choose,
      [](Run& run) { run.script.onSend = [&run] { run.press(); }; }, send}},
    // The server closes the kept connection with 421 at Bob's copy: it goes again, over a new
    // one, and the run completes as if nothing happened.
    {"reuse_connection_421",
     {setting("reuseConnection", true), setting("completionAction", 2),
      with<QByteArray>(&Script::refusal, "421 4.4.2 Idle too long\r\n"),
      with(&Script::refuseAtSend, 2), group(kClub + QStringList{"cy@example.org"}), choose, send}},
    // The connection is lost before Bob's copy went out: it goes again, over a new one.
    {"reuse_connection_lost",
     {setting("reuseConnection", true), with(&Script::loseAtSend, 2),
      group(kClub + QStringList{"cy@example.org"}), choose, send}},
    // A time-out stalls the run; a lost connection hands over to the next person.
    {"timeout_then_lost",
     {with(&Script::timeOutOnConnect, true), group(kClub), choose, send, press,
      with(&Script::timeOutOnConnect, false), with(&Script::loseConnectionOnSend, true), choose,
      send}},
    // A failing setting halts: Send again, nothing more starts, not even when the server drops
    // the connection later, which is closed at once.
    // Each value a copy cannot go without stops it, missing or empty, with what is missing.
    {"no_sender",
     {setting("senderEmail", QVariant()), send, setting("senderEmail", "me@example.org"),
      setting("senderName", ""), send}},
    {"no_recipient",
     {[](Run& run) { run.view.nameText.clear(); }, send,
      [](Run& run) { run.view.toText.clear(), run.view.nameText = "Ann"; }, send}},
    {"bad_port", {setting("serverPort", 65366), send}},
    {"halt_no_server", {setting("serverAddress", ""), group(kClub), choose, send}},
    {"halt_no_username",
     {setting("selectedAuthentication", 1), setting("loginUsername", ""),
      with(&Script::dropWhenIdle, true), group(kClub), choose, send, pause}},
    // The page is fetched lower-cased and its links made absolute against the address as
    // typed; every copy gets its own tags in it.
    {"page",
     {page("HTTP://127.0.0.1:PORT/Dir/Page.HTML"), send, showPage,
      [](Run& run) { run.view.nameText = "Bob"; }, showPage}},
    // A page that cannot be had is said so and the copy goes without it; what is no web
    // address fetches nothing.
    {"page_missing",
     {page("http://127.0.0.1:PORT/dir/missing.html"), send, showPage, page("/home/me/page.html"),
      send, page("ftp://host/x"), send}},
    // Stop while the page downloads ends the run at once: nothing is mailed, not even later.
    {"page_stopped", {page("http://127.0.0.1:PORT/dir/page.html"), press, press, pause}},
    // Pages are decoded as UTF-8, else in the charset declared (TSCII: several characters a
    // byte), else as Mac OS Roman; a redirect
    // is followed; a server that has gone, or an address without a host, is said so.
    {"page_decoding",
     {page("http://127.0.0.1:PORT/dir/latin.html"), send, showPage,
      page("http://127.0.0.1:PORT/dir/roman.html"), send, showPage,
      page("http://127.0.0.1:PORT/dir/tamil.html"), send, showPage,
      page("http://127.0.0.1:PORT/dir"), send, showPage, stopPageServer, send, page("http://"),
      send}},
    // Between copies the run waits and says for how long; Stop ends the wait at once, and
    // those not mailed stay pending.
    {"paced_stop",
     {setting("delayBetweenMessages", 60), group(kClub + QStringList{"cy@example.org"}), choose,
      press, untilWaiting, send}},
    {"pace_bad_delay", {setting("delayBetweenMessages", "soon"), group(kClub), choose, send}},
    // A copy refused for now goes again after a back-off, and is mailed once.
    {"temporary_refusal_retried",
     {setting("retryTemporaryFailures", true), server({"--defer-recipient", "bob@example.org=2"}),
      group(kClub), choose, send, received}},
    // A 421 on the kept connection goes again at once over a new one; refused there too, it
    // waits its first back-off.
    {"reuse_connection_421_busy",
     {setting("reuseConnection", true), setting("retryTemporaryFailures", true), quickBackOffs,
      with<QByteArray>(&Script::refusal, "421 4.7.0 Too busy\r\n"), with(&Script::refuseAtSend, 2),
      with(&Script::refusals, 2), group(kClub + QStringList{"cy@example.org"}), choose, send}},
    // After the last retry is refused too, the run stops with the server's reason.
    {"temporary_refusal_given_up",
     {setting("retryTemporaryFailures", true), server({"--defer-recipient", "ann@example.org=9"}),
      group(kClub), choose, send, received}},
    // A file name that cannot go into a header halts the copy before the server is bothered,
    // though the message itself is built while connecting.
    {"attachment_bad_name",
     {[](Run& run) {
          run.controller->getAttachments().addFiles(
              {QStringLiteral(PELMO_TEST_DATA "/runs/no\nsuch.pdf")});
      },
      send}},
    // The address recorded is the one the copy went to, whatever To says by then.
    {"to_edited_while_sending",
     {[](Run& run) { run.script.onSend = [&run] { run.view.toText = "typed@example.org"; }; },
      send}},
};

void PrintTo(const Scenario& scenario, std::ostream* out) {
    *out << scenario.name;
}

class RunScenario : public Run, public ::testing::WithParamInterface<Scenario> {};

// Besides the transcript, the log must hold every status line as shown, one per carriage
// return between the launch's markers, and no password, whichever reached the server.
TEST_P(RunScenario, Transcript) {
    for (const Step& step : GetParam().steps)
        step(*this);
    controller->applicationWillTerminate();
    QString actual = view.transcript.join(QLatin1Char('\n')) + QLatin1Char('\n');
    actual.replace(QStringLiteral("127.0.0.1:%1").arg(pagePort), QLatin1String("127.0.0.1:PORT"));
    QFile file(QStringLiteral(PELMO_TEST_DATA "/runs/%1.txt").arg(GetParam().name));
    // Writes the transcripts anew, to be read through before they are committed.
    if (qEnvironmentVariableIsSet("PELMO_WRITE_TRANSCRIPTS") && file.open(QIODevice::WriteOnly))
        file.write(actual.toUtf8());
    file.close();
    ASSERT_TRUE(file.open(QIODevice::ReadOnly)) << file.fileName().toStdString();
    EXPECT_EQ(actual, QString::fromUtf8(file.readAll()));
    ASSERT_TRUE(log.open(QIODevice::ReadOnly));
    const QByteArray text = log.readAll();
    EXPECT_FALSE(text.contains("secret") || text.contains("from-keyring"));
    const QList<QByteArray> lines = text.split('\r');
    QStringList logged;
    for (const QByteArray& line : lines.mid(1, lines.size() - 3))
        logged << QString::fromUtf8(line);
    EXPECT_EQ(logged, view.statuses);
    EXPECT_TRUE(lines.last().isEmpty());
}

INSTANTIATE_TEST_SUITE_P(Runs, RunScenario, ::testing::ValuesIn(kScenarios),
                         [](const auto& row) { return std::string(row.param.name); });

// A Pelmo that dies with the machine must know everyone it mailed but the last: each copy goes
// to the server only once the ledger's line for the one before is on disk, however slow the
// disk.
TEST_F(Run, EachCopyGoesOutOnlyOnceTheLastAcceptedIsOnDisk) {
    group({"ann@example.org", "bob@example.org", "cy@example.org"})(*this);
    choose(*this);
    QStringList onDiskAtEachSend;
    script.onSend = [&] {
        const QDir data(QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation) +
                        QStringLiteral("/Orvale Software/Pelmo"));
        QFile ledger(data.filePath(data.entryList({QStringLiteral("Sent-*.ledger")}).value(0)));
        QByteArray onDisk = ledger.open(QIODevice::ReadOnly) ? ledger.readAll() : QByteArray();
        onDisk.truncate(ledgerBytesOnDisk);
        onDisk.truncate(onDisk.lastIndexOf('\n') + 1); // whole lines only
        QStringList mailed;
        for (const QByteArray& line : onDisk.split('\n'))
            if (line.startsWith("sent\t"))
                mailed << QString::fromUtf8(line.split('\t').value(3));
        onDiskAtEachSend << mailed.join(QLatin1Char(' '));
    };
    slowLedgerDisk = true;
    runUntilSettled();
    slowLedgerDisk = false;
    EXPECT_EQ(onDiskAtEachSend,
              QStringList({"", "ann@example.org", "ann@example.org bob@example.org"}));
}

} // namespace
