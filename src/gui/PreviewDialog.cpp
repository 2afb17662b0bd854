#include "gui/PreviewDialog.h"

#include "controller/CopyPreview.h"
#include "controller/PelmoController.h"
#include "util/LocalizedStrings.h"

#include <QComboBox>
#include <QDialogButtonBox>
#include <QFileInfo>
#include <QFormLayout>
#include <QLabel>
#include <QListWidget>
#include <QLocale>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QSplitter>
#include <QTextBrowser>
#include <QVBoxLayout>

namespace {

// The body as a mail reader shows it, with nothing fetched from elsewhere: a remote picture
// would tell its server that the message was opened, before anyone was mailed.
class OfflineBrowser : public QTextBrowser {
public:
    QVariant loadResource(int, const QUrl&) override { return {}; }
};

// The header lines of message, named as they are on the wire, continuation lines joined, without
// those shown decoded above.
QString otherHeaders(const QByteArray& message) {
    const QByteArray head = message.left(message.indexOf("\r\n\r\n"));
    QStringList lines;
    for (const QByteArray& line : head.split('\n')) {
        const QString text = QString::fromUtf8(line).trimmed();
        if (!lines.isEmpty() && (line.startsWith(' ') || line.startsWith('\t')))
            lines.last() += QLatin1Char(' ') + text;
        else
            lines << text;
    }
    static const QStringList shown = {QStringLiteral("from:"), QStringLiteral("to:"),
                                      QStringLiteral("subject:")};
    lines.removeIf([](const QString& line) {
        for (const QString& name : shown)
            if (line.startsWith(name, Qt::CaseInsensitive))
                return true;
        return false;
    });
    return lines.join(QLatin1Char('\n'));
}

QString mailbox(const QString& name, const QString& address) {
    return name.isEmpty() ? address : name + QLatin1String(" <") + address + QLatin1Char('>');
}

} // namespace

PreviewDialog::PreviewDialog(PelmoController& controller, QWidget* parent)
    : QDialog(parent), m_controller(controller), m_member(new QComboBox),
      m_headers(new QPlainTextEdit), m_body(new OfflineBrowser), m_attachments(new QListWidget) {
    setWindowTitle(LocalizedStringNS("Preview"));
    m_member->setObjectName(QStringLiteral("previewMember"));
    m_headers->setObjectName(QStringLiteral("previewHeaders"));
    m_headers->setReadOnly(true);
    m_headers->setLineWrapMode(QPlainTextEdit::NoWrap);
    m_body->setObjectName(QStringLiteral("previewBody"));
    m_body->setOpenLinks(false);
    m_attachments->setObjectName(QStringLiteral("previewAttachments"));
    auto* layout = new QVBoxLayout(this);
    auto* form = new QFormLayout;
    form->addRow(LocalizedStringNS("Copy for:"), m_member);
    layout->addLayout(form);
    auto* splitter = new QSplitter(Qt::Vertical);
    splitter->addWidget(m_headers);
    splitter->addWidget(m_body);
    splitter->addWidget(m_attachments);
    splitter->setSizes({120, 320, 80});
    layout->addWidget(splitter, 1);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
    QPushButton* test =
        buttons->addButton(LocalizedStringNS("Send Test"), QDialogButtonBox::ActionRole);
    test->setObjectName(QStringLiteral("previewSendTest"));
    test->setToolTip(LocalizedStringNS("Mail this copy to your own address"));
    connect(test, &QPushButton::clicked, this,
            [this] { m_controller.sendTest(m_member->currentIndex() + 1); });
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    layout->addWidget(buttons);
    connect(m_member, &QComboBox::currentIndexChanged, this, &PreviewDialog::showCopy);
    resize(640, 560);
    reload();
}

void PreviewDialog::reload() {
    const QSignalBlocker quiet(m_member);
    m_member->clear();
    m_member->addItems(m_controller.copyChoices());
    showCopy(0);
}

void PreviewDialog::showCopy(int index) {
    if (m_preview)
        m_preview->deleteLater();
    m_preview = m_controller.previewCopy(index + 1, this);
    connect(m_preview, &CopyPreview::finished, this, &PreviewDialog::copyReady);
}

void PreviewDialog::copyReady() {
    CopyPreview* preview = qobject_cast<CopyPreview*>(sender());
    if (preview != m_preview)
        return;
    m_attachments->clear();
    if (preview->state() != CopyPreview::State::Ready) {
        m_headers->clear();
        m_body->setPlainText(preview->failure());
        return;
    }
    const DeliveryRequest& copy = preview->request();
    m_headers->setPlainText(QStringLiteral("From: %1\nTo: %2\nSubject: %3\n")
                                .arg(mailbox(copy.senderName, copy.sender),
                                     mailbox(copy.recipientName, copy.recipient), copy.subject) +
                            otherHeaders(preview->bytes()));
    QString html;
    for (const DeliveryRequest::BodyPart& part : copy.bodyParts) {
        if (!html.isEmpty())
            html += QLatin1String("<hr>");
        html += part.mimeType == QLatin1String("text/html")
                    ? part.text
                    : QLatin1String("<pre>") + part.text.toHtmlEscaped() + QLatin1String("</pre>");
    }
    if (!preview->pageAddress().isEmpty())
        html += QLatin1String("<hr><p>") +
                LocalizedStringNS("Could not download \"%1\"").arg(preview->pageAddress()) +
                QLatin1String("</p>");
    m_body->setHtml(html);
    if (copy.attachments.isEmpty())
        m_attachments->addItem(LocalizedStringNS("No attachments."));
    for (const QString& path : copy.attachments) {
        const QFileInfo file(path);
        m_attachments->addItem(
            file.isReadable()
                ? LocalizedStringNS("%1 (%2)").arg(file.fileName(),
                                                   QLocale().formattedDataSize(file.size()))
                : LocalizedStringNS("%1 (cannot be read: left out)").arg(file.fileName()));
    }
}
