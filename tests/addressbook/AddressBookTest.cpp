#include "addressbook/AddressBook.h"
#include "RowName.h"
#include "addressbook/ContactsFile.h"
#include "addressbook/CsvImporter.h"
#include "addressbook/ImportError.h"
#include "addressbook/PersonFilter.h"
#include "addressbook/VCardImporter.h"
#include "fuzz/ImportFuzz.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QProcess>
#include <QSqlDatabase>
#include <QSqlQuery>
#include <QTemporaryDir>
#include <gtest/gtest.h>

#include <sys/stat.h>

// The cases of tests/data/import/cases.txt and tests/data/addressbook/changes.txt, whose heads
// tell their form; a contact is written in both as first|last|addresses|groups.
namespace {

struct Case {
    std::string name;
    QString kind, input, expected;
};

void PrintTo(const Case& row, std::ostream* out) {
    *out << row.name;
}

std::vector<Case> cases(const char* file) {
    QFile data(QStringLiteral(PELMO_TEST_DATA "/") + QLatin1String(file));
    EXPECT_TRUE(data.open(QIODevice::ReadOnly));
    std::vector<Case> all;
    for (const QString& block : QString::fromUtf8(data.readAll()).split("\n== ").mid(1)) {
        const QString body = block.section('\n', 1);
        const qsizetype cut = ('\n' + body).indexOf("\n--\n");
        all.push_back({block.section(' ', 0, 0).section('\n', 0, 0).toStdString(),
                       block.section('\n', 0, 0).section(' ', 1), body.left(cut),
                       body.mid(cut + 3).trimmed()});
    }
    return all;
}

QString contactLine(const Person& person, const QStringList& groups) {
    const auto nameOrTilde = [](const QString& part) { return part.isNull() ? "~" : part; };
    QStringList addresses;
    for (qsizetype i = 0; i < person.emails.size(); ++i)
        addresses << (i == person.primary ? "*" : "") + person.emails[i];
    if (person.emails.isEmpty() && person.primary != -1)
        addresses << QStringLiteral("primary %1 of none").arg(person.primary);
    return QStringList{nameOrTilde(person.firstName), nameOrTilde(person.lastName),
                       addresses.join(';'), groups.join(';')}
        .join('|');
}

ImportedContact contactOf(const QString& line) {
    const QStringList parts = line.split('|');
    const auto name = [](const QString& part) { return part == "~" ? QString() : part; };
    ImportedContact contact{{0, name(parts[0]), name(parts.value(1)), {}, -1},
                            parts.value(3).split(';', Qt::SkipEmptyParts)};
    for (const QString& address : parts.value(2).split(';', Qt::SkipEmptyParts)) {
        if (address.startsWith('*'))
            contact.person.primary = static_cast<int>(contact.person.emails.size());
        if (address != "*") // alone, a primary past the addresses
            contact.person.emails << address.mid(address.startsWith('*') ? 1 : 0);
    }
    return contact;
}

// The case's text as bytes: "\r", "\n", "\t", "\\" and "\xHH" are those bytes, "\c" drops the line
// end.
QByteArray unescaped(const QString& text) {
    const QByteArray in = text.toUtf8();
    QByteArray bytes;
    for (qsizetype i = 0; i < in.size(); ++i) {
        if (in[i] != '\\' || i + 1 == in.size())
            bytes += in[i];
        else if (in[++i] == 'x')
            bytes += static_cast<char>(in.mid(i + 1, 2).toInt(nullptr, 16)), i += 2;
        else if (in[i] == 'c')
            ++i;
        else
            bytes += in[i] == 'r' ? '\r' : in[i] == 'n' ? '\n' : in[i] == 't' ? '\t' : in[i];
    }
    return bytes;
}

class Import : public ::testing::TestWithParam<Case> {};

TEST_P(Import, Case) {
    const QByteArray input = unescaped(GetParam().input);
    QStringList lines;
    try {
        const QString& kind = GetParam().kind;
        const ParsedContacts parsed =
            kind == "vcard" ? VCardImporter::parse(input)
            : kind == "csv" ? CsvImporter::parse(input)
                            : ContactsFile::read(PELMO_TEST_DATA "/import/" + input.trimmed());
        for (const auto& [person, groups] : parsed.contacts)
            lines << contactLine(person, groups);
        for (const SkippedValue& skipped : parsed.skipped)
            lines << QStringLiteral("skipped %1: %2").arg(skipped.line).arg(skipped.reason);
        if (parsed.contactsSkipped > 0)
            lines << QStringLiteral("%1 left out").arg(parsed.contactsSkipped);
    } catch (const ImportError& error) {
        EXPECT_EQ(error.name(), "MalformedContactsFile");
        lines << QStringLiteral("error %1: %2").arg(error.line()).arg(error.reason());
    }
    EXPECT_EQ(lines.join('\n').toStdString(), GetParam().expected.toStdString());
}

INSTANTIATE_TEST_SUITE_P(Contacts, Import, ::testing::ValuesIn(cases("import/cases.txt")),
                         RowName());

// What the importers' fuzz targets require of any input, over their seed files.
TEST(Import, FuzzSeedsKeepTheFuzzProperties) {
    for (const auto& [folder, parse] : {std::pair{"CsvFuzz", &CsvImporter::parse},
                                        std::pair{"VCardFuzz", &VCardImporter::parse}}) {
        const QDir seeds(PELMO_TEST_DATA "/fuzz/" + QLatin1String(folder));
        ASSERT_FALSE(seeds.isEmpty());
        for (const QString& name : seeds.entryList(QDir::Files)) {
            QFile seed(seeds.filePath(name));
            ASSERT_TRUE(seed.open(QIODevice::ReadOnly));
            fuzz::checkImport(parse, seed.readAll());
        }
    }
}

// Persons as their contact lines, with the groups they are in; then each group and its members.
QString dump(const AddressBook& book) {
    QStringList lines;
    for (const Person& person : book.persons()) {
        QStringList groups;
        for (const Group& group : book.groupsOf(person.id))
            groups << group.name;
        lines << contactLine(person, groups);
    }
    for (const Group& group : book.groups()) {
        QStringList members;
        const std::optional<QList<Person>> inGroup = book.members(group.id);
        for (const Person& member : *inGroup)
            members << member.fullName();
        lines << (group.name + ": " + members.join(", ")).trimmed();
    }
    return lines.join('\n');
}

QString modeOf(const QString& path) {
    struct stat status {};
    return ::stat(qPrintable(path), &status) ? "-" : QString::number(status.st_mode & 07777, 8);
}

// Does one line of a case to the book, answering what it answers.
QString apply(AddressBook& book, const QStringList& words) {
    const QString& op = words[0];
    const qint64 id = words.value(1).toLongLong(), other = words.value(2).toLongLong();
    Person person = contactOf(words.value(op == "add" ? 1 : 2)).person;
    person.id = id;
    if (op == "add")
        return QString::number(book.addPerson(person));
    if (op == "update")
        book.updatePerson(person);
    if (op == "remove")
        book.removePerson(id);
    if (op == "group")
        return QString::number(book.addGroup(words[1]));
    if (op == "rename")
        book.renameGroup(id, words[2]);
    if (op == "ungroup")
        book.removeGroup(id);
    if (op == "join")
        book.addMember(id, other);
    if (op == "leave")
        book.removeMember(id, other);
    if (op == "person")
        return book.person(id) ? contactLine(*book.person(id), {}) : "none";
    if (op == "named")
        return book.groupNamed(words[1]) ? QString::number(book.groupNamed(words[1])->id) : "none";
    if (op == "members")
        return book.members(id) ? QString::number(book.members(id)->size()) : "none";
    const QString path = QFileInfo(book.path()).dir().filePath(words.value(1));
    if (op == "mkdir")
        ::mkdir(path.toLocal8Bit().constData(), words[2].toUInt(nullptr, 8));
    if (op == "touch" && QFile(path).open(QIODevice::WriteOnly))
        ::chmod(path.toLocal8Bit().constData(), words[2].toUInt(nullptr, 8));
    if (op == "mode")
        return modeOf(path);
    if (op == "open") { // another book, at a path or in the data folder, and the mode of its file
        std::optional<AddressBook> opened;
        words.size() > 1 ? opened.emplace(path) : opened.emplace();
        return modeOf(opened->path());
    }
    if (op == "elsewhere") { // on a second connection to the same file
        AddressBook elsewhere(book.path());
        return apply(elsewhere, words.mid(1));
    }
    if (op == "import" || op == "importfile") {
        QList<ImportedContact> contacts;
        for (const QString& line : words.mid(1))
            contacts << contactOf(line);
        const ImportSummary summary = op == "import" ? book.add(contacts) : book.importFile(path);
        return QStringLiteral("%1 added, %2 updated, %3 unchanged, %4 new groups")
            .arg(summary.personsAdded)
            .arg(summary.personsUpdated)
            .arg(summary.personsUnchanged)
            .arg(summary.groupsAdded);
    }
    if (op == "export")
        return QString::number(book.exportFile(path, words.size() > 2 ? words[2] : QString()));
    if (op == "dump")
        return dump(book);
    if (op == "find") {
        QStringList names;
        for (const Person& found : PersonFilter::filter(book.persons(), words.value(1)))
            names << found.fullName();
        return names.isEmpty() ? "none" : names.join(", ");
    }
    if (op == "into") { // on another book in the folder
        AddressBook another(path);
        return apply(another, words.mid(2));
    }
    if (op == "sql") { // straight to the file, past the book
        {
            QSqlDatabase raw = QSqlDatabase::addDatabase("QSQLITE", "raw");
            raw.setDatabaseName(book.path());
            EXPECT_TRUE(raw.open() && QSqlQuery(raw).exec(words[1]));
        }
        QSqlDatabase::removeDatabase("raw");
    }
    return {};
}

class Book : public ::testing::TestWithParam<Case> {};

TEST_P(Book, Change) {
    QTemporaryDir folder;
    const QByteArray saved = qgetenv("XDG_DATA_HOME");
    qputenv("XDG_DATA_HOME", folder.path().toUtf8());
    const mode_t mask = ::umask(0);
    AddressBook book(folder.filePath("book.sqlite"));
    apply(book, {"import", "Alan|Turing|alan@example.org;*turing@work.example|Club",
                 "Ada|Lovelace|*ada@example.org|Club"});
    QStringList lines;
    for (const QString& line : GetParam().input.split('\n', Qt::SkipEmptyParts)) {
        const QString before = dump(book);
        try {
            lines << apply(book, QProcess::splitCommand(QString::fromUtf8(unescaped(line))));
        } catch (const PelmoException& failure) {
            lines << QString::fromUtf8(failure.what()).replace(book.path(), "BOOK");
            EXPECT_EQ(dump(book).toStdString(), before.toStdString()) << "kept whole or not at all";
        }
    }
    lines.removeAll(QString());
    EXPECT_EQ((lines.join('\n') + "\n--\n" + dump(book)).trimmed().toStdString(),
              GetParam().expected.toStdString());
    ::umask(mask);
    qputenv("XDG_DATA_HOME", saved);
}

INSTANTIATE_TEST_SUITE_P(Rules, Book, ::testing::ValuesIn(cases("addressbook/changes.txt")),
                         RowName());

} // namespace
