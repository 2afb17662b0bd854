#include "addressbook/ImportSummary.h"

#include "util/LocalizedStrings.h"

namespace {

QString counted(int count, const char* one, const char* many) {
    return QStringLiteral("%1 %2").arg(count).arg(LocalizedString(count == 1 ? one : many));
}

} // namespace

QString ImportSummary::headline(const QString& fileName) const {
    QString line =
        LocalizedString("Imported %1: %2 added, %3 updated, %4 skipped; %5.")
            .arg(fileName, counted(personsAdded, LocalizedKey("person"), LocalizedKey("persons")))
            .arg(personsUpdated)
            .arg(personsSkipped)
            .arg(counted(groupsAdded, LocalizedKey("new group"), LocalizedKey("new groups")));
    if (personsUnchanged > 0)
        line += QLatin1Char(' ') +
                LocalizedString("%1 already in the address book as in the "
                                "file.")
                    .arg(counted(personsUnchanged, LocalizedKey("was"), LocalizedKey("were")));
    return line;
}

QStringList ImportSummary::skippedLines() const {
    QStringList lines;
    for (const SkippedValue& value : skipped)
        lines << LocalizedString("line %1: %2 (skipped)").arg(value.line).arg(value.reason);
    return lines;
}
