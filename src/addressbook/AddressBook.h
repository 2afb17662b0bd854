#pragma once

#include "addressbook/Group.h"
#include "addressbook/ImportSummary.h"
#include "addressbook/ImportedContact.h"
#include "addressbook/Person.h"

#include <QHash>
#include <QList>
#include <QString>
#include <QVariant>

#include <functional>
#include <optional>

class QSqlQuery;

/**
 * The address book: persons (first name, last name, e-mail addresses of which one is primary)
 * and named groups whose members keep the order in which they joined. Kept in an SQLite file;
 * each object has a connection of its own, so several may be open on one file. Group names
 * are unique ignoring letter case. Every failure of the database throws PelmoException
 * ("AddressBookUnavailable") with the database's reason. Main thread only.
 */
class AddressBook {
public:
    /**
     * Opens AddressBook.sqlite in the data folder, creating the folder and file when missing;
     * the folder is private and the file 0600, as GetOurApplicationSupportFolder makes them.
     */
    AddressBook();
    /**
     * Opens the database file at path, creating it with mode 0600 when missing. An existing file
     * and the folder around it keep their modes.
     */
    explicit AddressBook(const QString& path);
    ~AddressBook();
    AddressBook(const AddressBook&) = delete;
    AddressBook& operator=(const AddressBook&) = delete;

    const QString& path() const { return filePath; }

    /** Every person, by last name, then first name. */
    QList<Person> persons() const;
    std::optional<Person> person(qint64 id) const;
    /** Every group, by name. */
    QList<Group> groups() const;
    std::optional<Group> group(qint64 id) const;
    /** The group of that name, ignoring letter case. */
    std::optional<Group> groupNamed(const QString& name) const;
    /** The group's members in order; nullopt when there is no such group. */
    std::optional<QList<Person>> members(qint64 groupId) const;
    /** The number of members of every group, by group id; groups without members are left out. */
    QHash<qint64, int> memberCounts() const;

    /**
     * Adds the contacts in one transaction: on any failure nothing of them is kept. A contact
     * whose primary address (ignoring letter case) is an address of a person already in the
     * book, or in the contacts before it, is that person: the person gains the contact's other
     * addresses (after its own, its primary kept), the name parts it lacks, and the contact's
     * groups. A contact without addresses is the person of the same name who has none either.
     * Missing groups are created; new members join at the end of a group. Adding the same
     * contacts twice changes nothing the second time.
     */
    ImportSummary add(const QList<ImportedContact>& contacts);
    /**
     * Reads the contacts file at path (ContactsFile) and adds its contacts; the summary also
     * lists the values the file's reader left out. Throws ImportError when the file cannot be
     * read or is no contacts file, and PelmoException as add() does.
     */
    ImportSummary importFile(const QString& path);
    /**
     * Writes the persons of the book, or the members of the group named groupName (ignoring
     * letter case) when it is not null, as a vCard 4.0 file (VCardExporter) at path, which is
     * private to the user (0600). Each card lists the person's groups, or only that group.
     * Answers the number of persons written. Throws PelmoException named NoSuchGroup for an
     * unknown group and ExportFailed, with the system's reason, when the file cannot be written.
     */
    int exportFile(const QString& path, const QString& groupName = QString()) const;

    // Editing, one change at a time. Each change runs in a transaction of its own: it is kept
    // whole or not at all. A change the book refuses throws PelmoException named NoSuchPerson,
    // NoSuchGroup, NoPersonName, BadName, BadAddress, BadPrimaryAddress, NoGroupName or
    // GroupNameTaken, with a reason for the user; a database failure throws
    // AddressBookUnavailable as elsewhere.

    /**
     * Adds person (its id is ignored) and answers the new id. It needs a first or a last name,
     * names without control characters, plausible addresses and, when it has addresses, a
     * primary one among them.
     */
    qint64 addPerson(const Person& person);
    /** Replaces the names and addresses of the person person.id, under the rules of addPerson. */
    void updatePerson(const Person& person);
    /** Removes the person, from every group too. */
    void removePerson(qint64 personId);
    /** Adds an empty group and answers its id; the name is trimmed and must be new. */
    qint64 addGroup(const QString& name);
    void renameGroup(qint64 groupId, const QString& name);
    /** Removes the group; its members stay in the book. */
    void removeGroup(qint64 groupId);
    /** The person joins the end of the group; a member already there keeps its place. */
    void addMember(qint64 groupId, qint64 personId);
    /** The person leaves the group; nothing happens when it was no member. */
    void removeMember(qint64 groupId, qint64 personId);
    /** The groups the person belongs to, by name. */
    QList<Group> groupsOf(qint64 personId) const;

private:
    void open();
    void createTables();
    QSqlQuery prepared(const QString& sql) const;
    void run(QSqlQuery& query) const;
    QList<Person> loadPersons(const QString& personsSql, const QString& emailsSql,
                              const QVariant& bound = {}) const;
    struct Known;
    bool merge(Known& known, qsizetype at, const Person& incoming, QSqlQuery& insertEmailQuery);
    qint64 insertPerson(const Person& person, QSqlQuery& insert, QSqlQuery& email);
    void insertEmails(QSqlQuery& email, qint64 personId, const QStringList& emails,
                      int firstPosition);
    qint64 groupId(const QString& name);
    void insertMember(QSqlQuery& insert, qint64 group, qint64 person);
    /** Runs change in a transaction, rolled back when change throws. */
    void inTransaction(const std::function<void()>& change);
    /** Runs sql with values bound in order. */
    void execute(const char* sql, const QVariantList& values);
    QList<Group> loadGroups(QSqlQuery& query) const;
    void requirePerson(qint64 personId) const;
    void requireGroup(qint64 groupId) const;
    QString newGroupName(const QString& name, qint64 renamedGroupId) const;
    [[noreturn]] void fail(const QString& detail) const;

    QString filePath;
    QString connectionName;
};
