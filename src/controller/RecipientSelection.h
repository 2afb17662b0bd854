#pragma once

#include "addressbook/Person.h"
#include "controller/PelmoView.h"

#include <QList>
#include <QObject>
#include <QStringList>

#include <optional>

class AddressBook;
class SentRecipients;

/**
 * Whom the next Send mails: a group chosen in the picker makes its members, less those already
 * mailed, the pending list `people`; a person chosen, or an edit of the To or Name field,
 * drops it, and Send then mails the To field once. A mailing run takes its members from the
 * front of this list, so a stopped run leaves the rest for the next Send.
 *
 * The address book, the view and the sent list are not owned and must outlive it.
 */
class RecipientSelection : public QObject {
    Q_OBJECT

public:
    RecipientSelection(AddressBook& book, PelmoView& view, const SentRecipients& sent,
                       QObject* parent = nullptr);

    /** The persons still to be mailed; nullopt when no group selection is pending. */
    const std::optional<QList<Person>>& getPeople() const { return people; }
    /** Makes persons the pending selection. */
    void setPeople(const QList<Person>& persons);
    /** Drops the pending selection. */
    void clear();
    /**
     * Puts persons in front of the pending list, in their order, starting one when none is
     * pending; a person already pending moves to the front rather than being listed twice.
     */
    void putBack(const QList<Person>& persons);
    /**
     * What Send would mail, for the window: "Group Testers: 3 members, 1 already mailed" while
     * a group's members are pending, "2 recipients to mail" for persons put back without one,
     * empty when Send mails the To field.
     */
    QString summary() const;
    /** Takes the first pending person off the list. */
    Person takeFirst();
    /** Drops from the pending list every person whose primary address was mailed. */
    void filterPeopleByRecipients();

    /**
     * The picker's group selection changed. Only the first group counts; pickerIsKeyWindow
     * tells that the user made the change in the picker, which then also puts the group's
     * name in the To and Name fields.
     */
    void abGroupSelected(const QList<qint64>& groupIds, bool pickerIsKeyWindow);
    /**
     * The picker's person selection, selected address or displayed property changed: one
     * message, so the pending list goes. When the user made the change in the picker, the
     * first person's "first last" goes to Name and the first selected address (else the
     * person's primary one) to To.
     */
    void abRecordSelected(const QList<qint64>& personIds, const QStringList& selectedAddresses,
                          bool pickerIsKeyWindow);
    /** The user edited field: To or Name drops the pending list. */
    void textDidChange(PelmoView::Field field);

    /** "%@ %@" of the first and last name; a missing part prints "(null)". */
    static QString firstAndLastName(const Person& person);

Q_SIGNALS:
    /** A line for the status line and the activity log. */
    void statusMessage(const QString& text);
    /** summary() may read differently: the pending list or the sent list changed. */
    void summaryChanged();

private:
    void dropPeople();

    AddressBook& book;
    PelmoView& view;
    const SentRecipients& sent;
    std::optional<QList<Person>> people;
    /** The group whose members are pending, and their primary addresses. */
    QString groupName;
    QStringList groupAddresses;
};
