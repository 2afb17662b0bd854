#include "app/Commands.h"

#include "addressbook/AddressBook.h"
#include "addressbook/ContactsFile.h"
#include "addressbook/ImportError.h"
#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"

#include <QFileInfo>
#include <QTextStream>

#include <cstdio>

namespace Commands {

namespace {

int fail(const QString& message) {
    QTextStream(stderr) << "pelmo: " << message << '\n';
    return 1;
}

constexpr char kUsage[] = "usage:\n  pelmo contacts import FILE\n"
                          "  pelmo contacts list [--group NAME]\n";

int contactsUsage() {
    QTextStream(stderr) << kUsage;
    return 2;
}

QString counted(int count, const char* one, const char* many) {
    return QStringLiteral("%1 %2").arg(count).arg(LocalizedString(count == 1 ? one : many));
}

int importContacts(const QString& path) {
    QList<ImportedContact> contacts;
    try {
        contacts = ContactsFile::read(path);
    } catch (const ImportError& malformed) {
        return fail(path + QStringLiteral(": ") + malformed.reason());
    }
    AddressBook book;
    const ImportSummary summary = book.add(contacts);
    QString line = LocalizedString("Imported %1 and %2 from %3.")
                       .arg(counted(summary.personsAdded, "person", "persons"),
                            counted(summary.groups, "group", "groups"), QFileInfo(path).fileName());
    if (summary.personsKnown > 0)
        line += QLatin1Char(' ') + LocalizedString("%1 already in the address book.")
                                       .arg(counted(summary.personsKnown, "was", "were"));
    QTextStream(stdout) << line << '\n';
    return 0;
}

QString listLine(const Person& person) {
    const QString name = person.fullName();
    const QString address = person.primaryEmail();
    if (address.isEmpty())
        return name;
    const QString bracketed = QLatin1Char('<') + address + QLatin1Char('>');
    return name.isEmpty() ? bracketed : name + QLatin1Char(' ') + bracketed;
}

int listContacts(const QString& groupName, bool byGroup) {
    AddressBook book;
    QList<Person> persons;
    if (byGroup) {
        const std::optional<Group> group = book.groupNamed(groupName);
        if (!group) {
            QStringList known;
            for (const Group& each : book.groups())
                known << each.name;
            return fail(known.isEmpty()
                            ? LocalizedString("the address book has no group \"%1\"; it has "
                                              "no groups yet.")
                                  .arg(groupName)
                            : LocalizedString("the address book has no group \"%1\"; its groups "
                                              "are: %2.")
                                  .arg(groupName, known.join(QStringLiteral(", "))));
        }
        persons = book.members(group->id).value_or(QList<Person>());
    } else {
        persons = book.persons();
    }
    QTextStream out(stdout);
    for (const Person& person : persons)
        out << listLine(person) << '\n';
    return 0;
}

} // namespace

int contacts(const QStringList& args) {
    if (args == QStringList{QStringLiteral("--help")}) {
        QTextStream(stdout) << kUsage;
        return 0;
    }
    try {
        if (args.size() == 2 && args.at(0) == QLatin1String("import"))
            return importContacts(args.at(1));
        if (args.size() == 1 && args.at(0) == QLatin1String("list"))
            return listContacts(QString(), false);
        if (args.size() == 3 && args.at(0) == QLatin1String("list") &&
            args.at(1) == QLatin1String("--group"))
            return listContacts(args.at(2), true);
    } catch (const PelmoException& failure) {
        return fail(failure.reason());
    }
    return contactsUsage();
}

} // namespace Commands
