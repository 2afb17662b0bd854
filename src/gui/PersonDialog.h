#pragma once

#include "addressbook/Person.h"

#include <QDialog>

class AddressBook;
class QButtonGroup;
class QLineEdit;
class QListWidget;
class QTableWidget;

/**
 * Edits one person of the address book: first and last name, the e-mail addresses with the
 * primary one, and the groups the person belongs to. OK saves through the address book; a
 * change the book refuses is shown and the dialog stays open with everything typed. The
 * dialog deletes itself when closed; the address book is not owned.
 */
class PersonDialog : public QDialog {
    Q_OBJECT

public:
    /**
     * Edits person, or a new one when person.id is 0; a new person starts out in the group
     * joinGroup unless that is 0.
     */
    PersonDialog(AddressBook& addressBook, const Person& person, qint64 joinGroup, QWidget* parent);

    /** The person the fields describe: names trimmed (blank is missing), empty rows left out. */
    Person person() const;
    /** The groups ticked, in the list's order. */
    QList<qint64> checkedGroups() const;

    /** Adds an address row and starts editing it; the first address becomes the primary one. */
    void addAddress(const QString& address = QString());
    void accept() override;

Q_SIGNALS:
    /** The person was stored under personId. */
    void saved(qint64 personId);

private:
    QWidget* createAddresses();
    QWidget* createGroups(qint64 joinGroup);
    void removeAddress();
    void save();

    AddressBook& m_book;
    Person m_person;
    QLineEdit* m_firstName;
    QLineEdit* m_lastName;
    QTableWidget* m_addresses = nullptr;
    QButtonGroup* m_primary = nullptr;
    QListWidget* m_groups = nullptr;
};
