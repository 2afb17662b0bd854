#include "gui/PersonDialog.h"

#include "addressbook/AddressBook.h"
#include "gui/AlertBox.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"

#include <QButtonGroup>
#include <QDialogButtonBox>
#include <QFormLayout>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLineEdit>
#include <QListWidget>
#include <QPushButton>
#include <QRadioButton>
#include <QSet>
#include <QTableWidget>
#include <QVBoxLayout>

namespace {

constexpr int kIdRole = Qt::UserRole;

// A missing name part is null, as the address book keeps it.
QString nameOrNull(const QLineEdit* edit) {
    const QString text = edit->text().trimmed();
    return text.isEmpty() ? QString() : text;
}

} // namespace

PersonDialog::PersonDialog(AddressBook& addressBook, const Person& person, qint64 joinGroup,
                           QWidget* parent)
    : QDialog(parent), m_book(addressBook), m_person(person), m_firstName(new QLineEdit),
      m_lastName(new QLineEdit) {
    setWindowTitle(person.id == 0 ? LocalizedStringNS("New Person")
                                  : LocalizedStringNS("Edit Person"));
    setAttribute(Qt::WA_DeleteOnClose);
    setWindowModality(Qt::WindowModal);
    m_firstName->setObjectName(QStringLiteral("firstName"));
    m_firstName->setText(person.firstName);
    m_lastName->setObjectName(QStringLiteral("lastName"));
    m_lastName->setText(person.lastName);

    auto* form = new QFormLayout;
    form->addRow(LocalizedStringNS("First name:"), m_firstName);
    form->addRow(LocalizedStringNS("Last name:"), m_lastName);
    form->addRow(LocalizedStringNS("Email addresses:"), createAddresses());
    form->addRow(LocalizedStringNS("Groups:"), createGroups(joinGroup));
    for (int i = 0; i < person.emails.size(); ++i)
        addAddress(person.emails.at(i));
    if (QAbstractButton* primary = m_primary->button(person.primary))
        primary->setChecked(true);

    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
    connect(buttons, &QDialogButtonBox::accepted, this, &PersonDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &PersonDialog::reject);
    auto* layout = new QVBoxLayout(this);
    layout->addLayout(form);
    layout->addWidget(buttons);
    resize(460, 420);
}

QWidget* PersonDialog::createAddresses() {
    m_addresses = new QTableWidget(0, 2);
    m_addresses->setObjectName(QStringLiteral("addresses"));
    m_addresses->setHorizontalHeaderLabels(
        {LocalizedStringNS("Primary"), LocalizedStringNS("Address")});
    m_addresses->verticalHeader()->hide();
    m_addresses->horizontalHeader()->setSectionResizeMode(0, QHeaderView::ResizeToContents);
    m_addresses->horizontalHeader()->setStretchLastSection(true);
    m_addresses->setSelectionBehavior(QAbstractItemView::SelectRows);
    m_primary = new QButtonGroup(this);

    auto* add = new QPushButton(LocalizedStringNS("Add Address"));
    add->setObjectName(QStringLiteral("addAddress"));
    add->setAutoDefault(false);
    connect(add, &QPushButton::clicked, this, [this] { addAddress(); });
    auto* remove = new QPushButton(LocalizedStringNS("Remove Address"));
    remove->setAutoDefault(false);
    connect(remove, &QPushButton::clicked, this, &PersonDialog::removeAddress);

    auto* buttons = new QHBoxLayout;
    buttons->addWidget(add);
    buttons->addWidget(remove);
    buttons->addStretch(1);
    auto* box = new QWidget;
    auto* layout = new QVBoxLayout(box);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(m_addresses);
    layout->addLayout(buttons);
    return box;
}

QWidget* PersonDialog::createGroups(qint64 joinGroup) {
    m_groups = new QListWidget;
    m_groups->setObjectName(QStringLiteral("groups"));
    QSet<qint64> member;
    if (m_person.id != 0) {
        for (const Group& group : m_book.groupsOf(m_person.id))
            member.insert(group.id);
    } else if (joinGroup != 0) {
        member.insert(joinGroup);
    }
    for (const Group& group : m_book.groups()) {
        auto* item = new QListWidgetItem(group.name, m_groups);
        item->setData(kIdRole, group.id);
        item->setFlags(Qt::ItemIsEnabled | Qt::ItemIsUserCheckable);
        item->setCheckState(member.contains(group.id) ? Qt::Checked : Qt::Unchecked);
    }
    m_groups->setMaximumHeight(120);
    return m_groups;
}

void PersonDialog::addAddress(const QString& address) {
    const int row = m_addresses->rowCount();
    m_addresses->insertRow(row);
    auto* primary = new QRadioButton;
    primary->setToolTip(LocalizedStringNS("Mail this address"));
    m_primary->addButton(primary, row);
    m_addresses->setCellWidget(row, 0, primary);
    m_addresses->setItem(row, 1, new QTableWidgetItem(address));
    if (row == 0)
        primary->setChecked(true);
    if (address.isEmpty())
        m_addresses->editItem(m_addresses->item(row, 1));
}

void PersonDialog::removeAddress() {
    const int row = m_addresses->currentRow();
    if (row < 0)
        return;
    const bool wasPrimary = m_primary->checkedId() == row;
    m_addresses->removeRow(row);
    // The buttons are numbered by row: number them again.
    for (QAbstractButton* button : m_primary->buttons())
        m_primary->removeButton(button);
    for (int i = 0; i < m_addresses->rowCount(); ++i)
        m_primary->addButton(static_cast<QAbstractButton*>(m_addresses->cellWidget(i, 0)), i);
    if (wasPrimary && m_addresses->rowCount() > 0)
        m_primary->button(0)->setChecked(true);
}

Person PersonDialog::person() const {
    Person described;
    described.id = m_person.id;
    described.firstName = nameOrNull(m_firstName);
    described.lastName = nameOrNull(m_lastName);
    for (int row = 0; row < m_addresses->rowCount(); ++row) {
        const QTableWidgetItem* item = m_addresses->item(row, 1);
        const QString address = item ? item->text().trimmed() : QString();
        if (address.isEmpty())
            continue;
        if (row == m_primary->checkedId() || described.primary < 0)
            described.primary = static_cast<int>(described.emails.size());
        described.emails << address;
    }
    return described;
}

QList<qint64> PersonDialog::checkedGroups() const {
    QList<qint64> ids;
    for (int row = 0; row < m_groups->count(); ++row) {
        const QListWidgetItem* item = m_groups->item(row);
        if (item->checkState() == Qt::Checked)
            ids << item->data(kIdRole).toLongLong();
    }
    return ids;
}

void PersonDialog::accept() {
    try {
        save();
    } catch (const PelmoException& failure) {
        openAlert(this, LocalizedStringNS("The person was not saved."), failure.reason());
        return;
    }
    Q_EMIT saved(m_person.id);
    QDialog::accept();
}

void PersonDialog::save() {
    Person edited = person();
    if (edited.id == 0) {
        // Known from here on, so that a second OK after a refused membership updates it.
        m_person.id = m_book.addPerson(edited);
    } else {
        m_book.updatePerson(edited);
    }
    QSet<qint64> before;
    for (const Group& group : m_book.groupsOf(m_person.id))
        before.insert(group.id);
    const QList<qint64> after = checkedGroups();
    for (const qint64 group : after) {
        if (!before.contains(group))
            m_book.addMember(group, m_person.id);
    }
    for (const qint64 group : std::as_const(before)) {
        if (!after.contains(group))
            m_book.removeMember(group, m_person.id);
    }
}
