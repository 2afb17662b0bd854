#pragma once

#include "addressbook/Person.h"

#include <QList>
#include <QStringList>
#include <QWidget>

#include <functional>

class AddressBook;
class PelmoException;
class QDragEnterEvent;
class QDropEvent;
class QLineEdit;
class QListWidget;
class QMenu;
class QPushButton;

/**
 * The address-book window: the groups (and "All"), the persons of the first selected group or
 * of the whole book that match the search field, and the addresses of the first selected
 * person. It also edits the book (persons, groups and memberships) and imports the contact
 * files dropped on it.
 *
 * A change of selection made by the user is announced by one of four signals, each carrying
 * whether this window was the active (key) window at the time, so that only a choice made
 * here fills the main window's recipient fields. Reloading after an edit selects silently;
 * when it changes the addresses shown for the selected person, displayedPropertyChanged
 * tells. A separate window owned by its parent; the address book is not owned.
 */
class PeoplePicker : public QWidget {
    Q_OBJECT

public:
    PeoplePicker(AddressBook& addressBook, QWidget* parent);

    /** The selected groups in the picker's order; "All" is no group. */
    QList<qint64> selectedGroups() const;
    /** The selected persons in the picker's order. */
    QList<qint64> selectedRecords() const;
    /** The selected address of the first selected person, if one is selected. */
    QStringList selectedValues() const;
    /** Reads the book again, keeping the selection where its groups and persons remain. */
    void reload();
    /** Asks for vCard or CSV files and imports them, with a summary. */
    void importContacts();
    /** Asks where to write the group shown, or everyone, as a vCard file. */
    void exportContacts();

Q_SIGNALS:
    void groupSelectionChanged(const QList<qint64>& groupIds, bool pickerIsKeyWindow);
    void nameSelectionChanged(const QList<qint64>& personIds, const QStringList& selectedAddresses,
                              bool pickerIsKeyWindow);
    void valueSelectionChanged(const QList<qint64>& personIds, const QStringList& selectedAddresses,
                               bool pickerIsKeyWindow);
    void displayedPropertyChanged(const QList<qint64>& personIds,
                                  const QStringList& selectedAddresses, bool pickerIsKeyWindow);

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;
    /** Contact files dropped on the window are imported. */
    void dragEnterEvent(QDragEnterEvent* event) override;
    void dropEvent(QDropEvent* event) override;

private:
    void watchBook();
    void chooseOnClick(QListWidget* list, void (PeoplePicker::*chosen)());
    QWidget* createColumn(const char* title, QListWidget* list, QList<QWidget*> buttons);
    QWidget* createGroupColumn();
    QWidget* createPersonColumn();
    QWidget* createAddressColumn();
    QPushButton* button(const char* text, const char* toolTip, const char* objectName,
                        void (PeoplePicker::*action)());

    void groupsChosen();
    void personsChosen();
    void addressChosen();
    void fillGroups(const QList<qint64>& selected);
    /** Reads the persons of the group shown, or of the whole book, in name order. */
    void listPersons();
    void fillPersons(const QList<qint64>& selected);
    void fillAddresses(const QString& selected);
    void updateButtons();
    /** The group whose members are shown; 0 for the whole book. */
    qint64 shownGroup() const;

    void newGroup();
    void renameGroup();
    void deleteGroup();
    void newPerson();
    void editPerson();
    void deletePersons();
    void fillMembershipMenu();
    void askForGroupName(const QString& title, const QString& initial,
                         const std::function<void(const QString&)>& use);
    void confirm(const QString& question, const QString& detail, const QString& action,
                 const std::function<void()>& change);
    /** Runs a change of the book, then reloads; a refusal is shown to the user. */
    void change(const std::function<void()>& edit);
    void showFailure(const PelmoException& failure);

    AddressBook& m_book;
    QListWidget* m_groups;
    QListWidget* m_persons;
    QListWidget* m_addresses;
    QLineEdit* m_search;
    /** The persons of the group shown, before the search. */
    QList<Person> m_listed;
    QMenu* m_membership = nullptr;
    QPushButton* m_renameGroup = nullptr;
    QPushButton* m_deleteGroup = nullptr;
    QPushButton* m_editPerson = nullptr;
    QPushButton* m_deletePerson = nullptr;
    QPushButton* m_groupsOfPerson = nullptr;
    /** Whether the latest mouse press in a list changed its selection. */
    bool m_selectionChangedByPress = false;
};
