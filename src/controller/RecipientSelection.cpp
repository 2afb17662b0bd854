#include "controller/RecipientSelection.h"

#include "addressbook/AddressBook.h"
#include "controller/SentRecipients.h"
#include "util/LocalizedStrings.h"

#include <algorithm>

RecipientSelection::RecipientSelection(AddressBook& addressBook, PelmoView& pelmoView,
                                       const SentRecipients& sentRecipients, QObject* parent)
    : QObject(parent), book(addressBook), view(pelmoView), sent(sentRecipients) {
    connect(&sent, &SentRecipients::rowsInserted, this, &RecipientSelection::summaryChanged);
    connect(&sent, &SentRecipients::modelReset, this, &RecipientSelection::summaryChanged);
}

void RecipientSelection::setPeople(const QList<Person>& persons) {
    people = persons;
    Q_EMIT summaryChanged();
}

void RecipientSelection::clear() {
    dropPeople();
    Q_EMIT summaryChanged();
}

void RecipientSelection::dropPeople() {
    people.reset();
    groupName.clear();
    groupAddresses.clear();
}

void RecipientSelection::putBack(const QList<Person>& persons) {
    QList<Person> pending = persons;
    for (const Person& person : people.value_or(QList<Person>()))
        if (std::none_of(persons.cbegin(), persons.cend(),
                         [&person](const Person& back) { return back.id == person.id; }))
            pending.append(person);
    setPeople(pending);
}

QString RecipientSelection::summary() const {
    if (!people)
        return QString();
    if (groupName.isNull())
        return people->size() == 1 ? LocalizedStringNS("1 recipient to mail")
                                   : LocalizedStringNS("%1 recipients to mail").arg(people->size());
    const auto mailed =
        std::count_if(groupAddresses.cbegin(), groupAddresses.cend(),
                      [this](const QString& address) { return sent.recipientsContains(address); });
    const QString members = groupAddresses.size() == 1
                                ? LocalizedStringNS("1 member")
                                : LocalizedStringNS("%1 members").arg(groupAddresses.size());
    return LocalizedStringNS("Group %1: %2, %3 already mailed")
        .arg(groupName, members, QString::number(mailed));
}

QString RecipientSelection::firstAndLastName(const Person& person) {
    const auto part = [](const QString& text) {
        return text.isNull() ? QStringLiteral("(null)") : text;
    };
    return part(person.firstName) + QLatin1Char(' ') + part(person.lastName);
}

Person RecipientSelection::takeFirst() {
    const Person first = people->takeFirst();
    Q_EMIT summaryChanged();
    return first;
}

void RecipientSelection::filterPeopleByRecipients() {
    if (sent.addresses().isEmpty())
        return;
    Q_EMIT statusMessage(LocalizedStringNS("Filtering people by sent recipients..."));
    if (!people)
        return;
    QList<Person> kept;
    kept.reserve(people->size());
    for (const Person& person : std::as_const(*people)) {
        const QString address = person.primaryEmail();
        if (!address.isNull() && sent.recipientsContains(address)) {
            Q_EMIT statusMessage(QStringLiteral("Skipping %1").arg(address));
            continue;
        }
        kept.append(person);
    }
    people = std::move(kept);
}

void RecipientSelection::abGroupSelected(const QList<qint64>& groupIds, bool pickerIsKeyWindow) {
    if (groupIds.isEmpty())
        return;
    const qint64 groupId = groupIds.constFirst();
    const std::optional<Group> group = book.group(groupId);
    if (group && pickerIsKeyWindow) {
        view.setName(group->name);
        view.setTo(group->name);
    }
    std::optional<QList<Person>> members = book.members(groupId);
    if (!members)
        return;
    people = std::move(members);
    groupName = group ? group->name : QString();
    groupAddresses.clear();
    for (const Person& member : std::as_const(*people))
        groupAddresses << member.primaryEmail();
    filterPeopleByRecipients();
    Q_EMIT summaryChanged();
}

void RecipientSelection::abRecordSelected(const QList<qint64>& personIds,
                                          const QStringList& selectedAddresses,
                                          bool pickerIsKeyWindow) {
    clear();
    if (personIds.isEmpty())
        return;
    const std::optional<Person> person = book.person(personIds.constFirst());
    if (!person || !pickerIsKeyWindow)
        return;
    view.setName(firstAndLastName(*person));
    view.setTo(selectedAddresses.isEmpty() ? person->primaryEmail()
                                           : selectedAddresses.constFirst());
}

void RecipientSelection::textDidChange(PelmoView::Field field) {
    if (field == PelmoView::Field::To || field == PelmoView::Field::Name)
        clear();
}
