#include "gui/RecipientsWindow.h"

#include "controller/PelmoController.h"
#include "gui/RecipientsModel.h"
#include "util/LocalizedStrings.h"

#include <QHBoxLayout>
#include <QHeaderView>
#include <QPushButton>
#include <QTableView>
#include <QVBoxLayout>

RecipientsWindow::RecipientsWindow(PelmoController& controller, QWidget* parent)
    : QWidget(parent, Qt::Window), m_model(new RecipientsModel(controller, this)),
      m_table(new QTableView) {
    setWindowTitle(LocalizedStringNS("Sent Recipients"));
    // Closing it while the main window stays open must not end the application.
    setAttribute(Qt::WA_QuitOnClose, false);
    m_table->setObjectName(QStringLiteral("recipientsTableView"));
    m_table->setModel(m_model);
    m_table->verticalHeader()->hide();
    m_table->horizontalHeader()->setStretchLastSection(true);
    m_table->horizontalHeader()->setSectionResizeMode(0, QHeaderView::ResizeToContents);
    m_table->setSelectionBehavior(QAbstractItemView::SelectRows);
    m_table->setEditTriggers(QAbstractItemView::NoEditTriggers);
    m_table->setAlternatingRowColors(true);

    auto* reset = new QPushButton(LocalizedStringNS("Reset"));
    reset->setObjectName(QStringLiteral("resetButton"));
    reset->setToolTip(LocalizedStringNS("Forget who was mailed, so that they can be mailed again"));
    connect(reset, &QPushButton::clicked, &controller, &PelmoController::resetRecipients);

    auto* buttons = new QHBoxLayout;
    buttons->addStretch(1);
    buttons->addWidget(reset);
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(m_table, 1);
    layout->addLayout(buttons);
    resize(360, 420);
}

void RecipientsWindow::reload() {
    m_model->reload();
    m_table->scrollToBottom();
}
