#include "gui/MainWindow.h"

#include "attachments/AttachmentsController.h"
#include "controller/PelmoController.h"
#include "controller/PreflightCheck.h"
#include "controller/RecipientSelection.h"
#include "gui/AboutDialog.h"
#include "gui/AlertBox.h"
#include "gui/AttachmentsWindow.h"
#include "gui/FormattingToolBar.h"
#include "gui/HelpPage.h"
#include "gui/LogWindow.h"
#include "gui/PeoplePicker.h"
#include "gui/PreferencesDialog.h"
#include "gui/PreflightDialog.h"
#include "gui/PreviewDialog.h"
#include "gui/RecipientsWindow.h"
#include "gui/SoftwareUpdateWindow.h"
#include "gui/ToolWindows.h"
#include "update/SoftwareUpdateController.h"
#include "util/LocalizedStrings.h"
#include "util/TextUtilities.h"

#include <QAction>
#include <QApplication>
#include <QCloseEvent>
#include <QFormLayout>
#include <QHBoxLayout>
#include <QKeySequence>
#include <QLabel>
#include <QLineEdit>
#include <QMenuBar>
#include <QMessageBox>
#include <QMouseEvent>
#include <QProgressBar>
#include <QPushButton>
#include <QStyle>
#include <QTextEdit>
#include <QToolBar>
#include <QVBoxLayout>

namespace {

QLineEdit* lineEdit(const char* objectName, const char* placeholder) {
    auto* edit = new QLineEdit;
    edit->setObjectName(QLatin1String(objectName));
    edit->setPlaceholderText(LocalizedStringNS(placeholder));
    edit->setClearButtonEnabled(true);
    return edit;
}

// A themed icon where the desktop has one, else the style's stand-in.
QIcon icon(const char* themeName, QStyle::StandardPixmap fallback) {
    return QIcon::fromTheme(QLatin1String(themeName), qApp->style()->standardIcon(fallback));
}

} // namespace

MainWindow::MainWindow(AddressBook& addressBook, PasswordStore& passwords, MailSettings& settings,
                       QWidget* parent)
    : QMainWindow(parent), m_passwords(passwords), m_settings(settings) {
    setWindowTitle(LocalizedStringNS("Pelmo"));
    auto* central = new QWidget;
    auto* layout = new QVBoxLayout(central);
    layout->addWidget(createFields());
    layout->addWidget(createEditor(), 1);
    layout->addWidget(createSendRow());
    setCentralWidget(central);

    m_picker = new PeoplePicker(addressBook, this);
    showProgress();
    resize(860, 640);
}

void MainWindow::setController(PelmoController& controller) {
    m_controller = &controller;
    m_message->setDocument(controller.message());
    m_recipients = new RecipientsWindow(controller, this);
    // The window shows the controller's own list, which every message carries as it stands.
    m_attachmentsWindow = new AttachmentsWindow(controller.getAttachments(), this);
    reportEdits(m_to, PelmoView::Field::To);
    reportEdits(m_name, PelmoView::Field::Name);
    reportEdits(m_subject, PelmoView::Field::Subject);
    connect(m_sendButton, &QPushButton::clicked, this, &MainWindow::sendPressed);
    // Disabled while the browsers are asked, which takes at most a couple of seconds.
    connect(m_webPageButton, &QPushButton::clicked, &controller, [this] {
        m_webPageButton->setEnabled(false);
        m_controller->webPage();
    });
    connect(&controller, &PelmoController::webPageSettled, m_webPageButton,
            [this] { m_webPageButton->setEnabled(true); });
    createActions();
    connectPicker();
    connect(&controller.selection(), &RecipientSelection::summaryChanged, m_selectionSummary,
            [this] {
                const QString summary = m_controller->selection().summary();
                m_selectionSummary->setText(summary);
                m_selectionSummary->setVisible(!summary.isEmpty());
            });
    // Once a run is over, halted or stopped, a bar left at 1 of 3 would tell of work going on.
    connect(&controller, &PelmoController::runSettled, this, [this] {
        const MailingRun::State state = m_controller->currentRun()->state();
        if (state == MailingRun::State::Completed || state == MailingRun::State::Halted ||
            state == MailingRun::State::Stopped) {
            m_busy = true;
            m_animating = false;
            showProgress();
        }
    });
}

AttachmentsController& MainWindow::attachments() const {
    return m_controller->getAttachments();
}

MainWindow::~MainWindow() = default;

QWidget* MainWindow::createFields() {
    m_to = lineEdit("to", LocalizedKey("someone@example.org"));
    m_name = lineEdit("name", LocalizedKey("First Last"));
    m_subject = lineEdit("subject", LocalizedKey("What the message is about"));
    m_webPageOrFile =
        lineEdit("webPageOrFile", LocalizedKey("https://... (a page to mail with every copy)"));

    auto* fields = new QWidget;
    auto* form = new QFormLayout(fields);
    form->setContentsMargins(0, 0, 0, 0);
    form->setFieldGrowthPolicy(QFormLayout::AllNonFixedFieldsGrow);
    // What a chosen group means stands beside the field that shows its name.
    m_selectionSummary = new QLabel;
    m_selectionSummary->setObjectName(QStringLiteral("selectionSummary"));
    m_selectionSummary->hide();
    auto* to = new QHBoxLayout;
    to->addWidget(m_to, 1);
    to->addWidget(m_selectionSummary);
    form->addRow(LocalizedStringNS("Recipient Address:"), to);
    form->addRow(LocalizedStringNS("Recipients Name:"), m_name);
    form->addRow(LocalizedStringNS("Subject:"), m_subject);
    // The button beside the field fills it from the page the browser shows.
    m_webPageButton = new QPushButton(LocalizedStringNS("Web Page"));
    m_webPageButton->setObjectName(QStringLiteral("webPageButton"));
    m_webPageButton->setToolTip(
        LocalizedStringNS("Take the address and title of the page your web browser shows"));
    auto* page = new QHBoxLayout;
    page->addWidget(m_webPageOrFile, 1);
    page->addWidget(m_webPageButton);
    form->addRow(LocalizedStringNS("Web Page:"), page);
    return fields;
}

void MainWindow::reportEdits(QLineEdit* edit, PelmoView::Field field) {
    connect(edit, &QLineEdit::textEdited, m_controller,
            [this, field] { m_controller->textDidChange(field); });
}

QWidget* MainWindow::createEditor() {
    m_message = new QTextEdit;
    m_message->setObjectName(QStringLiteral("message"));
    m_message->setAcceptRichText(true);
    m_message->setPlaceholderText(
        LocalizedStringNS("Write the message here. {toName}, {to}, {fromName}, {from} and "
                          "{subject} become each copy's own values."));

    auto* editor = new QWidget;
    auto* layout = new QVBoxLayout(editor);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(2);
    layout->addWidget(new FormattingToolBar(m_message));
    layout->addWidget(m_message, 1);
    return editor;
}

QWidget* MainWindow::createSendRow() {
    m_status = new QLabel;
    m_status->setObjectName(QStringLiteral("status"));
    // A click shows the line in the activity log, among those before and after it.
    m_status->setCursor(Qt::PointingHandCursor);
    // A long status line is cut at the window's edge rather than widening the window.
    m_status->setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Preferred);
    m_status->installEventFilter(this);
    m_spinner = new QProgressBar;
    m_spinner->setObjectName(QStringLiteral("spinner"));
    m_spinner->setTextVisible(false);
    m_spinner->setFixedWidth(160);
    // Hidden while idle, without the status line and the button moving when it shows.
    QSizePolicy keepPlace = m_spinner->sizePolicy();
    keepPlace.setRetainSizeWhenHidden(true);
    m_spinner->setSizePolicy(keepPlace);
    m_sendButton = new QPushButton(LocalizedStringNS("Send"));
    m_sendButton->setObjectName(QStringLiteral("sendButton"));
    m_sendButton->setDefault(true);
    m_sendButton->setMinimumWidth(96);
    m_sendButton->setToolTip(LocalizedStringNS("Send the message (Ctrl+Return)"));

    auto* row = new QWidget;
    auto* layout = new QHBoxLayout(row);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(m_status, 1);
    layout->addWidget(m_spinner);
    layout->addWidget(m_sendButton);
    return row;
}

void MainWindow::createActions() {
    auto* preferences = new QAction(icon("preferences-system", QStyle::SP_FileDialogDetailedView),
                                    LocalizedStringNS("Preferences"), this);
    preferences->setObjectName(QStringLiteral("preferencesAction"));
    // Ctrl+, as most desktop applications have it; the platform's own key where it has one.
    preferences->setShortcuts({QKeySequence(Qt::CTRL | Qt::Key_Comma), QKeySequence::Preferences});
    connect(preferences, &QAction::triggered, this, &MainWindow::showPreferences);
    auto* addresses = new QAction(icon("x-office-address-book", QStyle::SP_DirHomeIcon),
                                  LocalizedStringNS("Addresses"), this);
    addresses->setObjectName(QStringLiteral("addressesAction"));
    connect(addresses, &QAction::triggered, this, &MainWindow::showPeoplePicker);
    auto* console = new QAction(icon("utilities-log-viewer", QStyle::SP_FileDialogContentsView),
                                LocalizedStringNS("Console"), this);
    console->setObjectName(QStringLiteral("consoleAction"));
    console->setToolTip(LocalizedStringNS("Show the activity log"));
    connect(console, &QAction::triggered, this, [this] { showLog(); });
    auto* attachments = new QAction(icon("mail-attachment", QStyle::SP_FileIcon),
                                    LocalizedStringNS("Attachments"), this);
    attachments->setObjectName(QStringLiteral("attachmentsAction"));
    connect(attachments, &QAction::triggered, this, &MainWindow::showAttachments);
    auto* recipients = new QAction(LocalizedStringNS("Sent Recipients"), this);
    connect(recipients, &QAction::triggered, this, &MainWindow::showRecipientsWindow);
    auto* makeDefault = new QAction(LocalizedStringNS("Make Pelmo the Default Mail Client"), this);
    makeDefault->setObjectName(QStringLiteral("makeDefaultMailClientAction"));
    connect(makeDefault, &QAction::triggered, m_controller,
            &PelmoController::makePelmoDefaultEmailer);
    auto* send = new QAction(LocalizedStringNS("Send"), this);
    send->setObjectName(QStringLiteral("sendAction"));
    send->setShortcut(QKeySequence(Qt::CTRL | Qt::Key_Return));
    connect(send, &QAction::triggered, m_sendButton, &QPushButton::click);
    auto* quit = new QAction(LocalizedStringNS("Quit"), this);
    quit->setObjectName(QStringLiteral("quitAction"));
    quit->setShortcut(QKeySequence::Quit);
    // Through the window's close, which asks before unsent text is lost.
    connect(quit, &QAction::triggered, this, [this] {
        if (close())
            QCoreApplication::quit();
    });

    auto* tools = addToolBar(LocalizedStringNS("Tools"));
    tools->setObjectName(QStringLiteral("tools"));
    tools->setMovable(false);
    tools->setToolButtonStyle(Qt::ToolButtonTextBesideIcon);
    tools->addActions({preferences, addresses, attachments, console});

    m_fileMenu = menuBar()->addMenu(LocalizedStringNS("&File"));
    m_fileMenu->addAction(preferences);
    m_fileMenu->addAction(makeDefault);
    m_fileMenu->addSeparator();
    auto* importContacts =
        m_fileMenu->addAction(LocalizedStringNS("Import Contacts…"), this, [this] {
            showPeoplePicker();
            m_picker->importContacts();
        });
    importContacts->setObjectName(QStringLiteral("importContactsAction"));
    auto* exportContacts =
        m_fileMenu->addAction(LocalizedStringNS("Export Contacts…"), this, [this] {
            showPeoplePicker();
            m_picker->exportContacts();
        });
    exportContacts->setObjectName(QStringLiteral("exportContactsAction"));
    m_fileMenu->addSeparator();
    m_fileMenu->addAction(quit);
    m_quitAction = quit;
    QMenu* message = menuBar()->addMenu(LocalizedStringNS("&Message"));
    message->addAction(send);
    message->addAction(LocalizedStringNS("Send Test"), this, [this] { m_controller->sendTest(1); })
        ->setObjectName(QStringLiteral("sendTestAction"));
    message->addAction(LocalizedStringNS("Preview…"), this, &MainWindow::showPreview)
        ->setObjectName(QStringLiteral("previewAction"));
    QMenu* window = menuBar()->addMenu(LocalizedStringNS("&Window"));
    window->addActions({addresses, attachments, recipients, console});
    QMenu* help = menuBar()->addMenu(LocalizedStringNS("&Help"));
    QAction* helpPage =
        help->addAction(LocalizedStringNS("Pelmo Help"), this, [this] { openHelp(this); });
    helpPage->setObjectName(QStringLiteral("helpAction"));
    helpPage->setShortcut(QKeySequence::HelpContents);
    help->addAction(LocalizedStringNS("About Pelmo"), this,
                    [this] { (new AboutDialog(this))->open(); })
        ->setObjectName(QStringLiteral("aboutAction"));
    help->addAction(LocalizedStringNS("About Qt"), qApp, &QApplication::aboutQt);
    for (QWidget* tool :
         {static_cast<QWidget*>(m_picker), static_cast<QWidget*>(m_attachmentsWindow),
          static_cast<QWidget*>(m_recipients)})
        closeOnEscape(tool);
}

QString MainWindow::draft() const {
    return m_subject->text() + QChar(0) + m_webPageOrFile->text() + QChar(0) +
           m_message->toPlainText();
}

void MainWindow::closeEvent(QCloseEvent* event) {
    // Text typed since the last Send is the user's work: it goes only when they say so.
    const QString now = draft();
    if (m_discarding || now == m_sentDraft || now == QString(2, QChar(0)))
        return QMainWindow::closeEvent(event);
    event->ignore();
    askThen(this, LocalizedStringNS("Discard this message?"), LocalizedStringNS("Discard"), [this] {
        m_discarding = true;
        if (close())
            QCoreApplication::quit();
    });
}

void MainWindow::checkThenSend() {
    if (m_preflight) // a second press while the first is being checked
        return;
    // The message may have been mended since: the findings shown are checked again.
    if (m_preflightDialog)
        m_preflightDialog->close();
    m_preflight = m_controller->checkBeforeSend(this);
    connect(m_preflight, &PreflightCheck::finished, this, [this] {
        PreflightCheck* check = m_preflight;
        check->deleteLater();
        m_preflight = nullptr;
        if (check->findings().isEmpty())
            return m_controller->send();
        QStringList texts;
        for (const PreflightCheck::Finding& finding : check->findings())
            texts << finding.text;
        m_preflightDialog = new PreflightDialog(texts, this);
        connect(m_preflightDialog, &QDialog::accepted, m_controller, &PelmoController::send);
        // Not modal: the user may look at the message, or mend it, while the list is shown.
        m_preflightDialog->show();
    });
}

void MainWindow::showPreview() {
    if (!m_preview)
        m_preview = new PreviewDialog(*m_controller, this);
    else
        m_preview->reload();
    m_preview->show();
    m_preview->raise();
    m_preview->activateWindow();
}

void MainWindow::sendPressed() {
    // Stop, and a group's run, go at once: the checks are for the one copy typed in the fields.
    if (m_sendButton->text() == LocalizedStringNS("Send"))
        m_sentDraft = draft();
    if (m_sendButton->text() != LocalizedStringNS("Send"))
        return m_controller->send();
    if (m_controller->getPeople())
        return checkThenSend();
    const QString to = m_to->text().trimmed();
    if (!IsAddrSpec(to)) {
        beep();
        return alert(LocalizedStringNS("The recipient address is not an e-mail address"),
                     LocalizedStringNS("\"%1\" cannot be mailed. Type an address such as "
                                       "name@example.org, or choose a person or a group in "
                                       "Addresses.")
                         .arg(to));
    }
    const auto send = [this] { m_controller->send(); };
    const auto subjectThenSend = [this, send] {
        if (m_subject->text().trimmed().isEmpty())
            askThen(this, LocalizedStringNS("Send without a subject?"), LocalizedStringNS("Send"),
                    send);
        else
            send();
    };
    if (m_controller->recipientsContains(to))
        askThen(this,
                LocalizedStringNS("%1 was already mailed in this session. Send again?").arg(to),
                LocalizedStringNS("Send Again"), subjectThenSend);
    else
        subjectThenSend();
}

void MainWindow::setSoftwareUpdate(SoftwareUpdateController& updates) {
    auto* open = new QAction(LocalizedStringNS("Software Update…"), this);
    open->setObjectName(QStringLiteral("softwareUpdateAction"));
    connect(open, &QAction::triggered, this, [this, &updates] {
        if (!m_softwareUpdateWindow) {
            m_softwareUpdateWindow = new SoftwareUpdateWindow(updates, this);
            closeOnEscape(m_softwareUpdateWindow);
        }
        bringToFront(m_softwareUpdateWindow);
    });
    m_fileMenu->insertAction(
        m_fileMenu->actions().at(m_fileMenu->actions().indexOf(m_quitAction) - 1), open);
    connect(&updates, &SoftwareUpdateController::updateAvailable, m_controller,
            &PelmoController::doAlert);
}

void MainWindow::connectPicker() {
    PelmoController* controller = m_controller;
    connect(m_picker, &PeoplePicker::groupSelectionChanged, controller,
            &PelmoController::abGroupSelected);
    for (auto signal : {&PeoplePicker::nameSelectionChanged, &PeoplePicker::valueSelectionChanged,
                        &PeoplePicker::displayedPropertyChanged})
        connect(m_picker, signal, controller, &PelmoController::abRecordSelected);
}

QString MainWindow::subject() const {
    return m_subject->text();
}

void MainWindow::setSubject(const QString& text) {
    m_subject->setText(text);
}

QString MainWindow::to() const {
    return m_to->text();
}

void MainWindow::setTo(const QString& text) {
    m_to->setText(text);
}

QString MainWindow::name() const {
    return m_name->text();
}

void MainWindow::setName(const QString& text) {
    m_name->setText(text);
}

QString MainWindow::webPageOrFile() const {
    return m_webPageOrFile->text();
}

void MainWindow::setWebPageOrFile(const QString& text) {
    m_webPageOrFile->setText(text);
}

void MainWindow::setStatus(const QString& text) {
    m_statusText = text;
    m_status->setToolTip(text);
    showStatus();
}

// A status longer than the line ends in "…"; its tooltip holds the whole of it.
void MainWindow::showStatus() {
    m_status->setText(
        m_status->fontMetrics().elidedText(m_statusText, Qt::ElideRight, m_status->width()));
}

void MainWindow::showLog(const QString& line) {
    if (!m_logWindow)
        m_logWindow = new LogWindow(*m_controller, this);
    m_logWindow->showLog(line);
}

bool MainWindow::eventFilter(QObject* watched, QEvent* event) {
    if (watched == m_status && event->type() == QEvent::Resize)
        showStatus();
    if (watched == m_status && event->type() == QEvent::MouseButtonRelease &&
        static_cast<QMouseEvent*>(event)->button() == Qt::LeftButton)
        showLog(m_statusText);
    return QMainWindow::eventFilter(watched, event);
}

void MainWindow::setProgressCounting(double minimum, double maximum, double value) {
    m_busy = false;
    m_minimum = minimum;
    m_maximum = maximum;
    m_value = value;
    showProgress();
}

void MainWindow::setProgressBusy() {
    m_busy = true;
    showProgress();
}

void MainWindow::setProgressValue(double value) {
    m_value = value;
    showProgress();
}

double MainWindow::progressMaximum() const {
    return m_maximum;
}

void MainWindow::startProgressAnimation() {
    m_animating = true;
    showProgress();
}

void MainWindow::stopProgressAnimation() {
    m_animating = false;
    showProgress();
}

// QProgressBar animates whenever its range is empty, so a busy bar that is not animating is an
// empty, still bar; like a stopped spinner, it is not shown.
void MainWindow::showProgress() {
    m_spinner->setVisible(!m_busy || m_animating);
    if (!m_busy) {
        m_spinner->setRange(qRound(m_minimum), qRound(m_maximum));
        m_spinner->setValue(qRound(m_value));
    } else if (m_animating) {
        m_spinner->setRange(0, 0);
    } else {
        m_spinner->setRange(0, 1);
        m_spinner->setValue(0);
    }
}

QString MainWindow::sendButtonTitle() const {
    return m_sendButton->text();
}

void MainWindow::setSendButtonTitle(const QString& title) {
    m_sendButton->setText(title);
}

void MainWindow::showRecipientsWindow() {
    bringToFront(m_recipients);
}

void MainWindow::alert(const QString& title, const QString& informativeText) {
    openAlert(this, title, informativeText);
}

void MainWindow::beep() {
    QApplication::beep();
}

void MainWindow::offerInterruptedRun(int mailed) {
    auto* box =
        new QMessageBox(QMessageBox::Question, windowTitle(),
                        LocalizedStringNS("Pelmo stopped unexpectedly during a mailing run."),
                        QMessageBox::NoButton, this);
    box->setObjectName(QStringLiteral("interruptedRun"));
    box->setInformativeText(
        (mailed == 1
             ? LocalizedStringNS("1 recipient of that run was mailed already.")
             : LocalizedStringNS("%1 recipients of that run were mailed already.").arg(mailed)) +
        QLatin1Char(' ') +
        LocalizedStringNS("Restore them to the Sent Recipients list, so that Send mails only "
                          "those not yet mailed?"));
    QPushButton* restore = box->addButton(LocalizedStringNS("Restore"), QMessageBox::AcceptRole);
    QPushButton* forget = box->addButton(LocalizedStringNS("Forget"), QMessageBox::DestructiveRole);
    box->setDefaultButton(restore);
    box->setWindowModality(Qt::WindowModal);
    box->setAttribute(Qt::WA_DeleteOnClose);
    connect(box, &QMessageBox::finished, this, [this, box, restore, forget] {
        if (box->clickedButton() == restore)
            m_controller->restoreInterruptedRun();
        else if (box->clickedButton() == forget)
            m_controller->discardInterruptedRun();
    });
    box->open();
}

void MainWindow::showPeoplePicker() {
    bringToFront(m_picker);
}

void MainWindow::showAttachments() {
    bringToFront(m_attachmentsWindow);
}

void MainWindow::showPreferences() {
    if (!m_preferences) {
        m_preferences = new PreferencesDialog(m_passwords, m_settings, this);
        connect(m_preferences, &PreferencesDialog::makeDefaultMailClientAsked, m_controller,
                &PelmoController::makePelmoDefaultEmailer);
    }
    m_preferences->load();
    m_preferences->open();
}
