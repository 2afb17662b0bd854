#include "gui/AttachmentsWindow.h"

#include "attachments/AttachmentsController.h"
#include "gui/AlertBox.h"
#include "gui/AttachmentsModel.h"
#include "util/LocalizedStrings.h"

#include <QFileDialog>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLabel>
#include <QPushButton>
#include <QTableView>
#include <QVBoxLayout>

AttachmentsWindow::AttachmentsWindow(AttachmentsController& controller, QWidget* parent)
    : QWidget(parent, Qt::Window), m_controller(controller),
      m_model(new AttachmentsModel(controller, this)), m_table(new QTableView) {
    setWindowTitle(LocalizedStringNS("Attachments"));
    setAttribute(Qt::WA_QuitOnClose, false);
    m_table->setObjectName(QStringLiteral("attachmentsTable"));
    m_table->setModel(m_model);
    m_table->verticalHeader()->hide();
    m_table->horizontalHeader()->setStretchLastSection(true);
    m_table->setSelectionBehavior(QAbstractItemView::SelectRows);
    m_table->setEditTriggers(QAbstractItemView::NoEditTriggers);
    m_table->setShowGrid(false);
    m_table->setDragDropMode(QAbstractItemView::DragDrop);
    m_table->setDragDropOverwriteMode(false);
    m_table->setDropIndicatorShown(true);
    m_table->setDefaultDropAction(Qt::MoveAction);
    connect(m_table, &QTableView::doubleClicked, this, &AttachmentsWindow::open);

    auto* hint = new QLabel(LocalizedStringNS(
        "Drop files here from the file manager; drag a row to change the order. Every "
        "message carries these files."));
    hint->setWordWrap(true);
    auto* add = new QPushButton(LocalizedStringNS("Add Files..."));
    add->setObjectName(QStringLiteral("addFiles"));
    connect(add, &QPushButton::clicked, this, &AttachmentsWindow::addFiles);
    auto* remove = new QPushButton(LocalizedStringNS("Remove"));
    remove->setObjectName(QStringLiteral("deleteButton"));
    remove->setToolTip(LocalizedStringNS("Remove the selected files; with none selected, remove "
                                         "every file"));
    connect(remove, &QPushButton::clicked, this, &AttachmentsWindow::removeClicked);

    auto* buttons = new QHBoxLayout;
    buttons->addWidget(add);
    buttons->addStretch(1);
    buttons->addWidget(remove);
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(hint);
    layout->addWidget(m_table, 1);
    layout->addLayout(buttons);
    resize(520, 360);
}

void AttachmentsWindow::removeClicked() {
    QList<int> rows;
    for (const QModelIndex& index : m_table->selectionModel()->selectedRows())
        rows << index.row();
    m_controller.deleteButtonClicked(rows);
}

// Files chosen in a dialog go below the last row, in the order chosen.
void AttachmentsWindow::addFiles() {
    auto* dialog = new QFileDialog(this, LocalizedStringNS("Add Files"));
    dialog->setFileMode(QFileDialog::ExistingFiles);
    dialog->setAttribute(Qt::WA_DeleteOnClose);
    connect(dialog, &QFileDialog::filesSelected, &m_controller, &AttachmentsController::addFiles);
    dialog->open();
}

void AttachmentsWindow::open(const QModelIndex& index) {
    if (m_controller.openAttachment(index.row()))
        return;
    openAlert(this, LocalizedStringNS("The file could not be opened."),
              LocalizedStringNS("No application on this desktop took \"%1\".")
                  .arg(m_controller.getAttachments().value(index.row())));
}
