#include "controller/CopyPreview.h"

#include "attachments/AttachmentsController.h"
#include "browser/PageDownload.h"
#include "controller/MailSettings.h"
#include "controller/MailingRun.h"
#include "controller/MessageTemplate.h"
#include "controller/PelmoView.h"
#include "controller/RecipientSelection.h"
#include "util/InBackground.h"
#include "util/LocalizedStrings.h"

#include <chrono>
#include <optional>

CopyPreview::CopyPreview(const Parts& parts, QObject* parent) : QObject(parent), m_parts(parts) {}

CopyPreview::~CopyPreview() = default;

QStringList CopyPreview::choices(PelmoView& view, const RecipientSelection& selection) {
    const auto label = [](const QString& name, const QString& address) {
        return name + QLatin1String(" <") + address + QLatin1Char('>');
    };
    if (!selection.getPeople())
        return {label(view.name(), view.to())};
    QStringList all;
    for (const Person& person : *selection.getPeople())
        all << label(RecipientSelection::firstAndLastName(person), person.primaryEmail());
    return all;
}

void CopyPreview::start(int copy) {
    m_copy = copy;
    const QString typed = m_parts.view.webPageOrFile();
    const QString address = typed.toLower();
    if (!address.startsWith(QLatin1String("http://")) &&
        !address.startsWith(QLatin1String("https://"))) {
        QMetaObject::invokeMethod(this, &CopyPreview::build, Qt::QueuedConnection);
        return;
    }
    m_state = State::PreparingPage;
    // Fetched as a run fetches it; a page that keeps the preview waiting is reported instead.
    m_download = new PageDownload(this);
    connect(m_download, &PageDownload::finished, this,
            [this, typed, address](const QString& page, const QString& error) {
                m_download->deleteLater();
                if (page.isNull()) {
                    m_failedPage = address;
                    m_pageError = error;
                } else {
                    m_page = MailingRun::relinkedPage(page, typed);
                }
                build();
            });
    m_download->start(address, std::chrono::seconds(10));
}

void CopyPreview::build() {
    MessageTemplate& message = m_parts.message;
    if (const auto& people = m_parts.selection.getPeople()) {
        if (m_copy < 1 || m_copy > people->size())
            return fail(LocalizedStringNS("There is no copy %1: %2 members are to be mailed.")
                            .arg(m_copy)
                            .arg(people->size()));
        const Person& person = people->at(m_copy - 1);
        if (person.emails.isEmpty())
            return fail(LocalizedStringNS("No e-mail address."));
        message.setRecipient(RecipientSelection::firstAndLastName(person), person.primaryEmail());
    } else if (m_copy != 1) {
        return fail(LocalizedStringNS("There is no copy %1: one copy goes to the Recipient "
                                      "Address.")
                        .arg(m_copy));
    }
    // The run's page, if one is under way, is this copy's only for the time of the call.
    const QString runPage = message.page();
    message.setPage(m_page);
    std::optional<PelmoException> failure;
    try {
        m_request = MailingRun::requestFor(
            message, m_parts.settings, m_parts.attachments, [](const DeliveryRequest&) {}, false);
    } catch (const PelmoException& missing) {
        failure = missing;
    }
    message.setPage(runPage);
    message.clearRecipient();
    if (failure)
        return fail(failure->statusText());
    // A large attachment takes a while to encode: the window goes on meanwhile.
    m_state = State::Building;
    connect(&m_building, &QFutureWatcherBase::finished, this, &CopyPreview::built);
    m_building.setFuture(
        InBackground<SMTP::Built>([request = m_request] { return SMTP::build(request); }));
}

void CopyPreview::built() {
    const SMTP::Built copy = m_building.result();
    if (copy.failure)
        return fail(copy.failure->statusText());
    m_bytes = copy.bytes;
    m_state = State::Ready;
    Q_EMIT finished();
}

void CopyPreview::fail(const QString& why) {
    m_failure = why;
    m_state = State::Failed;
    Q_EMIT finished();
}
