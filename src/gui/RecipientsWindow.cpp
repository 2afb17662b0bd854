#include "gui/RecipientsWindow.h"

#include "controller/SentRecipients.h"
#include "gui/AlertBox.h"
#include "util/LocalizedStrings.h"

#include <QHBoxLayout>
#include <QHeaderView>
#include <QPushButton>
#include <QTableView>
#include <QVBoxLayout>

RecipientsWindow::RecipientsWindow(SentRecipients& recipients, QWidget* parent)
    : QWidget(parent, Qt::Window), m_table(new QTableView) {
    setWindowTitle(LocalizedStringNS("Sent Recipients"));
    // Closing it while the main window stays open must not end the application.
    setAttribute(Qt::WA_QuitOnClose, false);
    m_table->setObjectName(QStringLiteral("recipientsTableView"));
    m_table->setModel(&recipients);
    m_table->horizontalHeader()->setStretchLastSection(true);
    m_table->setSelectionBehavior(QAbstractItemView::SelectRows);
    m_table->setEditTriggers(QAbstractItemView::NoEditTriggers);
    m_table->setAlternatingRowColors(true);
    connect(&recipients, &SentRecipients::rowsInserted, m_table, &QTableView::scrollToBottom);

    auto* reset = new QPushButton(LocalizedStringNS("Reset"));
    reset->setObjectName(QStringLiteral("resetButton"));
    reset->setToolTip(LocalizedStringNS("Forget who was mailed, so that they can be mailed again"));
    // Those forgotten may be mailed again, so the list does not go without a question.
    connect(reset, &QPushButton::clicked, this, [this, &recipients] {
        const int count = recipients.rowCount();
        if (count == 0)
            return;
        askThen(this,
                count == 1 ? LocalizedStringNS("Forget the 1 sent recipient? They may be mailed "
                                               "again.")
                           : LocalizedStringNS("Forget the %1 sent recipients? They may be mailed "
                                               "again.")
                                 .arg(count),
                LocalizedStringNS("Forget"), [&recipients] { recipients.resetRecipients(); });
    });

    auto* buttons = new QHBoxLayout;
    buttons->addStretch(1);
    buttons->addWidget(reset);
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(m_table, 1);
    layout->addLayout(buttons);
    resize(360, 420);
}
