#include "addressbook/CsvImporter.h"

#include "addressbook/ImportError.h"
#include "addressbook/ImportText.h"
#include "util/LocalizedStrings.h"

#include <QHash>

#include <array>

namespace {

struct Record {
    int line = 0;
    QStringList fields;
    /** Why the record cannot be read, or null; it is then left out whole. */
    QString fault;
    int faultLine = 0;
};

// RFC 4180 section 2, with the separator the header line uses: records end in CRLF or LF (a
// lone CR too in a file that has no LF at all, as old Mac programs wrote); a field in double
// quotes may hold separators, line breaks and doubled quotes. Spaces before an opening or after
// a closing quote are tolerated, as some spreadsheet programs write them. A record that breaks
// these rules is kept with its fault, so that one bad row costs only itself.
class RecordReader {
public:
    RecordReader(const QString& source, QChar separatorChar)
        : text(source), separator(separatorChar),
          loneCrEndsLines(!source.contains(QLatin1Char('\n'))) {}

    QList<Record> read() {
        for (i = 0; i < text.size(); ++i) {
            step(text[i]);
            if (i + 1 == text.size() && state == Quoted)
                readOnAfterUnclosedQuote();
        }
        if (state != FieldStart || !fields.isEmpty())
            endRecord();
        return records;
    }

private:
    enum State { FieldStart, Unquoted, Quoted, AfterQuote };

    bool atLineBreak(qsizetype at) const {
        const QChar c = text[at];
        if (c == QLatin1Char('\n'))
            return true;
        return c == QLatin1Char('\r') &&
               (loneCrEndsLines || (at + 1 < text.size() && text[at + 1] == QLatin1Char('\n')));
    }

    // Consumes the line break at i (CRLF counts once) and counts the line.
    void skipLineBreak() {
        if (text[i] == QLatin1Char('\r') && i + 1 < text.size() && text[i + 1] == QLatin1Char('\n'))
            ++i;
        ++line;
    }

    void markFault(const char* reason) {
        if (fault.isNull()) {
            fault = LocalizedString(reason);
            faultLine = line;
        }
    }

    void step(QChar c) {
        if (state == Quoted) {
            quotedStep(c);
        } else if (c == separator) {
            fields.append(field);
            field.clear();
            state = FieldStart;
        } else if (atLineBreak(i)) {
            skipLineBreak();
            endRecord();
        } else if (c == QLatin1Char('"')) {
            if (state == AfterQuote || !field.trimmed().isEmpty()) {
                markFault(LocalizedKey(
                    "a double quote stands inside a field that does not begin with one"));
                return;
            }
            field.clear();
            quoteLine = line;
            quoteStart = i;
            state = Quoted;
        } else if (state == AfterQuote) {
            if (!c.isSpace())
                markFault(LocalizedKey("text follows the closing quote of a field"));
        } else {
            field += c;
            state = Unquoted;
        }
    }

    void quotedStep(QChar c) {
        if (c == QLatin1Char('"')) {
            if (i + 1 < text.size() && text[i + 1] == QLatin1Char('"')) {
                field += c;
                ++i;
            } else {
                state = AfterQuote;
            }
        } else if (atLineBreak(i)) {
            skipLineBreak();
            field += QLatin1Char('\n');
        } else {
            field += c;
        }
    }

    // A quote never closed would swallow the rest of the file: its record is left out and
    // reading goes on at the line after the quote.
    void readOnAfterUnclosedQuote() {
        records.append({recordLine,
                        {},
                        LocalizedString("the quoted field that opens here is "
                                        "not closed"),
                        quoteLine});
        fields.clear();
        field.clear();
        fault.clear();
        state = FieldStart;
        line = quoteLine;
        for (i = quoteStart; i < text.size() && !atLineBreak(i); ++i) {
        }
        if (i < text.size())
            skipLineBreak();
        recordLine = line;
    }

    void endRecord() {
        fields.append(field);
        records.append({recordLine, fields, fault, faultLine});
        fields.clear();
        field.clear();
        fault.clear();
        state = FieldStart;
        recordLine = line;
    }

    const QString& text;
    const QChar separator;
    const bool loneCrEndsLines;
    qsizetype i = 0;
    State state = FieldStart;
    QString field;
    QStringList fields;
    QString fault;
    int faultLine = 0;
    QList<Record> records;
    int line = 1;
    int recordLine = 1;
    int quoteLine = 0;
    qsizetype quoteStart = 0;
};

// The separator is the one of ",", ";" and tab that the header line uses most, outside quotes:
// Excel writes ";" where the decimal mark is a comma, and Outlook's Unicode export uses tabs.
QChar separatorOf(const QString& text) {
    const std::array<QChar, 3> candidates = {QLatin1Char(','), QLatin1Char(';'), QLatin1Char('\t')};
    std::array<int, 3> counts{};
    bool quoted = false;
    for (const QChar c : text) {
        if (c == QLatin1Char('"'))
            quoted = !quoted;
        else if (!quoted && (c == QLatin1Char('\n') || c == QLatin1Char('\r')))
            break;
        for (size_t k = 0; k < candidates.size(); ++k)
            if (!quoted && c == candidates[k])
                ++counts[k];
    }
    size_t best = 0;
    for (size_t k = 1; k < candidates.size(); ++k)
        if (counts[k] > counts[best])
            best = k;
    return candidates[best];
}

enum class Column { FirstName, LastName, DisplayName, Email, Groups };

// Header names as keys: letters and digits only, lower case.
QString headerKey(const QString& name) {
    QString key;
    for (const QChar c : name)
        if (c.isLetterOrNumber())
            key += c.toLower();
    return key;
}

// The column names that exporters write, one row each; a new export format is a few rows
// more. Several e-mail columns give several addresses, in the order of the columns, the first
// one primary. Names are compared as header keys.
struct KnownColumn {
    const char* name;
    Column column;
};

constexpr KnownColumn kKnownColumns[] = {
    {"first name", Column::FirstName}, // Thunderbird, Outlook, our own
    {"given name", Column::FirstName}, // Google
    {"forename", Column::FirstName},
    {"vorname", Column::FirstName},    // German Outlook
    {"last name", Column::LastName},   // Thunderbird, Outlook, our own
    {"family name", Column::LastName}, // Google
    {"surname", Column::LastName},
    {"nachname", Column::LastName},        // German Outlook
    {"display name", Column::DisplayName}, // Thunderbird
    {"name", Column::DisplayName},         // Google
    {"full name", Column::DisplayName},
    {"anzeigename", Column::DisplayName}, // German Thunderbird
    {"e-mail", Column::Email},            // our own
    {"email addresses", Column::Email},
    {"primary email", Column::Email}, // Thunderbird
    {"secondary email", Column::Email},
    {"e-mail address", Column::Email}, // Outlook
    {"e-mail 2 address", Column::Email},
    {"e-mail 3 address", Column::Email},
    {"e-mail-adresse", Column::Email}, // German Outlook
    {"e-mail 2: adresse", Column::Email},
    {"e-mail 3: adresse", Column::Email},
    {"e-mail 1 - value", Column::Email}, // Google
    {"e-mail 2 - value", Column::Email},
    {"e-mail 3 - value", Column::Email},
    {"e-mail 4 - value", Column::Email},
    {"email home", Column::Email}, // address books of mobile phones
    {"email work", Column::Email},
    {"groups", Column::Groups}, // our own
    {"group", Column::Groups},
    {"categories", Column::Groups},       // Outlook
    {"kategorien", Column::Groups},       // German Outlook
    {"group membership", Column::Groups}, // Google
};

struct Columns {
    QHash<Column, int> single; // first of its kind
    QList<int> emails;
    QList<int> groups;
};

Columns columnsOf(const Record& header) {
    static const QHash<QString, Column> known = [] {
        QHash<QString, Column> table;
        for (const KnownColumn& each : kKnownColumns)
            table.insert(headerKey(QString::fromUtf8(each.name)), each.column);
        return table;
    }();
    Columns columns;
    for (int i = 0; i < header.fields.size(); ++i) {
        const auto found = known.constFind(headerKey(header.fields.at(i)));
        if (found == known.constEnd())
            continue;
        if (found.value() == Column::Email)
            columns.emails.append(i);
        else if (found.value() == Column::Groups)
            columns.groups.append(i);
        else if (!columns.single.contains(found.value()))
            columns.single.insert(found.value(), i);
    }
    if (columns.emails.isEmpty())
        throw ImportError(header.line,
                          LocalizedString("the header row names no e-mail column (expected "
                                          "\"first name\", \"last name\", \"e-mail\" and "
                                          "\"groups\", or the columns of a Google, Outlook or "
                                          "Thunderbird export)"));
    return columns;
}

// Lists in one field: ";" between values (Outlook's categories, our own), " ::: " in Google's
// exports.
QStringList listField(const QString& field) {
    QStringList values;
    for (const QString& part :
         QString(field).replace(QLatin1String(":::"), QLatin1String(";")).split(QLatin1Char(';')))
        if (const QString value = part.simplified(); !value.isEmpty())
            values.append(value);
    return values;
}

// Google marks its system groups with "* "; "My Contacts" and "Starred" are labels every
// contact or favourite has, not groups the user made.
QString groupName(const QString& value) {
    if (!value.startsWith(QLatin1String("* ")))
        return value;
    const QString name = value.mid(2).trimmed();
    const QString key = headerKey(name);
    return key == QLatin1String("mycontacts") || key == QLatin1String("starred") ? QString() : name;
}

bool hasControlCharacter(const QString& text) {
    for (const QChar c : text)
        if (c.category() == QChar::Other_Control)
            return true;
    return false;
}

// The row's contact, its bad values left out and reported.
void readRow(const Record& row, const Columns& columns, ParsedContacts& parsed) {
    const int before = static_cast<int>(parsed.skipped.size());
    const auto name = [&](Column column) {
        const int index = columns.single.value(column, -1);
        const QString value = index < 0 ? QString() : row.fields.value(index).simplified();
        if (!hasControlCharacter(value))
            return value;
        parsed.skip(row.line, LocalizedString("a name cannot hold a control character"));
        return QString();
    };
    ImportedContact contact;
    Person& person = contact.person;
    const QString first = name(Column::FirstName);
    const QString last = name(Column::LastName);
    const QString display = name(Column::DisplayName);
    if (!first.isEmpty())
        person.firstName = first;
    if (!last.isEmpty())
        person.lastName = last;
    if (first.isEmpty() && last.isEmpty())
        ImportText::splitFullName(display, person.firstName, person.lastName);
    for (const int index : columns.emails) {
        for (const QString& address : listField(row.fields.value(index))) {
            if (!ImportText::isPlausibleAddress(address))
                parsed.skip(row.line,
                            LocalizedString("\"%1\" is not an e-mail address").arg(address));
            else if (!person.emails.contains(address, Qt::CaseInsensitive))
                person.emails.append(address);
        }
    }
    person.primary = person.emails.isEmpty() ? -1 : 0;
    for (const int index : columns.groups) {
        for (const QString& value : listField(row.fields.value(index))) {
            const QString group = groupName(value);
            if (hasControlCharacter(group))
                parsed.skip(row.line, LocalizedString("a group name cannot hold a control "
                                                      "character"));
            else if (!group.isEmpty() && !contact.groups.contains(group, Qt::CaseInsensitive))
                contact.groups.append(group);
        }
    }
    if (!person.fullName().isEmpty() || !person.emails.isEmpty())
        parsed.contacts.append(contact);
    else if (parsed.skipped.size() > before)
        ++parsed.contactsSkipped;
}

} // namespace

ParsedContacts CsvImporter::parse(const QByteArray& data) {
    const QString text = ImportText::decodeUnlabelled(data);
    const QList<Record> records = RecordReader(text, separatorOf(text)).read();
    if (records.isEmpty())
        throw ImportError(0, LocalizedString("the file is empty"));
    const Record& header = records.constFirst();
    if (!header.fault.isNull())
        throw ImportError(header.faultLine, header.fault);
    const Columns columns = columnsOf(header);
    ParsedContacts parsed;
    for (qsizetype r = 1; r < records.size(); ++r) {
        const Record& row = records.at(r);
        if (!row.fault.isNull()) {
            parsed.skip(row.faultLine, row.fault);
            ++parsed.contactsSkipped;
        } else if (row.fields.size() > header.fields.size()) {
            parsed.skip(row.line, LocalizedString("this row has %1 fields but the header has %2")
                                      .arg(row.fields.size())
                                      .arg(header.fields.size()));
            ++parsed.contactsSkipped;
        } else {
            readRow(row, columns, parsed);
        }
    }
    return parsed;
}
