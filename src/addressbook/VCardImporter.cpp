#include "addressbook/VCardImporter.h"

#include "addressbook/ImportError.h"
#include "addressbook/ImportText.h"
#include "util/LocalizedStrings.h"

#include <QHash>
#include <QSet>

#include <algorithm>
#include <optional>
#include <utility>

namespace {

struct Line {
    int number;
    QByteArray text;
};

struct Property {
    QByteArray name;
    QList<std::pair<QByteArray, QByteArray>> params; // key upper-cased, one entry per value
    QByteArray value;

    QByteArray param(const char* key) const {
        for (const auto& [k, v] : params)
            if (k == key)
                return v;
        return {};
    }
    bool hasParam(const char* key, const char* wanted) const {
        for (const auto& [k, v] : params)
            if (k == key && v.compare(wanted, Qt::CaseInsensitive) == 0)
                return true;
        return false;
    }
};

// Physical lines end in CRLF or LF, or in a lone CR in a file without any LF (as old Mac
// programs wrote); elsewhere a lone CR is a stray character of its line. The last line needs
// no end.
QList<Line> physicalLines(const QByteArray& data) {
    QList<Line> lines;
    qsizetype start = 0;
    int number = 1;
    const bool loneCrEndsLines = !data.contains('\n');
    for (qsizetype i = 0; i <= data.size(); ++i) {
        if (i < data.size() && data[i] != '\n' &&
            (data[i] != '\r' || !(loneCrEndsLines || data.mid(i + 1, 1) == "\n")))
            continue;
        if (i < data.size() || start < data.size())
            lines.append({number++, data.mid(start, i - start)});
        if (i + 1 < data.size() && data[i] == '\r' && data[i + 1] == '\n')
            ++i;
        start = i + 1;
    }
    return lines;
}

bool isQuotedPrintable(const QByteArray& line) {
    const qsizetype colon = line.indexOf(':');
    return (colon < 0 ? line : line.left(colon)).toUpper().contains("QUOTED-PRINTABLE");
}

// Joins folded lines into logical lines, each numbered by its first physical line.
// RFC 6350 3.2 and RFC 2425 5.8.1: a line end followed by one space or tab is removed with
// that one character. vCard 2.1 (section 2.1.3) values in quoted-printable end a line with
// "=" when they go on (RFC 2045 6.7, rule 5), whatever the next line starts with.
QList<Line> logicalLines(const QByteArray& data) {
    QList<Line> logical;
    for (const Line& line : physicalLines(ImportText::asUtf8(data))) {
        if (!logical.isEmpty()) {
            QByteArray& last = logical.last().text;
            if (last.endsWith('=') && isQuotedPrintable(last)) {
                last.chop(1);
                last += line.text;
                continue;
            }
            if (line.text.startsWith(' ') || line.text.startsWith('\t')) {
                last += line.text.mid(1);
                continue;
            }
        }
        if (!line.text.trimmed().isEmpty())
            logical.append(line);
    }
    return logical;
}

QByteArray unquoted(const QByteArray& text) {
    const QByteArray trimmed = text.trimmed();
    if (trimmed.size() >= 2 && trimmed.startsWith('"') && trimmed.endsWith('"'))
        return trimmed.mid(1, trimmed.size() - 2);
    return trimmed;
}

// contentline = [group "."] name *(";" param) ":" value (RFC 6350 3.3). Parameter values may
// be quoted and then hold ";" and ":". vCard 2.1 also writes bare parameters ("EMAIL;PREF;
// INTERNET:"), which are types unless they name an encoding.
std::optional<Property> parseProperty(const QByteArray& text) {
    QList<QByteArray> head;
    qsizetype start = 0;
    qsizetype colon = -1;
    bool quoted = false;
    for (qsizetype i = 0; i < text.size() && colon < 0; ++i) {
        const char c = text[i];
        if (c == '"')
            quoted = !quoted;
        else if (!quoted && (c == ';' || c == ':')) {
            head.append(text.mid(start, i - start));
            start = i + 1;
            if (c == ':')
                colon = i;
        }
    }
    if (colon < 0)
        return std::nullopt;
    Property property;
    property.value = text.mid(colon + 1);
    const QByteArray name = head.takeFirst().trimmed().toUpper();
    property.name = name.mid(name.lastIndexOf('.') + 1);
    static const QSet<QByteArray> encodings = {"QUOTED-PRINTABLE", "BASE64", "8BIT", "7BIT"};
    for (const QByteArray& part : std::as_const(head)) {
        const qsizetype eq = part.indexOf('=');
        if (eq < 0) {
            const QByteArray bare = part.trimmed().toUpper();
            property.params.append({encodings.contains(bare) ? "ENCODING" : "TYPE", bare});
            continue;
        }
        const QByteArray key = part.left(eq).trimmed().toUpper();
        for (const QByteArray& value : unquoted(part.mid(eq + 1)).split(','))
            property.params.append({key, value.trimmed()});
    }
    return property;
}

int hexDigit(char c) {
    if (c >= '0' && c <= '9')
        return c - '0';
    if (c >= 'A' && c <= 'F')
        return c - 'A' + 10;
    if (c >= 'a' && c <= 'f')
        return c - 'a' + 10;
    return -1;
}

// RFC 2045 6.7: "=" and two hex digits stand for one byte; a lone "=" is kept as text.
QByteArray decodeQuotedPrintable(const QByteArray& text) {
    QByteArray bytes;
    bytes.reserve(text.size());
    for (qsizetype i = 0; i < text.size(); ++i) {
        if (text[i] == '=' && i + 2 < text.size()) {
            const int high = hexDigit(text[i + 1]);
            const int low = hexDigit(text[i + 2]);
            if (high >= 0 && low >= 0) {
                bytes += static_cast<char>(high * 16 + low);
                i += 2;
                continue;
            }
        }
        bytes += text[i];
    }
    return bytes;
}

QString decodedValue(const Property& property, int line) {
    QByteArray bytes = property.value;
    const QByteArray encoding = property.param("ENCODING").toUpper();
    if (encoding == "QUOTED-PRINTABLE")
        bytes = decodeQuotedPrintable(bytes);
    else if (encoding == "BASE64" || encoding == "B")
        bytes = QByteArray::fromBase64(bytes);
    const QByteArray charset = property.param("CHARSET");
    if (charset.isEmpty())
        return ImportText::decodeUnlabelled(bytes);
    const std::optional<QString> text = ImportText::decode(bytes, QString::fromLatin1(charset));
    if (!text)
        throw ImportError(line, LocalizedString("the character set \"%1\" is not known")
                                    .arg(QString::fromLatin1(charset)));
    return *text;
}

// Splits a text value at an unescaped separator and, unless keepEscapes, removes the
// escapes. RFC 6350 3.4 and RFC 2426 4 escape "\\", "\,", "\;" and write a line break as
// "\n"; vCard 2.1 escapes only ";" (section 2.1.5), so its other backslashes are text.
QStringList splitEscaped(const QString& value, QChar separator, bool version21,
                         bool keepEscapes = false) {
    QStringList parts;
    QString current;
    for (qsizetype i = 0; i < value.size(); ++i) {
        const QChar c = value[i];
        if (c == QLatin1Char('\\') && i + 1 < value.size()) {
            const QChar next = value[i + 1];
            // Outlook's 2.1 files escape the comma in CATEGORIES as later versions do.
            if (!version21 || next == QLatin1Char(';') || (next == separator && !keepEscapes)) {
                const bool lineBreak = next == QLatin1Char('n') || next == QLatin1Char('N');
                if (keepEscapes)
                    current += c;
                current +=
                    lineBreak && !version21 && !keepEscapes ? QChar(QLatin1Char('\n')) : next;
                ++i;
                continue;
            }
        }
        if (c == separator) {
            parts.append(current);
            current.clear();
            continue;
        }
        current += c;
    }
    parts.append(current);
    return parts;
}

QString unescaped(const QString& value, bool version21) {
    return splitEscaped(value, QChar(), version21).constFirst();
}

// A blank part is a missing one.
QString cleanName(const QString& text, int line) {
    const QString part = text.simplified();
    ImportText::requireCleanName(part, line);
    return part.isEmpty() ? QString() : part;
}

QString uidKey(const QString& uid) {
    QString key = uid.trimmed().toLower();
    if (key.startsWith(QLatin1String("urn:uuid:")))
        key.remove(0, 9);
    return key;
}

struct Card {
    int beginLine = 0;
    bool version21 = false;
    bool hasName = false;
    bool hasFormatted = false;
    /** Why the whole card is left out (an unknown version), or null. */
    QString fault;
    int faultLine = 0;
    QString first, last, formatted;
    QList<std::pair<QString, int>> emails; // address and preference rank, lower first
    QStringList categories;
    bool isGroup = false;
    QString uid;
    QStringList members;

    // Takes one property; a bad value throws ImportError and costs only that property.
    void add(const Property& property, int line, ParsedContacts& parsed) {
        const QByteArray& name = property.name;
        if (name == "VERSION") {
            setVersion(QString::fromLatin1(property.value.trimmed()), line);
        } else if (name == "N" && !hasName) {
            // Some exporters repeat N; the first is the one the card was written with.
            hasName = true;
            setName(decodedValue(property, line), line);
        } else if (name == "FN" && !hasFormatted) {
            hasFormatted = true;
            formatted = cleanName(unescaped(decodedValue(property, line), version21), line);
        } else if (name == "EMAIL") {
            addEmail(property, line);
        } else if (name == "CATEGORIES") {
            addCategories(decodedValue(property, line), line, parsed);
        } else if (name == "KIND" || name == "X-ADDRESSBOOKSERVER-KIND") {
            isGroup = property.value.trimmed().compare("group", Qt::CaseInsensitive) == 0;
        } else if (name == "UID") {
            uid = uidKey(decodedValue(property, line));
        } else if (name == "MEMBER" || name == "X-ADDRESSBOOKSERVER-MEMBER") {
            members.append(uidKey(decodedValue(property, line)));
        }
    }

    void setVersion(const QString& version, int line) {
        if (version != QLatin1String("2.1") && version != QLatin1String("3.0") &&
            version != QLatin1String("4.0")) {
            fault = LocalizedString("vCard version \"%1\" is not supported (2.1, 3.0 and 4.0 "
                                    "are)")
                        .arg(version);
            faultLine = line;
        }
        version21 = version == QLatin1String("2.1");
    }

    // N = family ";" given ";" additional ";" prefixes ";" suffixes (RFC 6350 6.2.2, RFC 2426
    // 3.1.2); since 3.0 a part may list several values separated by unescaped commas.
    void setName(const QString& value, int line) {
        const QStringList parts = splitEscaped(value, QLatin1Char(';'), version21, true);
        last = cleanName(namePartValues(parts.value(0)), line);
        first = cleanName(namePartValues(parts.value(1)), line);
    }

    QString namePartValues(const QString& part) const {
        if (version21)
            return unescaped(part, true);
        return splitEscaped(part, QLatin1Char(','), false).join(QLatin1Char(' '));
    }

    // The preferred address is the one with the lowest PREF (4.0, RFC 6350 5.3), or marked
    // TYPE=pref (3.0, RFC 2426 3.3.2) or bare PREF (2.1); otherwise the first.
    void addEmail(const Property& property, int line) {
        const QString address = unescaped(decodedValue(property, line), version21).trimmed();
        if (address.isEmpty())
            return;
        ImportText::requireAddress(address, line);
        int rank = property.hasParam("TYPE", "PREF") ? 1 : 101;
        bool numeric = false;
        const int pref = property.param("PREF").toInt(&numeric);
        if (numeric && pref >= 1 && pref <= 100)
            rank = std::min(rank, pref);
        for (auto& [known, knownRank] : emails) {
            if (known.compare(address, Qt::CaseInsensitive) == 0) {
                knownRank = std::min(knownRank, rank);
                return;
            }
        }
        emails.append({address, rank});
    }

    // RFC 6350 6.7.1: CATEGORIES is a list separated by commas; "\," is part of a name.
    void addCategories(const QString& value, int line, ParsedContacts& parsed) {
        for (const QString& category : splitEscaped(value, QLatin1Char(','), version21)) {
            try {
                const QString name = cleanName(category, line);
                if (!name.isEmpty() && !categories.contains(name, Qt::CaseInsensitive))
                    categories.append(name);
            } catch (const ImportError& bad) {
                parsed.skip(bad.line(), bad.detail());
            }
        }
    }

    QString groupName() const {
        if (!formatted.isEmpty())
            return formatted;
        return personWithoutAddresses().fullName();
    }

    // FN stands in for N when N gives no name at all (RFC 6350 makes FN the one required name).
    Person personWithoutAddresses() const {
        Person person;
        person.firstName = first;
        person.lastName = last;
        if (first.isNull() && last.isNull())
            ImportText::splitFullName(formatted, person.firstName, person.lastName);
        return person;
    }

    std::optional<ImportedContact> contact() const {
        ImportedContact contact{personWithoutAddresses(), categories};
        int bestRank = 102;
        for (const auto& [address, rank] : emails) {
            if (rank < bestRank) {
                bestRank = rank;
                contact.person.primary = static_cast<int>(contact.person.emails.size());
            }
            contact.person.emails.append(address);
        }
        if (contact.person.fullName().isEmpty() && contact.person.emails.isEmpty())
            return std::nullopt;
        return contact;
    }
};

// Group cards name their members by UID; each member found in the file joins the group.
void addGroupMembers(const QList<Card>& groups, const QHash<QString, qsizetype>& byUid,
                     QList<ImportedContact>& contacts) {
    for (const Card& group : groups) {
        const QString name = group.groupName();
        if (name.isEmpty())
            continue;
        for (const QString& member : group.members) {
            const auto found = byUid.constFind(member);
            if (found == byUid.constEnd())
                continue;
            QStringList& memberGroups = contacts[found.value()].groups;
            if (!memberGroups.contains(name, Qt::CaseInsensitive))
                memberGroups.append(name);
        }
    }
}

// Reads the cards of a file, leaving out and reporting what cannot be read.
class CardReader {
public:
    ParsedContacts read(const QByteArray& data) {
        for (const Line& line : logicalLines(data))
            take(line);
        if (card)
            dropUnfinishedCard();
        if (!sawCard)
            throw ImportError(0, LocalizedString("the file holds no vCard"));
        addGroupMembers(groups, byUid, parsed.contacts);
        return parsed;
    }

private:
    void take(const Line& line) {
        const std::optional<Property> property = parseProperty(line.text);
        if (!property) {
            parsed.skip(line.number,
                        LocalizedString("this line has no \":\" between a property and its "
                                        "value"));
            return;
        }
        if (property->name == "BEGIN") {
            begin(line, *property);
        } else if (!card) {
            // One report for a run of lines outside any card, not one a line.
            if (!outside)
                parsed.skip(line.number,
                            LocalizedString("\"%1\" stands outside BEGIN:VCARD and END:VCARD")
                                .arg(QString::fromUtf8(line.text.left(40))));
            outside = true;
        } else if (property->name == "END") {
            end();
        } else if (line.text.contains('\r')) {
            parsed.skip(line.number, LocalizedString("a carriage return stands inside the %1 "
                                                     "property")
                                         .arg(QString::fromLatin1(property->name)));
        } else {
            try {
                card->add(*property, line.number, parsed);
            } catch (const ImportError& bad) {
                parsed.skip(bad.line(), bad.detail());
            }
        }
    }

    void begin(const Line& line, const Property& property) {
        if (property.value.trimmed().toUpper() != "VCARD") {
            if (!card && !outside)
                parsed.skip(line.number, LocalizedString("\"BEGIN:%1\" does not begin a vCard")
                                             .arg(QString::fromUtf8(property.value.trimmed())));
            outside = !card;
            return;
        }
        if (card)
            dropUnfinishedCard();
        card.emplace();
        card->beginLine = line.number;
        sawCard = true;
        outside = false;
        skippedBefore = parsed.skipped.size();
    }

    void dropUnfinishedCard() {
        parsed.skip(card->beginLine, LocalizedString("this card has no END:VCARD"));
        ++parsed.contactsSkipped;
        card.reset();
    }

    void end() {
        if (!card->fault.isNull()) {
            parsed.skip(card->faultLine, card->fault);
            ++parsed.contactsSkipped;
        } else if (card->isGroup) {
            groups.append(*card);
        } else if (const auto contact = card->contact()) {
            if (!card->uid.isEmpty())
                byUid.insert(card->uid, parsed.contacts.size());
            parsed.contacts.append(*contact);
        } else if (parsed.skipped.size() > skippedBefore) {
            // Nothing usable is left of a card whose bad values were skipped.
            ++parsed.contactsSkipped;
        }
        card.reset();
    }

    ParsedContacts parsed;
    QList<Card> groups;
    QHash<QString, qsizetype> byUid;
    std::optional<Card> card;
    bool sawCard = false;
    bool outside = false;
    qsizetype skippedBefore = 0;
};

} // namespace

ParsedContacts VCardImporter::parse(const QByteArray& data) {
    return CardReader().read(data);
}
