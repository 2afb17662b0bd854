#include "app/Commands.h"

#include "addressbook/AddressBook.h"
#include "app/ConsoleView.h"
#include "attachments/AttachmentsController.h"
#include "controller/CopyPreview.h"
#include "controller/MailSettings.h"
#include "controller/PasswordStore.h"
#include "controller/PelmoController.h"
#include "controller/PreflightCheck.h"
#include "smtp/DryRunSession.h"
#include "util/PelmoException.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QTextDocument>
#include <QTextStream>

namespace Commands {

namespace {

using Key = MailSettings::Key;

constexpr char kUsage[] =
    "usage: pelmo send [--group NAME | --to ADDRESS [--name NAME]] [--subject TEXT]\n"
    "                  [--message FILE] [--page URL | --front-page] [--attach FILE]...\n"
    "                  [--delay SECONDS] [--max-per-hour N] [--set KEY=VALUE]...\n"
    "                  [--dry-run DIR | --preview N | --test N] [--strict] [--resume]\n";

struct SendOptions {
    QString group, to, name, subject, messageFile, page, dryRunDirectory;
    bool hasTo = false, hasName = false, frontPage = false, resume = false, strict = false;
    /** The copy to print (--preview) or to mail to the sender (--test); 0 for none. */
    int preview = 0, test = 0;
    QStringList attachments;
    QList<QPair<QString, QString>> settings;
};

class UsageError {
public:
    explicit UsageError(QString text) : message(std::move(text)) {}
    QString message;
};

QString valueAfter(const QStringList& args, qsizetype& i) {
    if (i + 1 >= args.size())
        throw UsageError(QStringLiteral("%1 needs a value").arg(args.at(i)));
    return args.at(++i);
}

int copyNumber(const QStringList& args, qsizetype& i) {
    const QString& option = args.at(i);
    bool number = false;
    const int copy = valueAfter(args, i).toInt(&number);
    if (!number || copy < 1)
        throw UsageError(QStringLiteral("%1 takes a copy number from 1").arg(option));
    return copy;
}

SendOptions parse(const QStringList& args) {
    SendOptions options;
    for (qsizetype i = 0; i < args.size(); ++i) {
        const QString& option = args.at(i);
        if (option == QLatin1String("--group")) {
            options.group = valueAfter(args, i);
        } else if (option == QLatin1String("--to")) {
            options.to = valueAfter(args, i);
            options.hasTo = true;
        } else if (option == QLatin1String("--name")) {
            options.name = valueAfter(args, i);
            options.hasName = true;
        } else if (option == QLatin1String("--subject")) {
            options.subject = valueAfter(args, i);
        } else if (option == QLatin1String("--message")) {
            options.messageFile = valueAfter(args, i);
        } else if (option == QLatin1String("--page")) {
            options.page = valueAfter(args, i);
        } else if (option == QLatin1String("--front-page")) {
            options.frontPage = true;
        } else if (option == QLatin1String("--resume")) {
            options.resume = true;
        } else if (option == QLatin1String("--attach")) {
            options.attachments << valueAfter(args, i);
        } else if (option == QLatin1String("--dry-run")) {
            options.dryRunDirectory = valueAfter(args, i);
        } else if (option == QLatin1String("--delay")) {
            const QString seconds = valueAfter(args, i);
            bool isNumber = false;
            const double value = seconds.toDouble(&isNumber);
            if (!isNumber || !(value >= 0 && value <= MailSettings::kMaxDelaySeconds))
                throw UsageError(QStringLiteral("--delay takes a number of seconds from 0 to %1")
                                     .arg(MailSettings::kMaxDelaySeconds));
            options.settings.append({MailSettings::name(Key::DelayBetweenMessages), seconds});
        } else if (option == QLatin1String("--max-per-hour")) {
            const QString copies = valueAfter(args, i);
            bool isNumber = false;
            const int value = copies.toInt(&isNumber);
            if (!isNumber || value < 1 || value > MailSettings::kMaxMessagesPerHour)
                throw UsageError(QStringLiteral("--max-per-hour takes a whole number from 1 to %1")
                                     .arg(MailSettings::kMaxMessagesPerHour));
            options.settings.append({MailSettings::name(Key::MaxMessagesPerHour), copies});
        } else if (option == QLatin1String("--preview")) {
            options.preview = copyNumber(args, i);
        } else if (option == QLatin1String("--test")) {
            options.test = copyNumber(args, i);
        } else if (option == QLatin1String("--strict")) {
            options.strict = true;
        } else if (option == QLatin1String("--set")) {
            const QString pair = valueAfter(args, i);
            const qsizetype equals = pair.indexOf(QLatin1Char('='));
            const QString key = pair.left(equals);
            // Anything but one of our keys is most likely a typing mistake.
            if (equals <= 0 || !MailSettings::keyNamed(key))
                throw UsageError(QStringLiteral("--set takes KEY=VALUE with KEY one of: %1")
                                     .arg(MailSettings::names().join(QStringLiteral(", "))));
            options.settings.append({key, pair.mid(equals + 1)});
        } else {
            throw UsageError(QStringLiteral("unknown option %1").arg(option));
        }
    }
    if (!options.group.isEmpty() && (options.hasTo || options.hasName))
        throw UsageError(QStringLiteral("--group and --to/--name cannot be used together"));
    if (options.frontPage && !options.page.isEmpty())
        throw UsageError(QStringLiteral("--page and --front-page cannot be used together"));
    if ((options.preview > 0) + (options.test > 0) + !options.dryRunDirectory.isEmpty() > 1)
        throw UsageError(QStringLiteral("--dry-run, --preview and --test cannot be used together"));
    return options;
}

// What can be checked before anything is sent; the reason, or a null string.
QString problemWith(const SendOptions& options) {
    if (!options.messageFile.isEmpty() && !QFileInfo(options.messageFile).isReadable())
        return QStringLiteral("cannot read the message file %1").arg(options.messageFile);
    for (const QString& path : options.attachments) {
        const QFileInfo file(path);
        if (!file.isFile() || !file.isReadable())
            return QStringLiteral("cannot read the attachment %1").arg(path);
    }
    if (!options.dryRunDirectory.isEmpty() && !QDir().mkpath(options.dryRunDirectory))
        return QStringLiteral("cannot create the folder %1").arg(options.dryRunDirectory);
    return {};
}

void loadMessage(const QString& path, QTextDocument& body) {
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return;
    const QString text = QString::fromUtf8(file.readAll());
    const QString suffix = QFileInfo(path).suffix().toLower();
    if (suffix == QLatin1String("html") || suffix == QLatin1String("htm"))
        body.setHtml(text);
    else
        body.setPlainText(text);
}

void writeCopiesTo(PelmoController& controller, const QString& directory) {
    // Nobody is mailed, so a crash must not make these copies count as sent.
    controller.setLedgerKept(false);
    auto copies = std::make_shared<int>(0);
    controller.setSessionFactory([directory, copies](const QString&, int) -> SmtpSession* {
        const QString name = QStringLiteral("%1.eml").arg(++*copies, 4, 10, QLatin1Char('0'));
        return new DryRunSession(QDir(directory).filePath(name));
    });
}

// Puts the options into the controller as a user would into the window.
bool prepare(PelmoController& controller, AddressBook& book, const SendOptions& options) {
    PelmoView& view = controller.view();
    for (const auto& [key, value] : options.settings)
        controller.settings().overrideValue(*MailSettings::keyNamed(key), value);
    // A preview prints the message alone: the fields start as start-up would leave them,
    // without its "Ready.".
    if (options.preview > 0) {
        view.setTo(controller.getDefaultTo());
        view.setName(controller.getDefaultToName());
    }
    if (options.hasTo)
        view.setTo(options.to);
    if (options.hasName)
        view.setName(options.name);
    view.setWebPageOrFile(options.page);
    // The browser's page brings its title as the subject, unless one was given.
    if (options.frontPage && !askFrontPage(controller))
        return false;
    if (!options.frontPage || !options.subject.isEmpty())
        view.setSubject(options.subject);
    if (!options.messageFile.isEmpty())
        loadMessage(options.messageFile, *controller.message());
    QStringList paths;
    for (const QString& path : options.attachments)
        paths << QFileInfo(path).absoluteFilePath();
    controller.getAttachments().addFiles(paths);
    if (!options.dryRunDirectory.isEmpty())
        writeCopiesTo(controller, options.dryRunDirectory);
    // Before the group is chosen, which leaves out whoever is in the sent list.
    if (const int mailed = controller.findInterruptedRun(); options.resume && mailed > 0)
        controller.restoreInterruptedRun();
    else if (mailed > 0)
        QTextStream(stderr) << "pelmo send: a run that did not finish had mailed " << mailed
                            << " recipients; --resume leaves them out\n";
    else if (options.resume)
        QTextStream(stderr) << "pelmo send: no run was left unfinished; mailing everyone\n";
    if (options.group.isEmpty())
        return true;
    const std::optional<Group> group = book.groupNamed(options.group);
    if (!group) {
        QTextStream(stderr) << "pelmo: the address book has no group \"" << options.group << "\"\n";
        return false;
    }
    controller.abGroupSelected({group->id}, true);
    return true;
}

// Runs the main loop until signal of sender comes.
template <class Sender, class Signal>
void waitFor(Sender* sender, Signal signal) {
    QObject::connect(sender, signal, [] { QCoreApplication::exit(0); });
    QCoreApplication::exec();
}

// Copy number copy on standard output, as it will be sent; 0 when it could be made.
int printCopy(PelmoController& controller, int copy) {
    CopyPreview* preview = controller.previewCopy(copy, &controller);
    waitFor(preview, &CopyPreview::finished);
    if (!preview->pageAddress().isEmpty())
        QTextStream(stderr) << "pelmo send: warning: could not download " << preview->pageAddress()
                            << ": " << preview->pageError() << '\n';
    if (preview->state() != CopyPreview::State::Ready) {
        QTextStream(stderr) << "pelmo send: " << preview->failure() << '\n';
        return 1;
    }
    QFile out;
    return out.open(stdout, QIODevice::WriteOnly) && out.write(preview->bytes()) ? 0 : 1;
}

// 0 when the server accepted the test copy.
int mailTest(PelmoController& controller, int copy) {
    bool accepted = false;
    QObject::connect(&controller, &PelmoController::testSettled,
                     [&accepted](bool answer) { accepted = answer; });
    QMetaObject::invokeMethod(
        &controller, [&controller, copy] { controller.sendTest(copy); }, Qt::QueuedConnection);
    waitFor(&controller, &PelmoController::testSettled);
    return accepted ? 0 : 1;
}

// Before a group run, what is worth a second look goes to standard error; with strict it
// stops the run before anyone is mailed. True when the run may go.
bool checkBeforeSend(PelmoController& controller, bool strict) {
    if (!controller.getPeople())
        return true;
    PreflightCheck* check = controller.checkBeforeSend(&controller);
    waitFor(check, &PreflightCheck::finished);
    for (const PreflightCheck::Finding& finding : check->findings())
        QTextStream(stderr) << "pelmo send: " << (strict ? "error: " : "warning: ") << finding.text
                            << '\n';
    return !strict || check->findings().isEmpty();
}

// 0 when the run completed with every copy accepted.
int runMailing(PelmoController& controller) {
    QObject::connect(&controller, &PelmoController::runSettled, [] { QCoreApplication::exit(0); });
    QMetaObject::invokeMethod(&controller, &PelmoController::send, Qt::QueuedConnection);
    QCoreApplication::exec();
    const MailingRun* run = controller.currentRun();
    return run && run->state() == MailingRun::State::Completed && run->everyCopyAccepted() ? 0 : 1;
}

} // namespace

int send(const QStringList& args) {
    if (args.contains(QLatin1String("--help"))) {
        QTextStream(stdout) << kUsage;
        return 0;
    }
    SendOptions options;
    try {
        options = parse(args);
    } catch (const UsageError& error) {
        QTextStream(stderr) << "pelmo send: " << error.message << '\n' << kUsage;
        return 2;
    }
    if (const QString problem = problemWith(options); !problem.isNull()) {
        QTextStream(stderr) << "pelmo send: " << problem << '\n';
        return 1;
    }
    return onConsole(
        "send", options.preview == 0, [&options](PelmoController& controller, AddressBook& book) {
            if (!prepare(controller, book, options))
                return 1;
            if (options.preview > 0)
                return printCopy(controller, options.preview);
            if (options.test > 0)
                return mailTest(controller, options.test);
            return checkBeforeSend(controller, options.strict) ? runMailing(controller) : 1;
        });
}

int onConsole(const char* command, bool startUp,
              const std::function<int(PelmoController&, AddressBook&)>& work) {
    try {
        ConsoleView view;
        AddressBook book;
        MailSettings settings;
        PasswordStore passwords;
        PelmoController controller(view, book, passwords, settings);
        if (startUp)
            controller.startUp();
        controller.applicationWillFinishLaunching();
        const int status = work(controller, book);
        controller.applicationWillTerminate();
        return status;
    } catch (const PelmoException& failure) {
        QTextStream(stderr) << "pelmo " << command << ": " << failure.reason() << '\n';
        return 1;
    }
}

} // namespace Commands
