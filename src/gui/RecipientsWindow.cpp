#include "gui/RecipientsWindow.h"

#include "controller/NotMailedRecipients.h"
#include "controller/PelmoController.h"
#include "controller/SentRecipients.h"
#include "gui/AlertBox.h"
#include "util/LocalizedStrings.h"

#include <QHBoxLayout>
#include <QHeaderView>
#include <QLabel>
#include <QPushButton>
#include <QSplitter>
#include <QTableView>
#include <QVBoxLayout>

namespace {

QTableView* tableOf(const char* objectName, QAbstractItemModel* model) {
    auto* view = new QTableView;
    view->setObjectName(QLatin1String(objectName));
    view->setModel(model);
    view->horizontalHeader()->setStretchLastSection(true);
    view->setSelectionBehavior(QAbstractItemView::SelectRows);
    view->setEditTriggers(QAbstractItemView::NoEditTriggers);
    view->setAlternatingRowColors(true);
    QObject::connect(model, &QAbstractItemModel::rowsInserted, view, &QTableView::scrollToBottom);
    return view;
}

QWidget* pane(const QString& title, QTableView* table, QPushButton* button) {
    auto* heading = new QLabel(title);
    heading->setBuddy(table);
    QFont bold = heading->font();
    bold.setBold(true);
    heading->setFont(bold);
    auto* buttons = new QHBoxLayout;
    buttons->addStretch(1);
    buttons->addWidget(button);
    auto* made = new QWidget;
    auto* layout = new QVBoxLayout(made);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(heading);
    layout->addWidget(table, 1);
    layout->addLayout(buttons);
    return made;
}

} // namespace

RecipientsWindow::RecipientsWindow(PelmoController& controller, QWidget* parent)
    : QWidget(parent, Qt::Window) {
    setWindowTitle(LocalizedStringNS("Sent Recipients"));
    // Closing it while the main window stays open must not end the application.
    setAttribute(Qt::WA_QuitOnClose, false);
    auto* splitter = new QSplitter(Qt::Vertical);
    splitter->setChildrenCollapsible(false);
    splitter->addWidget(createSentPane(controller));
    splitter->addWidget(createNotMailedPane(controller));
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(splitter);
    resize(760, 520);
}

QWidget* RecipientsWindow::createSentPane(PelmoController& controller) {
    SentRecipients& recipients = controller.sentRecipients();
    m_table = tableOf("recipientsTableView", &recipients);
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
    return pane(LocalizedStringNS("&Mailed"), m_table, reset);
}

QWidget* RecipientsWindow::createNotMailedPane(PelmoController& controller) {
    NotMailedRecipients& notMailed = controller.notMailedRecipients();
    m_notMailed = tableOf("notMailedTableView", &notMailed);
    m_notMailed->verticalHeader()->hide();
    // The reason takes what the name, the address and the time leave.
    QHeaderView* header = m_notMailed->horizontalHeader();
    header->setSectionResizeMode(NotMailedRecipients::Reason, QHeaderView::Stretch);
    header->setStretchLastSection(false);
    connect(&notMailed, &QAbstractItemModel::rowsInserted, m_notMailed, [this] {
        for (const int column :
             {NotMailedRecipients::Name, NotMailedRecipients::Address, NotMailedRecipients::Time})
            m_notMailed->resizeColumnToContents(column);
    });
    auto* putBack = new QPushButton(LocalizedStringNS("Put Back"));
    putBack->setObjectName(QStringLiteral("putBackButton"));
    putBack->setToolTip(LocalizedStringNS("Mail the selected persons, or all of them when none "
                                          "is selected, first at the next Send"));
    putBack->setEnabled(false);
    const auto enable = [putBack, &notMailed] { putBack->setEnabled(notMailed.rowCount() > 0); };
    for (auto signal : {&QAbstractItemModel::rowsInserted, &QAbstractItemModel::rowsRemoved})
        connect(&notMailed, signal, putBack, enable);
    connect(&notMailed, &QAbstractItemModel::modelReset, putBack, enable);
    connect(putBack, &QPushButton::clicked, &controller, [this, &controller] {
        QList<int> rows;
        for (const QModelIndex& index : m_notMailed->selectionModel()->selectedRows())
            rows << index.row();
        controller.putBackNotMailed(rows);
    });
    return pane(LocalizedStringNS("&Not mailed"), m_notMailed, putBack);
}
