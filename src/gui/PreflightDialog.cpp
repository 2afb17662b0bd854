#include "gui/PreflightDialog.h"

#include "util/LocalizedStrings.h"

#include <QDialogButtonBox>
#include <QLabel>
#include <QListWidget>
#include <QPushButton>
#include <QVBoxLayout>

PreflightDialog::PreflightDialog(const QStringList& findings, QWidget* parent) : QDialog(parent) {
    setAttribute(Qt::WA_DeleteOnClose);
    setWindowTitle(LocalizedStringNS("Before Sending"));
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(new QLabel(LocalizedStringNS("Look at these before the group is mailed:")));
    auto* list = new QListWidget;
    list->setObjectName(QStringLiteral("preflightFindings"));
    list->setWordWrap(true);
    list->addItems(findings);
    layout->addWidget(list);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Cancel);
    QPushButton* anyway =
        buttons->addButton(LocalizedStringNS("Send Anyway"), QDialogButtonBox::AcceptRole);
    anyway->setObjectName(QStringLiteral("sendAnyway"));
    // Mending the message is the likelier wish: Cancel is the default.
    buttons->button(QDialogButtonBox::Cancel)->setDefault(true);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    layout->addWidget(buttons);
    resize(560, 300);
}
