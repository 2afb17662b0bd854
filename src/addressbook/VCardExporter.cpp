#include "addressbook/VCardExporter.h"

#include <QStringList>

namespace {

// RFC 6350 3.4: backslash, comma and semicolon are escaped in text values, and a line break
// is written "\n".
QString escaped(const QString& text) {
    QString out;
    out.reserve(text.size());
    for (const QChar c : text) {
        if (c == QLatin1Char('\\') || c == QLatin1Char(',') || c == QLatin1Char(';'))
            out += QLatin1Char('\\');
        if (c == QLatin1Char('\n'))
            out += QLatin1String("\\n");
        else
            out += c;
    }
    return out;
}

// RFC 6350 3.2: a content line longer than 75 octets is folded by CRLF and a space, never
// inside a UTF-8 sequence.
void appendLine(QByteArray& out, const QString& line) {
    const QByteArray bytes = line.toUtf8();
    qsizetype start = 0;
    qsizetype limit = 75;
    while (bytes.size() - start > limit) {
        qsizetype cut = start + limit;
        while ((static_cast<unsigned char>(bytes[cut]) & 0xC0) == 0x80)
            --cut;
        out += bytes.mid(start, cut - start);
        out += "\r\n ";
        start = cut;
        limit = 74; // the leading space counts
    }
    out += bytes.mid(start);
    out += "\r\n";
}

} // namespace

QByteArray VCardExporter::write(const QList<ImportedContact>& contacts) {
    QByteArray out;
    for (const auto& [person, groups] : contacts) {
        appendLine(out, QStringLiteral("BEGIN:VCARD"));
        appendLine(out, QStringLiteral("VERSION:4.0"));
        // FN is required; a person known by an address alone gets an empty one, so that reading
        // the card back does not make the address a name.
        appendLine(out, QLatin1String("FN:") + escaped(person.fullName()));
        appendLine(
            out,
            QStringLiteral("N:%1;%2;;;").arg(escaped(person.lastName), escaped(person.firstName)));
        if (const QString primary = person.primaryEmail(); !primary.isEmpty())
            appendLine(out, QLatin1String("EMAIL;PREF=1:") + escaped(primary));
        for (qsizetype i = 0; i < person.emails.size(); ++i)
            if (i != person.primary)
                appendLine(out, QLatin1String("EMAIL:") + escaped(person.emails.at(i)));
        if (!groups.isEmpty()) {
            QStringList names;
            for (const QString& group : groups)
                names << escaped(group);
            appendLine(out, QLatin1String("CATEGORIES:") + names.join(QLatin1Char(',')));
        }
        appendLine(out, QStringLiteral("END:VCARD"));
    }
    return out;
}
