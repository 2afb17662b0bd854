#include "addressbook/CsvImporter.h"

#include "addressbook/ImportError.h"
#include "addressbook/ImportText.h"
#include "util/LocalizedStrings.h"

#include <QHash>

namespace {

struct Record {
    int line;
    QStringList fields;
};

// RFC 4180 section 2: records end in CRLF (LF and a lone CR are accepted too); a field in
// double quotes may hold commas, line breaks and doubled quotes. Spaces before an opening or
// after a closing quote are tolerated, as some spreadsheet programs write them.
class RecordReader {
public:
    explicit RecordReader(const QString& source) : text(source) {}

    QList<Record> read() {
        for (i = 0; i < text.size(); ++i)
            step(text[i]);
        if (state == Quoted)
            throw ImportError(quoteLine, LocalizedString("the quoted field that opens here is "
                                                         "not closed"));
        if (state != FieldStart || !fields.isEmpty())
            endRecord();
        return records;
    }

private:
    enum State { FieldStart, Unquoted, Quoted, AfterQuote };

    bool atLineBreak(QChar c) const { return c == QLatin1Char('\r') || c == QLatin1Char('\n'); }

    // Consumes a line break at i (CRLF counts once) and counts the line.
    void skipLineBreak() {
        if (text[i] == QLatin1Char('\r') && i + 1 < text.size() && text[i + 1] == QLatin1Char('\n'))
            ++i;
        ++line;
    }

    void step(QChar c) {
        if (state == Quoted) {
            quotedStep(c);
            return;
        }
        if (c == QLatin1Char(',')) {
            fields.append(field);
            field.clear();
            state = FieldStart;
        } else if (atLineBreak(c)) {
            skipLineBreak();
            endRecord();
        } else if (c == QLatin1Char('"')) {
            if (state == AfterQuote || !field.trimmed().isEmpty())
                throw ImportError(line, LocalizedString("a double quote stands inside a field "
                                                        "that does not begin with one"));
            field.clear();
            quoteLine = line;
            state = Quoted;
        } else if (state == AfterQuote) {
            if (!c.isSpace())
                throw ImportError(line, LocalizedString("text follows the closing quote of a "
                                                        "field"));
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
        } else if (atLineBreak(c)) {
            skipLineBreak();
            field += QLatin1Char('\n');
        } else {
            field += c;
        }
    }

    void endRecord() {
        fields.append(field);
        records.append({recordLine, fields});
        fields.clear();
        field.clear();
        state = FieldStart;
        recordLine = line;
    }

    const QString& text;
    qsizetype i = 0;
    State state = FieldStart;
    QString field;
    QStringList fields;
    QList<Record> records;
    int line = 1;
    int recordLine = 1;
    int quoteLine = 0;
};

enum class Column { FirstName, LastName, Email, Groups, FullName };

QString headerKey(const QString& name) {
    QString key;
    for (const QChar c : name)
        if (c.isLetterOrNumber())
            key += c.toLower();
    return key;
}

QHash<Column, int> columnsOf(const Record& header) {
    static const QHash<QString, Column> names = {
        {QStringLiteral("firstname"), Column::FirstName},
        {QStringLiteral("givenname"), Column::FirstName},
        {QStringLiteral("forename"), Column::FirstName},
        {QStringLiteral("lastname"), Column::LastName},
        {QStringLiteral("surname"), Column::LastName},
        {QStringLiteral("familyname"), Column::LastName},
        {QStringLiteral("email"), Column::Email},
        {QStringLiteral("emailaddress"), Column::Email},
        {QStringLiteral("emailaddresses"), Column::Email},
        {QStringLiteral("groups"), Column::Groups},
        {QStringLiteral("group"), Column::Groups},
        {QStringLiteral("categories"), Column::Groups},
        {QStringLiteral("name"), Column::FullName},
        {QStringLiteral("fullname"), Column::FullName},
        {QStringLiteral("displayname"), Column::FullName},
    };
    QHash<Column, int> columns;
    for (int i = 0; i < header.fields.size(); ++i) {
        const auto known = names.constFind(headerKey(header.fields.at(i)));
        if (known != names.constEnd() && !columns.contains(known.value()))
            columns.insert(known.value(), i);
    }
    if (!columns.contains(Column::Email))
        throw ImportError(header.line,
                          LocalizedString("the header row names no e-mail column (expected "
                                          "\"first name\", \"last name\", \"e-mail\" and "
                                          "\"groups\")"));
    return columns;
}

QStringList listField(const QString& field) {
    QStringList values;
    for (const QString& part : field.split(QLatin1Char(';'))) {
        const QString value = part.simplified();
        if (!value.isEmpty() && !values.contains(value, Qt::CaseInsensitive))
            values.append(value);
    }
    return values;
}

std::optional<ImportedContact> contactOf(const Record& row, const QHash<Column, int>& columns) {
    const auto field = [&](Column column) {
        const int index = columns.value(column, -1);
        return index < 0 ? QString() : row.fields.value(index).simplified();
    };
    for (const Column name :
         {Column::FirstName, Column::LastName, Column::FullName, Column::Groups})
        ImportText::requireCleanName(field(name), row.line);
    ImportedContact contact;
    Person& person = contact.person;
    const QString first = field(Column::FirstName);
    const QString last = field(Column::LastName);
    if (!first.isEmpty())
        person.firstName = first;
    if (!last.isEmpty())
        person.lastName = last;
    if (first.isEmpty() && last.isEmpty())
        ImportText::splitFullName(field(Column::FullName), person.firstName, person.lastName);
    for (const QString& address : listField(field(Column::Email))) {
        ImportText::requireAddress(address, row.line);
        person.emails.append(address);
    }
    person.primary = person.emails.isEmpty() ? -1 : 0;
    contact.groups = listField(field(Column::Groups));
    if (person.fullName().isEmpty() && person.emails.isEmpty())
        return std::nullopt;
    return contact;
}

} // namespace

QList<ImportedContact> CsvImporter::parse(const QByteArray& data) {
    const QString text = ImportText::decodeUnlabelled(data);
    const QList<Record> records = RecordReader(text).read();
    if (records.isEmpty())
        throw ImportError(0, LocalizedString("the file is empty"));
    const Record& header = records.constFirst();
    const QHash<Column, int> columns = columnsOf(header);
    QList<ImportedContact> contacts;
    for (qsizetype r = 1; r < records.size(); ++r) {
        const Record& row = records.at(r);
        if (row.fields.size() > header.fields.size())
            throw ImportError(row.line, LocalizedString("this row has %1 fields but the header "
                                                        "has %2")
                                            .arg(row.fields.size())
                                            .arg(header.fields.size()));
        if (const auto contact = contactOf(row, columns))
            contacts.append(*contact);
    }
    return contacts;
}
