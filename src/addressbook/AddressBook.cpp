#include "addressbook/AddressBook.h"

#include "addressbook/ImportText.h"
#include "util/DataFolder.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"
#include "util/PrivateFiles.h"

#include <QHash>
#include <QSet>
#include <QSqlDatabase>
#include <QSqlError>
#include <QSqlQuery>

#include <atomic>
#include <cerrno>
#include <cstring>
#include <filesystem>

namespace {

QString defaultPath() {
    std::filesystem::path folder;
    if (!GetOurApplicationSupportFolder(folder))
        throw PelmoException(QStringLiteral("AddressBookUnavailable"),
                             LocalizedString("The data folder for the address book cannot be "
                                             "created."));
    return QString::fromStdString((folder / "AddressBook.sqlite").string());
}

QString nextConnectionName() {
    static std::atomic<int> counter{0};
    return QStringLiteral("AddressBook-%1").arg(++counter);
}

QString nullableText(const QVariant& value) {
    return value.isNull() ? QString() : value.toString();
}

// The identity used to recognise a person already in the book.
QString personKey(const Person& person) {
    return person.firstName + QChar(0x1f) + person.lastName + QChar(0x1f) +
           person.primaryEmail().toCaseFolded();
}

constexpr const char* kPersonColumns = "p.id, p.first_name, p.last_name, p.primary_position";

[[noreturn]] void refuse(const char* name, const QString& reason) {
    throw PelmoException(QString::fromLatin1(name), reason);
}

// Names end up in mail headers, where a line break would start a header of its own.
void checkName(const QString& name) {
    for (const QChar c : name) {
        if (c.category() == QChar::Other_Control)
            refuse("BadName", LocalizedString("A name cannot hold a line break or another "
                                              "control character."));
    }
}

void checkPerson(const Person& person) {
    if (person.firstName.trimmed().isEmpty() && person.lastName.trimmed().isEmpty())
        refuse("NoPersonName", LocalizedString("A person needs a first or a last name."));
    checkName(person.firstName);
    checkName(person.lastName);
    for (const QString& address : person.emails) {
        if (!ImportText::isPlausibleAddress(address))
            refuse("BadAddress", LocalizedString("\"%1\" is not an e-mail address.").arg(address));
    }
    if (!person.emails.isEmpty() && (person.primary < 0 || person.primary >= person.emails.size()))
        refuse("BadPrimaryAddress",
               LocalizedString("One of the person's addresses must be the primary one."));
}

} // namespace

AddressBook::AddressBook() : AddressBook(defaultPath()) {}

AddressBook::AddressBook(const QString& path)
    : filePath(path), connectionName(nextConnectionName()) {
    try {
        open();
    } catch (...) {
        QSqlDatabase::removeDatabase(connectionName);
        throw;
    }
}

AddressBook::~AddressBook() {
    QSqlDatabase::database(connectionName, false).close();
    QSqlDatabase::removeDatabase(connectionName);
}

void AddressBook::open() {
    // SQLite gives its journals the mode of the database file, so a book begun 0600 keeps the
    // contacts from the other users in every file. A book that exists keeps the mode its
    // owner gave it; the one in the data folder is tightened with the folder.
    const std::filesystem::path file(filePath.toStdString());
    std::error_code error;
    if (!std::filesystem::exists(std::filesystem::symlink_status(file, error)) &&
        !MakePrivateFile(file))
        fail(QString::fromLocal8Bit(std::strerror(errno)));
    QSqlDatabase db = QSqlDatabase::addDatabase(QStringLiteral("QSQLITE"), connectionName);
    db.setDatabaseName(filePath);
    db.setConnectOptions(QStringLiteral("QSQLITE_BUSY_TIMEOUT=5000"));
    if (!db.open())
        fail(db.lastError().text());
    createTables();
}

void AddressBook::createTables() {
    static const char* const statements[] = {
        "PRAGMA foreign_keys = ON",
        "CREATE TABLE IF NOT EXISTS persons (id INTEGER PRIMARY KEY, first_name TEXT, "
        "last_name TEXT, primary_position INTEGER NOT NULL DEFAULT -1)",
        "CREATE TABLE IF NOT EXISTS emails (person_id INTEGER NOT NULL REFERENCES persons(id) "
        "ON DELETE CASCADE, position INTEGER NOT NULL, address TEXT NOT NULL, "
        "PRIMARY KEY (person_id, position))",
        // folded holds the case-folded name, so that names are unique ignoring letter case
        // beyond the ASCII letters that SQLite's NOCASE knows.
        "CREATE TABLE IF NOT EXISTS groups (id INTEGER PRIMARY KEY, name TEXT NOT NULL, "
        "folded TEXT NOT NULL UNIQUE)",
        "CREATE TABLE IF NOT EXISTS group_members (group_id INTEGER NOT NULL REFERENCES "
        "groups(id) ON DELETE CASCADE, person_id INTEGER NOT NULL REFERENCES persons(id) "
        "ON DELETE CASCADE, position INTEGER NOT NULL, PRIMARY KEY (group_id, person_id))",
        "CREATE INDEX IF NOT EXISTS group_members_order ON group_members (group_id, position)",
        "PRAGMA user_version = 1",
    };
    for (const char* sql : statements) {
        QSqlQuery query = prepared(QString::fromLatin1(sql));
        run(query);
    }
}

QSqlQuery AddressBook::prepared(const QString& sql) const {
    QSqlQuery query(QSqlDatabase::database(connectionName, false));
    query.setForwardOnly(true);
    if (!query.prepare(sql))
        fail(query.lastError().text());
    return query;
}

void AddressBook::run(QSqlQuery& query) const {
    if (!query.exec())
        fail(query.lastError().text());
}

void AddressBook::fail(const QString& detail) const {
    throw PelmoException(
        QStringLiteral("AddressBookUnavailable"),
        LocalizedString("The address book \"%1\" cannot be used: %2").arg(filePath, detail));
}

QList<Person> AddressBook::loadPersons(const QString& personsSql, const QString& emailsSql,
                                       const QVariant& bound) const {
    QSqlQuery rows = prepared(personsSql);
    if (bound.isValid())
        rows.addBindValue(bound);
    run(rows);
    QList<Person> persons;
    QHash<qint64, qsizetype> indexOf;
    while (rows.next()) {
        Person person;
        person.id = rows.value(0).toLongLong();
        person.firstName = nullableText(rows.value(1));
        person.lastName = nullableText(rows.value(2));
        person.primary = rows.value(3).toInt();
        indexOf.insert(person.id, persons.size());
        persons.append(person);
    }
    QSqlQuery emails = prepared(emailsSql);
    if (bound.isValid())
        emails.addBindValue(bound);
    run(emails);
    while (emails.next()) {
        const auto at = indexOf.constFind(emails.value(0).toLongLong());
        if (at != indexOf.constEnd())
            persons[at.value()].emails.append(emails.value(1).toString());
    }
    return persons;
}

QList<Person> AddressBook::persons() const {
    return loadPersons(
        QStringLiteral("SELECT %1 FROM persons p ORDER BY p.last_name COLLATE NOCASE, "
                       "p.first_name COLLATE NOCASE, p.id")
            .arg(QLatin1String(kPersonColumns)),
        QStringLiteral("SELECT person_id, address FROM emails ORDER BY person_id, position"));
}

std::optional<Person> AddressBook::person(qint64 id) const {
    const QList<Person> found =
        loadPersons(QStringLiteral("SELECT %1 FROM persons p WHERE p.id = ?")
                        .arg(QLatin1String(kPersonColumns)),
                    QStringLiteral("SELECT person_id, address FROM emails WHERE person_id = ? "
                                   "ORDER BY position"),
                    id);
    if (found.isEmpty())
        return std::nullopt;
    return found.constFirst();
}

std::optional<QList<Person>> AddressBook::members(qint64 groupId) const {
    if (!group(groupId))
        return std::nullopt;
    return loadPersons(
        QStringLiteral("SELECT %1 FROM group_members m JOIN persons p ON p.id = m.person_id "
                       "WHERE m.group_id = ? ORDER BY m.position")
            .arg(QLatin1String(kPersonColumns)),
        QStringLiteral("SELECT e.person_id, e.address FROM emails e JOIN group_members m "
                       "ON m.person_id = e.person_id WHERE m.group_id = ? "
                       "ORDER BY e.person_id, e.position"),
        groupId);
}

QList<Group> AddressBook::loadGroups(QSqlQuery& query) const {
    run(query);
    QList<Group> groups;
    while (query.next())
        groups.append({query.value(0).toLongLong(), query.value(1).toString()});
    return groups;
}

QList<Group> AddressBook::groups() const {
    QSqlQuery query = prepared(QStringLiteral("SELECT id, name FROM groups ORDER BY folded"));
    return loadGroups(query);
}

std::optional<Group> AddressBook::group(qint64 id) const {
    QSqlQuery query = prepared(QStringLiteral("SELECT id, name FROM groups WHERE id = ?"));
    query.addBindValue(id);
    const QList<Group> found = loadGroups(query);
    return found.isEmpty() ? std::nullopt : std::optional<Group>(found.constFirst());
}

std::optional<Group> AddressBook::groupNamed(const QString& name) const {
    QSqlQuery query = prepared(QStringLiteral("SELECT id, name FROM groups WHERE folded = ?"));
    query.addBindValue(name.toCaseFolded());
    const QList<Group> found = loadGroups(query);
    return found.isEmpty() ? std::nullopt : std::optional<Group>(found.constFirst());
}

QList<Group> AddressBook::groupsOf(qint64 personId) const {
    QSqlQuery query = prepared(
        QStringLiteral("SELECT g.id, g.name FROM groups g JOIN group_members m ON m.group_id = "
                       "g.id WHERE m.person_id = ? ORDER BY g.folded"));
    query.addBindValue(personId);
    return loadGroups(query);
}

void AddressBook::inTransaction(const std::function<void()>& change) {
    QSqlDatabase db = QSqlDatabase::database(connectionName, false);
    if (!db.transaction())
        fail(db.lastError().text());
    try {
        change();
        if (!db.commit())
            fail(db.lastError().text());
    } catch (...) {
        db.rollback();
        throw;
    }
}

ImportSummary AddressBook::add(const QList<ImportedContact>& contacts) {
    ImportSummary summary;
    inTransaction([&] {
        QHash<QString, qint64> known;
        for (const Person& person : persons())
            known.insert(personKey(person), person.id);
        QSet<QString> groupNames;
        for (const ImportedContact& contact : contacts) {
            const QString key = personKey(contact.person);
            qint64 id = known.value(key, 0);
            if (id != 0) {
                ++summary.personsKnown;
            } else {
                id = insertPerson(contact.person);
                known.insert(key, id);
                ++summary.personsAdded;
            }
            for (const QString& name : contact.groups) {
                groupNames.insert(name.toCaseFolded());
                insertMember(groupId(name), id);
            }
        }
        summary.groups = static_cast<int>(groupNames.size());
    });
    return summary;
}

qint64 AddressBook::insertPerson(const Person& person) {
    QSqlQuery insert = prepared(QStringLiteral(
        "INSERT INTO persons (first_name, last_name, primary_position) VALUES (?, ?, ?)"));
    insert.addBindValue(person.firstName);
    insert.addBindValue(person.lastName);
    insert.addBindValue(person.emails.isEmpty() ? -1 : person.primary);
    run(insert);
    const qint64 id = insert.lastInsertId().toLongLong();
    insertEmails(id, person.emails);
    return id;
}

void AddressBook::insertEmails(qint64 personId, const QStringList& emails) {
    QSqlQuery email = prepared(
        QStringLiteral("INSERT INTO emails (person_id, position, address) VALUES (?, ?, ?)"));
    for (qsizetype i = 0; i < emails.size(); ++i) {
        email.bindValue(0, personId);
        email.bindValue(1, static_cast<int>(i));
        email.bindValue(2, emails.at(i));
        run(email);
    }
}

qint64 AddressBook::groupId(const QString& name) {
    if (const std::optional<Group> existing = groupNamed(name))
        return existing->id;
    QSqlQuery insert = prepared(QStringLiteral("INSERT INTO groups (name, folded) VALUES (?, ?)"));
    insert.addBindValue(name);
    insert.addBindValue(name.toCaseFolded());
    run(insert);
    return insert.lastInsertId().toLongLong();
}

void AddressBook::insertMember(qint64 group, qint64 person) {
    execute("INSERT OR IGNORE INTO group_members (group_id, person_id, position) VALUES (?, ?, "
            "(SELECT COALESCE(MAX(position), 0) + 1 FROM group_members WHERE group_id = ?))",
            {group, person, group});
}

void AddressBook::execute(const char* sql, const QVariantList& values) {
    QSqlQuery query = prepared(QString::fromLatin1(sql));
    for (const QVariant& value : values)
        query.addBindValue(value);
    run(query);
}

void AddressBook::requirePerson(qint64 personId) const {
    if (!person(personId))
        refuse("NoSuchPerson",
               LocalizedString("The address book has no person numbered %1.").arg(personId));
}

void AddressBook::requireGroup(qint64 groupId) const {
    if (!group(groupId))
        refuse("NoSuchGroup",
               LocalizedString("The address book has no group numbered %1.").arg(groupId));
}

QString AddressBook::newGroupName(const QString& name, qint64 renamedGroupId) const {
    const QString trimmed = name.trimmed();
    if (trimmed.isEmpty())
        refuse("NoGroupName", LocalizedString("A group needs a name."));
    checkName(trimmed);
    const std::optional<Group> existing = groupNamed(trimmed);
    if (existing && existing->id != renamedGroupId)
        refuse("GroupNameTaken",
               LocalizedString("There is already a group named \"%1\".").arg(existing->name));
    return trimmed;
}

qint64 AddressBook::addPerson(const Person& person) {
    checkPerson(person);
    qint64 id = 0;
    inTransaction([&] { id = insertPerson(person); });
    return id;
}

void AddressBook::updatePerson(const Person& person) {
    checkPerson(person);
    inTransaction([&] {
        requirePerson(person.id);
        execute("UPDATE persons SET first_name = ?, last_name = ?, primary_position = ? "
                "WHERE id = ?",
                {person.firstName, person.lastName, person.emails.isEmpty() ? -1 : person.primary,
                 person.id});
        execute("DELETE FROM emails WHERE person_id = ?", {person.id});
        insertEmails(person.id, person.emails);
    });
}

void AddressBook::removePerson(qint64 personId) {
    inTransaction([&] {
        requirePerson(personId);
        execute("DELETE FROM persons WHERE id = ?", {personId});
    });
}

qint64 AddressBook::addGroup(const QString& name) {
    qint64 id = 0;
    inTransaction([&] { id = groupId(newGroupName(name, 0)); });
    return id;
}

void AddressBook::renameGroup(qint64 groupId, const QString& name) {
    inTransaction([&] {
        requireGroup(groupId);
        const QString newName = newGroupName(name, groupId);
        execute("UPDATE groups SET name = ?, folded = ? WHERE id = ?",
                {newName, newName.toCaseFolded(), groupId});
    });
}

void AddressBook::removeGroup(qint64 groupId) {
    inTransaction([&] {
        requireGroup(groupId);
        execute("DELETE FROM groups WHERE id = ?", {groupId});
    });
}

void AddressBook::addMember(qint64 groupId, qint64 personId) {
    inTransaction([&] {
        requireGroup(groupId);
        requirePerson(personId);
        insertMember(groupId, personId);
    });
}

void AddressBook::removeMember(qint64 groupId, qint64 personId) {
    inTransaction([&] {
        requireGroup(groupId);
        requirePerson(personId);
        execute("DELETE FROM group_members WHERE group_id = ? AND person_id = ?",
                {groupId, personId});
    });
}
