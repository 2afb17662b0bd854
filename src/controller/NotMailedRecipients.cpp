#include "controller/NotMailedRecipients.h"

#include "util/LocalizedStrings.h"
#include "util/TextUtilities.h"

#include <QLocale>

#include <algorithm>

void NotMailedRecipients::addPerson(const Person& person, const QString& reason) {
    for (int row = 0; row < entries.size(); ++row)
        if (entries.at(row).person.id == person.id)
            removeRow(row--);
    const int row = static_cast<int>(entries.size());
    beginInsertRows({}, row, row);
    entries.append({person, reason, QDateTime::currentDateTime()});
    endInsertRows();
}

void NotMailedRecipients::removeAddress(const QString& address) {
    for (int row = 0; row < entries.size(); ++row)
        if (entries.at(row).person.primaryEmail().compare(address, Qt::CaseInsensitive) == 0)
            removeRow(row--);
}

QList<Person> NotMailedRecipients::takePersons(QList<int> rows) {
    if (rows.isEmpty())
        for (int row = 0; row < entries.size(); ++row)
            rows << row;
    std::sort(rows.begin(), rows.end());
    rows.erase(std::unique(rows.begin(), rows.end()), rows.end());
    QList<Person> taken;
    // From the bottom, so that the rows not yet removed keep their numbers.
    for (auto row = rows.crbegin(); row != rows.crend(); ++row) {
        if (*row < 0 || *row >= entries.size())
            continue;
        taken.prepend(entries.at(*row).person);
        removeRow(*row);
    }
    return taken;
}

void NotMailedRecipients::clear() {
    beginResetModel();
    entries.clear();
    endResetModel();
}

void NotMailedRecipients::removeRow(int row) {
    beginRemoveRows({}, row, row);
    entries.removeAt(row);
    endRemoveRows();
}

int NotMailedRecipients::rowCount(const QModelIndex& parent) const {
    return parent.isValid() ? 0 : static_cast<int>(entries.size());
}

int NotMailedRecipients::columnCount(const QModelIndex& parent) const {
    return parent.isValid() ? 0 : ColumnCount;
}

QVariant NotMailedRecipients::data(const QModelIndex& index, int role) const {
    if (!checkIndex(index, CheckIndexOption::IndexIsValid))
        return {};
    const Entry& entry = entries.at(index.row());
    if (role == Qt::ToolTipRole)
        return index.column() == Time ? DateDescription(entry.time) : entry.reason;
    if (role != Qt::DisplayRole)
        return {};
    switch (index.column()) {
    case Name:
        return entry.person.fullName();
    case Address:
        return entry.person.primaryEmail();
    case Reason:
        return entry.reason;
    default:
        // The day is in the tooltip: a run rarely outlasts it.
        return QLocale().toString(entry.time.time(), QLocale::ShortFormat);
    }
}

QVariant NotMailedRecipients::headerData(int section, Qt::Orientation orientation, int role) const {
    if (orientation != Qt::Horizontal || role != Qt::DisplayRole)
        return QAbstractTableModel::headerData(section, orientation, role);
    switch (section) {
    case Name:
        return LocalizedStringNS("Name");
    case Address:
        return LocalizedStringNS("Email Address");
    case Reason:
        return LocalizedStringNS("Reason");
    default:
        return LocalizedStringNS("Time");
    }
}
