#include "addressbook/AddressBook.h"

#include "addressbook/ContactsFile.h"
#include "addressbook/ImportText.h"
#include "addressbook/VCardExporter.h"
#include "util/DataFolder.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"
#include "util/PrivateFiles.h"

#include <QFile>
#include <QHash>
#include <QSet>
#include <QSqlDatabase>
#include <QSqlError>
#include <QSqlQuery>

#include <algorithm>
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

constexpr const char* kPersonColumns = "p.id, p.first_name, p.last_name, p.primary_position";
constexpr const char* kInsertPerson =
    "INSERT INTO persons (first_name, last_name, primary_position) VALUES (?, ?, ?)";
constexpr const char* kInsertEmail =
    "INSERT INTO emails (person_id, position, address) VALUES (?, ?, ?)";
constexpr const char* kInsertMember =
    "INSERT OR IGNORE INTO group_members (group_id, person_id, position) VALUES (?, ?, "
    "(SELECT COALESCE(MAX(position), 0) + 1 FROM group_members WHERE group_id = ?))";

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
        // The file is a local one, which the system caches already; SQLite's own cache of it
        // (2 MB by default) would only double what a large group takes to load.
        "PRAGMA cache_size = -256",
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

// Where an import finds the persons it may be adding again: by address, and, for persons
// without any, by name.
struct AddressBook::Known {
    QList<Person> persons;
    QHash<QString, qsizetype> byAddress;
    QHash<QString, qsizetype> byNameAlone;

    // A primary address outranks the same address held as a secondary one by someone else.
    explicit Known(QList<Person> all) : persons(std::move(all)) {
        for (qsizetype at = 0; at < persons.size(); ++at) {
            if (persons[at].emails.isEmpty())
                byNameAlone.insert(persons[at].fullName().toCaseFolded(), at);
            else
                byAddress.insert(persons[at].primaryEmail().toCaseFolded(), at);
        }
        for (qsizetype at = 0; at < persons.size(); ++at)
            addAddresses(at, persons[at].emails);
    }

    void addAddresses(qsizetype at, const QStringList& addresses) {
        for (const QString& address : addresses)
            byAddress.insert(address.toCaseFolded(), byAddress.value(address.toCaseFolded(), at));
    }

    qsizetype find(const Person& person) const {
        if (person.emails.isEmpty())
            return byNameAlone.value(person.fullName().toCaseFolded(), -1);
        return byAddress.value(person.primaryEmail().toCaseFolded(), -1);
    }
};

ImportSummary AddressBook::add(const QList<ImportedContact>& contacts) {
    ImportSummary summary;
    inTransaction([&] {
        Known known(persons());
        const qsizetype before = known.persons.size();
        QHash<QString, qint64> groupIds;
        for (const Group& group : groups())
            groupIds.insert(group.name.toCaseFolded(), group.id);
        QSet<std::pair<qint64, qint64>> memberships;
        QSqlQuery current =
            prepared(QStringLiteral("SELECT group_id, person_id FROM group_members"));
        run(current);
        while (current.next())
            memberships.insert({current.value(0).toLongLong(), current.value(1).toLongLong()});
        QSqlQuery insertPersonQuery = prepared(QString::fromLatin1(kInsertPerson));
        QSqlQuery insertEmailQuery = prepared(QString::fromLatin1(kInsertEmail));
        QSqlQuery insertMemberQuery = prepared(QString::fromLatin1(kInsertMember));
        QSet<qint64> matched;
        QSet<qint64> updated;
        for (const auto& [incoming, groupNames] : contacts) {
            qsizetype at = known.find(incoming);
            bool changed = false;
            if (at < 0) {
                Person person = incoming;
                person.id = insertPerson(person, insertPersonQuery, insertEmailQuery);
                known.persons.append(person);
                at = known.persons.size() - 1;
                if (person.emails.isEmpty())
                    known.byNameAlone.insert(person.fullName().toCaseFolded(), at);
                known.addAddresses(at, person.emails);
                ++summary.personsAdded;
            } else {
                changed = merge(known, at, incoming, insertEmailQuery);
            }
            const qint64 personId = known.persons.at(at).id;
            for (const QString& name : groupNames) {
                qint64& group = groupIds[name.toCaseFolded()];
                if (group == 0) {
                    group = groupId(name);
                    ++summary.groupsAdded;
                }
                if (!memberships.contains({group, personId})) {
                    insertMember(insertMemberQuery, group, personId);
                    memberships.insert({group, personId});
                    changed = true;
                }
            }
            if (at < before) {
                matched.insert(personId);
                if (changed)
                    updated.insert(personId);
            }
        }
        summary.personsUpdated = static_cast<int>(updated.size());
        summary.personsUnchanged = static_cast<int>(matched.size() - updated.size());
    });
    return summary;
}

// The person at `at` gains what incoming has and it lacks; answers whether anything changed.
bool AddressBook::merge(Known& known, qsizetype at, const Person& incoming,
                        QSqlQuery& insertEmailQuery) {
    Person& person = known.persons[at];
    QStringList fresh;
    for (const QString& address : incoming.emails)
        if (!person.emails.contains(address, Qt::CaseInsensitive) &&
            !fresh.contains(address, Qt::CaseInsensitive))
            fresh.append(address);
    const bool hadNoAddress = person.emails.isEmpty();
    bool renamed = false;
    if (person.firstName.isEmpty() && !incoming.firstName.isEmpty()) {
        person.firstName = incoming.firstName;
        renamed = true;
    }
    if (person.lastName.isEmpty() && !incoming.lastName.isEmpty()) {
        person.lastName = incoming.lastName;
        renamed = true;
    }
    if (!fresh.isEmpty()) {
        insertEmails(insertEmailQuery, person.id, fresh, static_cast<int>(person.emails.size()));
        person.emails += fresh;
        known.addAddresses(at, fresh);
    }
    if (hadNoAddress && !fresh.isEmpty()) {
        known.byNameAlone.remove(person.fullName().toCaseFolded());
        person.primary = 0;
    }
    if (renamed || (hadNoAddress && !fresh.isEmpty()))
        execute("UPDATE persons SET first_name = ?, last_name = ?, primary_position = ? "
                "WHERE id = ?",
                {person.firstName, person.lastName, person.primary, person.id});
    return renamed || !fresh.isEmpty();
}

ImportSummary AddressBook::importFile(const QString& path) {
    const ParsedContacts parsed = ContactsFile::read(path);
    ImportSummary summary = add(parsed.contacts);
    summary.personsSkipped = parsed.contactsSkipped;
    summary.skipped = parsed.skipped;
    std::stable_sort(summary.skipped.begin(), summary.skipped.end(),
                     [](const SkippedValue& a, const SkippedValue& b) { return a.line < b.line; });
    return summary;
}

QHash<qint64, int> AddressBook::memberCounts() const {
    QSqlQuery query =
        prepared(QStringLiteral("SELECT group_id, COUNT(*) FROM group_members GROUP BY group_id"));
    run(query);
    QHash<qint64, int> counts;
    while (query.next())
        counts.insert(query.value(0).toLongLong(), query.value(1).toInt());
    return counts;
}

int AddressBook::exportFile(const QString& path, const QString& groupName) const {
    QList<ImportedContact> contacts;
    if (!groupName.isNull()) {
        const std::optional<Group> group = groupNamed(groupName);
        if (!group)
            refuse("NoSuchGroup",
                   LocalizedString("The address book has no group named \"%1\".").arg(groupName));
        // Only the group's own name goes along: the other groups are none of the reader's
        // business.
        for (const Person& person : members(group->id).value_or(QList<Person>()))
            contacts.append({person, {group->name}});
    } else {
        QHash<qint64, QStringList> groupsOf;
        QSqlQuery query = prepared(
            QStringLiteral("SELECT m.person_id, g.name FROM group_members m JOIN groups g ON "
                           "g.id = m.group_id ORDER BY g.folded"));
        run(query);
        while (query.next())
            groupsOf[query.value(0).toLongLong()].append(query.value(1).toString());
        for (const Person& person : persons())
            contacts.append({person, groupsOf.value(person.id)});
    }
    const QByteArray cards = VCardExporter::write(contacts);
    QFile file(path);
    const auto cannotWrite = [&](const QString& reason) {
        refuse("ExportFailed",
               LocalizedString("The file \"%1\" cannot be written: %2").arg(path, reason));
    };
    if (!MakePrivateFile(std::filesystem::path(path.toStdString())))
        cannotWrite(QString::fromLocal8Bit(std::strerror(errno)));
    if (!file.open(QIODevice::WriteOnly | QIODevice::Truncate) ||
        file.write(cards) != cards.size() || !file.flush())
        cannotWrite(file.errorString());
    return static_cast<int>(contacts.size());
}

qint64 AddressBook::insertPerson(const Person& person, QSqlQuery& insert, QSqlQuery& email) {
    insert.bindValue(0, person.firstName);
    insert.bindValue(1, person.lastName);
    insert.bindValue(2, person.emails.isEmpty() ? -1 : person.primary);
    run(insert);
    const qint64 id = insert.lastInsertId().toLongLong();
    insertEmails(email, id, person.emails, 0);
    return id;
}

void AddressBook::insertEmails(QSqlQuery& email, qint64 personId, const QStringList& emails,
                               int firstPosition) {
    for (qsizetype i = 0; i < emails.size(); ++i) {
        email.bindValue(0, personId);
        email.bindValue(1, firstPosition + static_cast<int>(i));
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

void AddressBook::insertMember(QSqlQuery& insert, qint64 group, qint64 person) {
    insert.bindValue(0, group);
    insert.bindValue(1, person);
    insert.bindValue(2, group);
    run(insert);
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
    inTransaction([&] {
        QSqlQuery insert = prepared(QString::fromLatin1(kInsertPerson));
        QSqlQuery email = prepared(QString::fromLatin1(kInsertEmail));
        id = insertPerson(person, insert, email);
    });
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
        QSqlQuery email = prepared(QString::fromLatin1(kInsertEmail));
        insertEmails(email, person.id, person.emails, 0);
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
        QSqlQuery insert = prepared(QString::fromLatin1(kInsertMember));
        insertMember(insert, groupId, personId);
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
