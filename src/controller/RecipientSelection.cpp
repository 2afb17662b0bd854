#include "controller/RecipientSelection.h"

#include "addressbook/AddressBook.h"
#include "controller/SentRecipients.h"

RecipientSelection::RecipientSelection(AddressBook& addressBook, PelmoView& pelmoView,
                                       const SentRecipients& sentRecipients, QObject* parent)
    : QObject(parent), book(addressBook), view(pelmoView), sent(sentRecipients) {}

QString RecipientSelection::firstAndLastName(const Person& person) {
    const auto part = [](const QString& text) {
        return text.isNull() ? QStringLiteral("(null)") : text;
    };
    return part(person.firstName) + QLatin1Char(' ') + part(person.lastName);
}

Person RecipientSelection::takeFirst() {
    return people->takeFirst();
}

void RecipientSelection::filterPeopleByRecipients() {
    if (sent.addresses().isEmpty())
        return;
    Q_EMIT statusMessage(QStringLiteral("Filtering people by sent recipients..."));
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
    filterPeopleByRecipients();
}

void RecipientSelection::abRecordSelected(const QList<qint64>& personIds,
                                          const QStringList& selectedAddresses,
                                          bool pickerIsKeyWindow) {
    people.reset();
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
        people.reset();
}
