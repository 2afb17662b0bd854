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
                          "  pelmo contacts export [--group NAME] FILE.vcf\n"
                          "  pelmo contacts list [--group NAME]\n"
                          "  pelmo contacts groups\n";

int contactsUsage() {
    QTextStream(stderr) << kUsage;
    return 2;
}

QString counted(int count, const char* one, const char* many) {
    return QStringLiteral("%1 %2").arg(count).arg(LocalizedString(count == 1 ? one : many));
}

// One line for the counts, then one for each value the file could not give, so that the user
// can mend those lines and import the file again (which adds nothing twice).
int importContacts(const QString& path) {
    AddressBook book;
    ImportSummary summary;
    try {
        summary = book.importFile(path);
    } catch (const ImportError& unusable) {
        return fail(path + QStringLiteral(": ") + unusable.reason());
    }
    QTextStream out(stdout);
    out << summary.headline(QFileInfo(path).fileName()) << '\n';
    for (const QString& skipped : summary.skippedLines())
        out << skipped << '\n';
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

int noSuchGroup(const AddressBook& book, const QString& groupName) {
    QStringList known;
    for (const Group& each : book.groups())
        known << each.name;
    return fail(known.isEmpty()
                    ? LocalizedString("the address book has no group \"%1\"; it has no groups "
                                      "yet.")
                          .arg(groupName)
                    : LocalizedString("the address book has no group \"%1\"; its groups are: "
                                      "%2.")
                          .arg(groupName, known.join(QStringLiteral(", "))));
}

int listContacts(const QString& groupName, bool byGroup) {
    AddressBook book;
    QList<Person> persons;
    if (byGroup) {
        const std::optional<Group> group = book.groupNamed(groupName);
        if (!group)
            return noSuchGroup(book, groupName);
        persons = book.members(group->id).value_or(QList<Person>());
    } else {
        persons = book.persons();
    }
    QTextStream out(stdout);
    for (const Person& person : persons)
        out << listLine(person) << '\n';
    return 0;
}

int exportContacts(const QString& path, const QString& groupName) {
    const AddressBook book;
    if (!groupName.isNull() && !book.groupNamed(groupName))
        return noSuchGroup(book, groupName);
    const int written = book.exportFile(path, groupName);
    QTextStream(stdout) << LocalizedString("Exported %1 to %2.")
                               .arg(counted(written, LocalizedKey("person"),
                                            LocalizedKey("persons")),
                                    QFileInfo(path).fileName())
                        << '\n';
    return 0;
}

int listGroups() {
    const AddressBook book;
    const QHash<qint64, int> counts = book.memberCounts();
    QTextStream out(stdout);
    for (const Group& group : book.groups())
        out << group.name << '\t' << counts.value(group.id) << '\n';
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
        if (args.size() == 2 && args.at(0) == QLatin1String("export"))
            return exportContacts(args.at(1), QString());
        if (args.size() == 4 && args.at(0) == QLatin1String("export") &&
            args.at(1) == QLatin1String("--group"))
            return exportContacts(args.at(3), args.at(2));
        if (args == QStringList{QStringLiteral("groups")})
            return listGroups();
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
