#include "gui/PeoplePicker.h"

#include "addressbook/AddressBook.h"
#include "addressbook/PersonFilter.h"
#include "gui/AlertBox.h"
#include "gui/ContactFiles.h"
#include "gui/PersonDialog.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"

#include <QCollator>
#include <QDragEnterEvent>
#include <QDropEvent>
#include <QEvent>
#include <QFileSystemWatcher>
#include <QHBoxLayout>
#include <QInputDialog>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QMenu>
#include <QMessageBox>
#include <QMimeData>
#include <QPushButton>
#include <QSet>
#include <QSignalBlocker>
#include <QSplitter>
#include <QTimer>
#include <QVBoxLayout>

#include <algorithm>

namespace {

constexpr int kIdRole = Qt::UserRole;

QList<qint64> selectedIds(const QListWidget* list) {
    QList<qint64> ids;
    // selectedItems() follows the order of selecting; the picker's order is the list's.
    for (int row = 0; row < list->count(); ++row) {
        const QListWidgetItem* item = list->item(row);
        if (item->isSelected() && item->data(kIdRole).isValid())
            ids << item->data(kIdRole).toLongLong();
    }
    return ids;
}

QListWidgetItem* itemWithId(QListWidget* list, qint64 id) {
    for (int row = 0; row < list->count(); ++row) {
        QListWidgetItem* item = list->item(row);
        if (item->data(kIdRole).isValid() && item->data(kIdRole).toLongLong() == id)
            return item;
    }
    return nullptr;
}

QString shownName(const Person& person) {
    const QString full = person.fullName();
    if (!full.isEmpty())
        return full;
    return person.emails.isEmpty() ? LocalizedStringNS("(no name)") : person.primaryEmail();
}

QListWidget* list(const char* objectName, QAbstractItemView::SelectionMode mode) {
    auto* made = new QListWidget;
    made->setObjectName(QLatin1String(objectName));
    made->setSelectionMode(mode);
    return made;
}

} // namespace

PeoplePicker::PeoplePicker(AddressBook& addressBook, QWidget* parent)
    : QWidget(parent, Qt::Window), m_book(addressBook),
      m_groups(list("groups", QAbstractItemView::ExtendedSelection)),
      m_persons(list("persons", QAbstractItemView::ExtendedSelection)),
      m_addresses(list("addresses", QAbstractItemView::SingleSelection)), m_search(new QLineEdit) {
    setWindowTitle(LocalizedStringNS("Addresses"));
    setAttribute(Qt::WA_QuitOnClose, false);
    auto* splitter = new QSplitter;
    splitter->setChildrenCollapsible(false);
    splitter->addWidget(createGroupColumn());
    splitter->addWidget(createPersonColumn());
    splitter->addWidget(createAddressColumn());
    splitter->setSizes({170, 290, 260});
    auto* hint = new QLabel(LocalizedStringNS(
        "Choose a group to mail each of its members, or a person to mail one message."));
    hint->setWordWrap(true);
    m_search->setObjectName(QStringLiteral("search"));
    m_search->setPlaceholderText(LocalizedStringNS("Search names and addresses"));
    m_search->setClearButtonEnabled(true);
    connect(m_search, &QLineEdit::textChanged, this, [this] {
        fillPersons(selectedRecords());
        updateButtons();
    });
    setAcceptDrops(true);
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(m_search);
    layout->addWidget(splitter, 1);
    layout->addWidget(hint);

    for (auto [list, chosen] : {std::pair{m_groups, &PeoplePicker::groupsChosen},
                                {m_persons, &PeoplePicker::personsChosen},
                                {m_addresses, &PeoplePicker::addressChosen}})
        chooseOnClick(list, chosen);
    connect(m_persons, &QListWidget::itemDoubleClicked, this, &PeoplePicker::editPerson);
    watchBook();
    reload();
    resize(760, 440);
}

QWidget* PeoplePicker::createColumn(const char* title, QListWidget* list, QList<QWidget*> buttons) {
    auto* column = new QWidget;
    auto* layout = new QVBoxLayout(column);
    layout->setContentsMargins(0, 0, 0, 0);
    auto* heading = new QLabel(LocalizedStringNS(title));
    heading->setBuddy(list);
    QFont bold = heading->font();
    bold.setBold(true);
    heading->setFont(bold);
    layout->addWidget(heading);
    layout->addWidget(list, 1);
    auto* row = new QHBoxLayout;
    for (QWidget* widget : buttons)
        row->addWidget(widget);
    row->addStretch(1);
    layout->addLayout(row);
    return column;
}

QPushButton* PeoplePicker::button(const char* text, const char* toolTip, const char* objectName,
                                  void (PeoplePicker::*action)()) {
    auto* made = new QPushButton(LocalizedStringNS(text));
    made->setObjectName(QLatin1String(objectName));
    made->setToolTip(LocalizedStringNS(toolTip));
    made->setAutoDefault(false);
    // A one-sign button ("+", "-") is square rather than as wide as a worded one.
    if (made->text().size() == 1)
        made->setFixedWidth(made->sizeHint().height() + 6);
    connect(made, &QPushButton::clicked, this, action);
    return made;
}

QWidget* PeoplePicker::createGroupColumn() {
    m_renameGroup = button(LocalizedKey("Rename..."), LocalizedKey("Rename the group"),
                           "renameGroup", &PeoplePicker::renameGroup);
    m_deleteGroup =
        button("−", LocalizedKey("Delete the group"), "deleteGroup", &PeoplePicker::deleteGroup);
    return createColumn(
        LocalizedKey("&Group"), m_groups,
        {button("+", LocalizedKey("New group"), "newGroup", &PeoplePicker::newGroup), m_deleteGroup,
         m_renameGroup});
}

QWidget* PeoplePicker::createPersonColumn() {
    m_editPerson = button(LocalizedKey("Edit..."),
                          LocalizedKey("Edit the person's names, addresses and groups"),
                          "editPerson", &PeoplePicker::editPerson);
    m_deletePerson = button("−", LocalizedKey("Delete the selected persons from the address book"),
                            "deletePerson", &PeoplePicker::deletePersons);
    m_groupsOfPerson = new QPushButton(LocalizedStringNS("Groups"));
    m_groupsOfPerson->setToolTip(LocalizedStringNS("Add the selected persons to a group, or "
                                                   "remove them from the group shown"));
    m_groupsOfPerson->setObjectName(QStringLiteral("membership"));
    m_groupsOfPerson->setAutoDefault(false);
    m_membership = new QMenu(m_groupsOfPerson);
    m_groupsOfPerson->setMenu(m_membership);
    connect(m_membership, &QMenu::aboutToShow, this, &PeoplePicker::fillMembershipMenu);
    return createColumn(
        LocalizedKey("&Name"), m_persons,
        {button("+", LocalizedKey("New person"), "newPerson", &PeoplePicker::newPerson),
         m_deletePerson, m_editPerson, m_groupsOfPerson});
}

QWidget* PeoplePicker::createAddressColumn() {
    return createColumn(LocalizedKey("&Email"), m_addresses, {});
}

QList<qint64> PeoplePicker::selectedGroups() const {
    return selectedIds(m_groups);
}

QList<qint64> PeoplePicker::selectedRecords() const {
    return selectedIds(m_persons);
}

QStringList PeoplePicker::selectedValues() const {
    QStringList values;
    for (const QListWidgetItem* item : m_addresses->selectedItems())
        values << item->data(kIdRole).toString();
    return values;
}

qint64 PeoplePicker::shownGroup() const {
    const QList<qint64> groups = selectedGroups();
    return groups.isEmpty() ? 0 : groups.constFirst();
}

// User selections

// A click on the row already selected changes no selection, yet the user chose it: the choice
// is announced again, so that it fills the recipient fields once more.
void PeoplePicker::chooseOnClick(QListWidget* list, void (PeoplePicker::*chosen)()) {
    connect(list, &QListWidget::itemSelectionChanged, this, [this, chosen] {
        m_selectionChangedByPress = true;
        (this->*chosen)();
    });
    connect(list, &QListWidget::itemClicked, this, [this, chosen] {
        if (!m_selectionChangedByPress)
            (this->*chosen)();
    });
    list->viewport()->installEventFilter(this);
}

bool PeoplePicker::eventFilter(QObject* watched, QEvent* event) {
    if (event->type() == QEvent::MouseButtonPress)
        m_selectionChangedByPress = false;
    return QWidget::eventFilter(watched, event);
}

void PeoplePicker::groupsChosen() {
    listPersons();
    fillPersons({});
    updateButtons();
    Q_EMIT groupSelectionChanged(selectedGroups(), isActiveWindow());
}

void PeoplePicker::personsChosen() {
    fillAddresses({});
    updateButtons();
    Q_EMIT nameSelectionChanged(selectedRecords(), selectedValues(), isActiveWindow());
}

void PeoplePicker::addressChosen() {
    Q_EMIT valueSelectionChanged(selectedRecords(), selectedValues(), isActiveWindow());
}

// Filling the lists: never a selection signal, since no user chose anything.

// Contacts another program adds (pelmo contacts import in a terminal) show without a restart.
// A commit may touch the file several times: one reload for a burst of changes.
void PeoplePicker::watchBook() {
    auto* watcher = new QFileSystemWatcher({m_book.path()}, this);
    auto* settle = new QTimer(this);
    settle->setSingleShot(true);
    settle->setInterval(200);
    connect(settle, &QTimer::timeout, this, &PeoplePicker::reload);
    connect(watcher, &QFileSystemWatcher::fileChanged, this,
            [watcher, settle](const QString& path) {
                // A file replaced by a rename is no longer watched.
                if (!watcher->files().contains(path))
                    watcher->addPath(path);
                settle->start();
            });
}

void PeoplePicker::reload() {
    const QList<qint64> groups = selectedGroups();
    const QList<qint64> persons = selectedRecords();
    const QStringList values = selectedValues();
    QStringList shownBefore;
    for (int row = 0; row < m_addresses->count(); ++row)
        shownBefore << m_addresses->item(row)->text();
    fillGroups(groups);
    listPersons();
    fillPersons(persons);
    fillAddresses(values.value(0));
    updateButtons();
    QStringList shownNow;
    for (int row = 0; row < m_addresses->count(); ++row)
        shownNow << m_addresses->item(row)->text();
    if (!selectedRecords().isEmpty() && shownNow != shownBefore)
        Q_EMIT displayedPropertyChanged(selectedRecords(), selectedValues(), isActiveWindow());
}

void PeoplePicker::fillGroups(const QList<qint64>& selected) {
    const QSignalBlocker blocker(m_groups);
    m_groups->clear();
    // Nothing starts selected, so that the first click, even on "All", is a choice.
    new QListWidgetItem(LocalizedStringNS("All"), m_groups);
    for (const Group& group : m_book.groups()) {
        auto* item = new QListWidgetItem(group.name, m_groups);
        item->setData(kIdRole, group.id);
        item->setSelected(selected.contains(group.id));
    }
}

void PeoplePicker::listPersons() {
    const qint64 group = shownGroup();
    m_listed = group == 0 ? m_book.persons() : m_book.members(group).value_or(QList<Person>());
    // A group's members in the order of the whole book, though they are mailed in the group's.
    QCollator collator;
    collator.setCaseSensitivity(Qt::CaseInsensitive);
    std::stable_sort(m_listed.begin(), m_listed.end(),
                     [&collator](const Person& one, const Person& other) {
                         if (const int last = collator.compare(one.lastName, other.lastName))
                             return last < 0;
                         return collator.compare(one.firstName, other.firstName) < 0;
                     });
}

// Runs on every key press in the search field: only the filter and the list, never the book.
void PeoplePicker::fillPersons(const QList<qint64>& selected) {
    const QSignalBlocker blocker(m_persons);
    m_persons->setUpdatesEnabled(false);
    m_persons->clear();
    const QSet<qint64> chosen(selected.cbegin(), selected.cend());
    for (const Person& person : PersonFilter::filter(m_listed, m_search->text())) {
        auto* item = new QListWidgetItem(shownName(person));
        item->setData(kIdRole, person.id);
        m_persons->addItem(item);
        if (chosen.contains(person.id))
            item->setSelected(true);
    }
    m_persons->setUpdatesEnabled(true);
}

void PeoplePicker::fillAddresses(const QString& selected) {
    const QSignalBlocker blocker(m_addresses);
    m_addresses->clear();
    const QList<qint64> persons = selectedRecords();
    if (persons.isEmpty())
        return;
    const std::optional<Person> person = m_book.person(persons.constFirst());
    if (!person)
        return;
    for (int i = 0; i < person->emails.size(); ++i) {
        const QString& address = person->emails.at(i);
        auto* item = new QListWidgetItem(address, m_addresses);
        item->setData(kIdRole, address);
        if (i == person->primary) {
            QFont bold = item->font();
            bold.setBold(true);
            item->setFont(bold);
            item->setToolTip(LocalizedStringNS("Primary address"));
        }
        item->setSelected(address == selected);
    }
}

void PeoplePicker::updateButtons() {
    const bool group = shownGroup() != 0;
    const bool persons = !selectedRecords().isEmpty();
    m_renameGroup->setEnabled(group);
    m_deleteGroup->setEnabled(group);
    m_editPerson->setEnabled(selectedRecords().size() == 1);
    m_deletePerson->setEnabled(persons);
    m_groupsOfPerson->setEnabled(persons);
}

// Contact files

void PeoplePicker::importContacts() {
    ContactFiles::chooseAndImport(this, m_book, [this] { reload(); });
}

void PeoplePicker::exportContacts() {
    const std::optional<Group> shown = m_book.group(shownGroup());
    ContactFiles::chooseAndExport(this, m_book, shown ? shown->name : QString());
}

namespace {

QStringList droppedContactFiles(const QMimeData* data) {
    QStringList paths;
    for (const QUrl& url : data->urls())
        if (url.isLocalFile() && ContactFiles::isContactsFile(url.toLocalFile()))
            paths << url.toLocalFile();
    return paths;
}

} // namespace

void PeoplePicker::dragEnterEvent(QDragEnterEvent* event) {
    if (!droppedContactFiles(event->mimeData()).isEmpty())
        event->acceptProposedAction();
}

void PeoplePicker::dropEvent(QDropEvent* event) {
    const QStringList paths = droppedContactFiles(event->mimeData());
    if (paths.isEmpty())
        return;
    event->acceptProposedAction();
    ContactFiles::importFiles(this, m_book, paths, [this] { reload(); });
}

// Editing the book

void PeoplePicker::change(const std::function<void()>& edit) {
    try {
        edit();
    } catch (const PelmoException& failure) {
        showFailure(failure);
    }
    reload();
}

void PeoplePicker::showFailure(const PelmoException& failure) {
    openAlert(this, LocalizedStringNS("The address book was not changed."), failure.reason());
}

void PeoplePicker::askForGroupName(const QString& title, const QString& initial,
                                   const std::function<void(const QString&)>& use) {
    auto* dialog = new QInputDialog(this);
    dialog->setObjectName(QStringLiteral("groupNameDialog"));
    dialog->setWindowTitle(title);
    dialog->setLabelText(LocalizedStringNS("Group name:"));
    dialog->setTextValue(initial);
    dialog->setWindowModality(Qt::WindowModal);
    dialog->setAttribute(Qt::WA_DeleteOnClose);
    connect(dialog, &QInputDialog::textValueSelected, this, use);
    dialog->open();
}

void PeoplePicker::newGroup() {
    askForGroupName(LocalizedStringNS("New Group"), QString(),
                    [this](const QString& name) { change([&] { m_book.addGroup(name); }); });
}

void PeoplePicker::renameGroup() {
    const qint64 group = shownGroup();
    const std::optional<Group> current = m_book.group(group);
    if (!current)
        return;
    askForGroupName(
        LocalizedStringNS("Rename Group"), current->name,
        [this, group](const QString& name) { change([&] { m_book.renameGroup(group, name); }); });
}

void PeoplePicker::deleteGroup() {
    const qint64 group = shownGroup();
    const std::optional<Group> current = m_book.group(group);
    if (!current)
        return;
    confirm(LocalizedStringNS("Delete the group \"%1\"?").arg(current->name),
            LocalizedStringNS("Its members stay in the address book."),
            LocalizedStringNS("Delete Group"),
            [this, group] { change([&] { m_book.removeGroup(group); }); });
}

void PeoplePicker::newPerson() {
    // A person made while a group is shown joins it unless the user says otherwise.
    auto* dialog = new PersonDialog(m_book, Person(), shownGroup(), this);
    connect(dialog, &PersonDialog::saved, this, [this](qint64 id) {
        reload();
        if (const QListWidgetItem* item = itemWithId(m_persons, id))
            m_persons->scrollToItem(item);
    });
    dialog->open();
}

void PeoplePicker::editPerson() {
    const QList<qint64> persons = selectedRecords();
    if (persons.size() != 1)
        return;
    const std::optional<Person> person = m_book.person(persons.constFirst());
    if (!person)
        return;
    auto* dialog = new PersonDialog(m_book, *person, 0, this);
    connect(dialog, &PersonDialog::saved, this, &PeoplePicker::reload);
    dialog->open();
}

void PeoplePicker::deletePersons() {
    const QList<qint64> persons = selectedRecords();
    if (persons.isEmpty())
        return;
    const QString question =
        persons.size() == 1
            ? LocalizedStringNS("Delete \"%1\" from the address book?")
                  .arg(m_persons->selectedItems().constFirst()->text())
            : LocalizedStringNS("Delete %1 persons from the address book?").arg(persons.size());
    confirm(question, LocalizedStringNS("They are taken out of every group too."),
            LocalizedStringNS("Delete"), [this, persons] {
                change([&] {
                    for (const qint64 id : persons)
                        m_book.removePerson(id);
                });
            });
}

void PeoplePicker::fillMembershipMenu() {
    m_membership->clear();
    const QList<qint64> persons = selectedRecords();
    for (const Group& group : m_book.groups()) {
        m_membership->addAction(LocalizedStringNS("Add to \"%1\"").arg(group.name), this,
                                [this, persons, id = group.id] {
                                    change([&] {
                                        for (const qint64 person : persons)
                                            m_book.addMember(id, person);
                                    });
                                });
    }
    const std::optional<Group> shown = m_book.group(shownGroup());
    if (!shown)
        return;
    m_membership->addSeparator();
    m_membership->addAction(LocalizedStringNS("Remove from \"%1\"").arg(shown->name), this,
                            [this, persons, id = shown->id] {
                                change([&] {
                                    for (const qint64 person : persons)
                                        m_book.removeMember(id, person);
                                });
                            });
}

void PeoplePicker::confirm(const QString& question, const QString& detail, const QString& action,
                           const std::function<void()>& change) {
    auto* box =
        new QMessageBox(QMessageBox::Question, windowTitle(), question, QMessageBox::Cancel, this);
    box->setInformativeText(detail);
    QPushButton* yes = box->addButton(action, QMessageBox::DestructiveRole);
    box->setDefaultButton(QMessageBox::Cancel);
    box->setWindowModality(Qt::WindowModal);
    box->setAttribute(Qt::WA_DeleteOnClose);
    connect(yes, &QPushButton::clicked, this, change);
    box->open();
}
