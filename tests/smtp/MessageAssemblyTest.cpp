#include "smtp/MessageAssembly.h"

#include "RowName.h"
#include "smtp/ParsedMessage.h"
#include "util/PelmoException.h"

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QRegularExpression>
#include <QStringDecoder>
#include <QTemporaryDir>
#include <gtest/gtest.h>

#include <functional>

namespace {

const QString sender = QStringLiteral("ada@example.org");
const QString recipient = QStringLiteral("charles@example.net");

void address(MessageAssembly& message) {
    message.setFrom(QStringLiteral("Ada Lovelace"), sender);
    message.setTo(QStringLiteral("Charles Babbage"), recipient);
}

ParsedMessage parse(const MessageAssembly& message) {
    const ParsedMessage parsed = ParsedMessage::parse(message.toBytes());
    EXPECT_TRUE(parsed.parsed);
    return parsed;
}

QByteArray headerBlock(const QByteArray& message) {
    return message.left(message.indexOf("\r\n\r\n") + 2);
}

class Files {
public:
    QString write(const QString& name, const QByteArray& bytes) const {
        const QString path = dir.filePath(name);
        QFile file(path);
        EXPECT_TRUE(file.open(QIODevice::WriteOnly)) << path.toStdString();
        file.write(bytes);
        return path;
    }
    QString path(const QString& name) const { return dir.filePath(name); }

private:
    QTemporaryDir dir;
};

// Every byte value, line break bytes included: what a binary file may hold.
QByteArray binaryBytes() {
    QByteArray bytes("%PDF-1.4\r\n\n\r");
    for (int value = 255; value >= 0; --value)
        bytes += static_cast<char>(value);
    return bytes + "\n%%EOF ";
}

// The content choices as the delivery adds them: the typed body, then the page.
struct ShapeRow {
    std::string name;
    int contentChoice;
    bool page;
    std::vector<std::string> bodyTypes;

    // Names the row in test listings instead of a byte dump.
    friend void PrintTo(const ShapeRow& row, std::ostream* out) { *out << row.name; }
};

class MessageShape : public ::testing::TestWithParam<ShapeRow> {};

TEST_P(MessageShape, BodyPartsThenAttachmentsInAMultipartMixed) {
    const ShapeRow& row = GetParam();
    Files files;
    MessageAssembly message;
    address(message);
    std::vector<QByteArray> texts;
    if (row.contentChoice == 0) {
        message.addBodyPart(QStringLiteral("<p>Typed</p>"), QStringLiteral("text/html"), 0);
        texts.push_back("<p>Typed</p>");
    } else if (row.contentChoice == 1) {
        message.addBodyPart(QStringLiteral("Typed"), QStringLiteral("text/plain"), 0);
        texts.push_back("Typed");
    }
    if (row.page) {
        message.addBodyPart(QStringLiteral("<p>Page</p>"), QStringLiteral("text/html"), 0);
        texts.push_back("<p>Page</p>");
    }
    ASSERT_TRUE(message.addAttachment(files.write(QStringLiteral("a.txt"), "first")));
    ASSERT_TRUE(message.addAttachment(files.write(QStringLiteral("b.txt"), "second")));

    const ParsedMessage parsed = parse(message);
    EXPECT_EQ(parsed.mimeType, "multipart/mixed");
    ASSERT_EQ(parsed.parts.size(), row.bodyTypes.size() + 2);
    for (size_t i = 0; i < row.bodyTypes.size(); ++i) {
        const ParsedPart& part = parsed.parts[i];
        EXPECT_EQ(part.mimeType, row.bodyTypes[i]) << "part " << i;
        EXPECT_EQ(part.charset, "utf-8") << "part " << i;
        EXPECT_EQ(part.transferEncoding, "base64") << "part " << i;
        EXPECT_FALSE(part.fileName) << "part " << i;
        EXPECT_EQ(part.content, texts[i]) << "part " << i;
    }
    const ParsedPart& first = parsed.parts[row.bodyTypes.size()];
    const ParsedPart& second = parsed.parts[row.bodyTypes.size() + 1];
    EXPECT_EQ(first.fileName, QStringLiteral("a.txt"));
    EXPECT_EQ(first.content, "first");
    EXPECT_EQ(second.fileName, QStringLiteral("b.txt"));
    EXPECT_EQ(second.content, "second");
}

INSTANTIATE_TEST_SUITE_P(
    ContentChoices, MessageShape,
    ::testing::Values(ShapeRow{"html", 0, false, {"text/html"}},
                      ShapeRow{"html_and_page", 0, true, {"text/html", "text/html"}},
                      ShapeRow{"plain", 1, false, {"text/plain"}},
                      ShapeRow{"plain_and_page", 1, true, {"text/plain", "text/html"}},
                      ShapeRow{"no_typed_body", 2, false, {}},
                      ShapeRow{"page_only", 2, true, {"text/html"}}),
    RowName());

// "Café ¥ 日本": é is Latin-1 only; Shift_JIS holds 日本 (93 FA 96 7B) but not é, nor the yen
// sign, which its converters turn into a backslash.
struct CharsetRow {
    std::string name;
    int index;
    std::optional<std::string> charset;
    QByteArray plain;
    QByteArray html;

    // Names the row in test listings instead of a byte dump.
    friend void PrintTo(const CharsetRow& row, std::ostream* out) { *out << row.name; }
};

class BodyCharset : public ::testing::TestWithParam<CharsetRow> {};

TEST_P(BodyCharset, ParameterAndBytesFollowTheIndex) {
    const CharsetRow& row = GetParam();
    const QString text = QString::fromUtf8("Café ¥ 日本");
    MessageAssembly message;
    address(message);
    message.addBodyPart(text, QStringLiteral("text/plain"), row.index);
    message.addBodyPart(text, QStringLiteral("text/html"), row.index);

    const ParsedMessage parsed = parse(message);
    ASSERT_EQ(parsed.parts.size(), 2u);
    for (const ParsedPart& part : parsed.parts) {
        EXPECT_EQ(part.charset, row.charset) << part.mimeType;
        EXPECT_EQ(part.transferEncoding, "base64") << part.mimeType;
    }
    EXPECT_EQ(parsed.parts[0].content.toStdString(), row.plain.toStdString());
    EXPECT_EQ(parsed.parts[1].content.toStdString(), row.html.toStdString());
}

INSTANTIATE_TEST_SUITE_P(
    Indexes, BodyCharset,
    ::testing::Values(
        CharsetRow{"utf8", 0, "utf-8", "Caf\xc3\xa9 \xc2\xa5 \xe6\x97\xa5\xe6\x9c\xac",
                   "Caf\xc3\xa9 \xc2\xa5 \xe6\x97\xa5\xe6\x9c\xac"},
        CharsetRow{"us_ascii", 1, "us-ascii", "Caf? ? ??", "Caf&#233; &#165; &#26085;&#26412;"},
        CharsetRow{"latin1", 2, "iso-8859-1", "Caf\xe9 \xa5 ??", "Caf\xe9 \xa5 &#26085;&#26412;"},
        CharsetRow{"shift_jis", 3, "shift-jis", "Caf? ? \x93\xfa\x96\x7b",
                   "Caf&#233; &#165; \x93\xfa\x96\x7b"},
        CharsetRow{"index_4_names_no_charset", 4, std::nullopt,
                   "Caf\xc3\xa9 \xc2\xa5 \xe6\x97\xa5\xe6\x9c\xac",
                   "Caf\xc3\xa9 \xc2\xa5 \xe6\x97\xa5\xe6\x9c\xac"},
        CharsetRow{"negative_index_names_no_charset", -1, std::nullopt,
                   "Caf\xc3\xa9 \xc2\xa5 \xe6\x97\xa5\xe6\x9c\xac",
                   "Caf\xc3\xa9 \xc2\xa5 \xe6\x97\xa5\xe6\x9c\xac"}),
    RowName());

TEST(MessageAssembly, ShiftJisTextRoundTrips) {
    const QString text = QString::fromUtf8(
        "拝啓 山田様\nいつもお世話になっております。\nカタカナ、ひらがな、漢字。");
    MessageAssembly message;
    address(message);
    message.addBodyPart(text, QStringLiteral("text/plain"), 3);

    const ParsedMessage parsed = parse(message);
    ASSERT_EQ(parsed.parts.size(), 1u);
    QStringDecoder shiftJis("Shift_JIS");
    const QString decoded = shiftJis.decode(parsed.parts[0].content);
    EXPECT_FALSE(shiftJis.hasError());
    EXPECT_EQ(decoded, QString(text).replace(QStringLiteral("\n"), QStringLiteral("\r\n")));
    EXPECT_NE(parsed.parts[0].content, text.toUtf8());
}

TEST(MessageAssembly, BodyLineEndsBecomeCrlf) {
    MessageAssembly message;
    address(message);
    message.addBodyPart(QStringLiteral("one\ntwo\r\nthree\rfour\n\n"), QStringLiteral("text/plain"),
                        0);
    const ParsedMessage parsed = parse(message);
    ASSERT_EQ(parsed.parts.size(), 1u);
    EXPECT_EQ(parsed.parts[0].content, "one\r\ntwo\r\nthree\r\nfour\r\n\r\n");
}

TEST(MessageAssembly, AttachmentIsQuotedPrintableNamedAndTypedFromItsPath) {
    Files files;
    MessageAssembly message;
    address(message);
    ASSERT_TRUE(message.addAttachment(files.write(QStringLiteral("report.pdf"), binaryBytes())));

    const ParsedMessage parsed = parse(message);
    ASSERT_EQ(parsed.parts.size(), 1u);
    const ParsedPart& part = parsed.parts[0];
    EXPECT_EQ(part.fileName, QStringLiteral("report.pdf"));
    EXPECT_EQ(part.mimeType, "application/pdf");
    EXPECT_EQ(part.transferEncoding, "quoted-printable");
    EXPECT_FALSE(part.charset);
    EXPECT_EQ(part.content, binaryBytes()) << "the file's bytes, line break bytes included";
}

// Neither an extension the database does not know nor a name it knows without an extension
// ("Makefile") gives a type of ours; what goes out is GMime's default for an untyped part.
TEST(MessageAssembly, AttachmentOfUnknownTypeGetsNoTypeOfOurs) {
    Files files;
    for (const char* name : {"Makefile", "data.zzqx"}) {
        MessageAssembly message;
        address(message);
        ASSERT_TRUE(message.addAttachment(files.write(QString::fromUtf8(name), "all: pelmo\n")));
        const ParsedMessage parsed = parse(message);
        ASSERT_EQ(parsed.parts.size(), 1u) << name;
        EXPECT_EQ(parsed.parts[0].mimeType, "application/octet-stream") << name;
        EXPECT_EQ(parsed.parts[0].fileName, QString::fromUtf8(name));
        EXPECT_EQ(parsed.parts[0].content, "all: pelmo\n") << name;
    }
}

TEST(MessageAssembly, EmptyFileIsAttached) {
    Files files;
    MessageAssembly message;
    address(message);
    ASSERT_TRUE(message.addAttachment(files.write(QStringLiteral("empty.txt"), "")));
    const ParsedMessage parsed = parse(message);
    ASSERT_EQ(parsed.parts.size(), 1u);
    EXPECT_EQ(parsed.parts[0].mimeType, "text/plain");
    EXPECT_TRUE(parsed.parts[0].content.isEmpty());
}

TEST(MessageAssembly, UnreadableAttachmentsAreSkipped) {
    Files files;
    const QString vanished = files.write(QStringLiteral("vanished.pdf"), "gone");
    ASSERT_TRUE(QFile::remove(vanished));
    QDir().mkpath(files.path(QStringLiteral("folder.pdf")));
    MessageAssembly message;
    address(message);
    EXPECT_FALSE(message.addAttachment(vanished));
    EXPECT_FALSE(message.addAttachment(files.path(QStringLiteral("folder.pdf"))));
    EXPECT_FALSE(message.addAttachment(QString()));
    EXPECT_TRUE(message.addAttachment(files.write(QStringLiteral("kept.txt"), "kept")));

    const ParsedMessage parsed = parse(message);
    ASSERT_EQ(parsed.parts.size(), 1u);
    EXPECT_EQ(parsed.parts[0].fileName, QStringLiteral("kept.txt"));
}

TEST(MessageAssembly, NothingAddedGivesAnEmptyMultipartMixed) {
    MessageAssembly message;
    address(message);
    const QByteArray bytes = message.toBytes();
    const ParsedMessage parsed = ParsedMessage::parse(bytes);
    EXPECT_EQ(parsed.mimeType, "multipart/mixed");
    EXPECT_TRUE(parsed.parts.empty());
    EXPECT_FALSE(parsed.transferEncoding) << "no transfer encoding at the top level";
    EXPECT_TRUE(QRegularExpression(QStringLiteral("boundary=\"[^\"]+\""))
                    .match(QString::fromLatin1(headerBlock(bytes)))
                    .hasMatch());
}

TEST(MessageAssembly, HeadersEveryServerExpects) {
    MessageAssembly message;
    address(message);
    const qint64 now = QDateTime::currentSecsSinceEpoch();
    const ParsedMessage parsed = parse(message);
    EXPECT_EQ(parsed.mimeVersion, "1.0");
    ASSERT_TRUE(parsed.date);
    EXPECT_LE(std::abs(*parsed.date - now), 60);
    ASSERT_TRUE(parsed.messageId);
    EXPECT_TRUE(parsed.messageId->ends_with("@example.org")) << *parsed.messageId;

    MessageAssembly other;
    address(other);
    EXPECT_NE(parse(other).messageId, parsed.messageId);
}

TEST(MessageAssembly, MessageIdDomainComesFromTheSender) {
    struct Row {
        const char* name;
        const char* address;
        const char* domain;
    };
    const Row rows[] = {
        {"plain domain", "ada@mail.example.org", "@mail.example.org"},
        {"international domain", "ada@bücher.example", "@xn--bcher-kva.example"},
        {"local user", "postmaster", "@localhost"},
        {"domain literal", "ada@[192.0.2.1]", "@localhost"},
    };
    for (const Row& row : rows) {
        MessageAssembly message;
        message.setFrom(QString(), QString::fromUtf8(row.address));
        message.setTo(QString(), recipient);
        const ParsedMessage parsed = parse(message);
        ASSERT_TRUE(parsed.messageId) << row.name;
        EXPECT_TRUE(parsed.messageId->ends_with(row.domain))
            << row.name << ": " << *parsed.messageId;
    }
}

TEST(MessageAssembly, EmptyOrBlankRecipientNameGivesTheBareAddress) {
    for (const QString& name : {QString(), QString(QStringLiteral("  "))}) {
        MessageAssembly message;
        message.setFrom(QStringLiteral("Ada"), sender);
        message.setTo(name, recipient);
        const QByteArray bytes = message.toBytes();
        EXPECT_TRUE(headerBlock(bytes).contains("\r\nTo: charles@example.net\r\n"))
            << headerBlock(bytes).toStdString();
        const ParsedMessage parsed = ParsedMessage::parse(bytes);
        EXPECT_EQ(parsed.toCount, 1);
        EXPECT_TRUE(parsed.toName.isEmpty());
        EXPECT_EQ(parsed.toAddress, recipient);
    }
}

TEST(MessageAssembly, NonAsciiSubjectAndNamesAreEncodedWords) {
    const QString subject = QString::fromUtf8("Grüße aus Köln – 日本への便り");
    const QString fromName = QString::fromUtf8("Jörg Müller");
    const QString toName = QString::fromUtf8("山田 太郎");
    MessageAssembly message;
    message.setSubject(subject);
    message.setFrom(fromName, sender);
    message.setTo(toName, recipient);
    const QByteArray bytes = message.toBytes();

    const QByteArray headers = headerBlock(bytes);
    EXPECT_TRUE(std::all_of(headers.begin(), headers.end(), [](char c) {
        return static_cast<unsigned char>(c) < 0x80;
    })) << "headers hold only ASCII";
    const QRegularExpression encodedWord(QStringLiteral("=\\?[^?]+\\?[bBqQ]\\?[^?]*\\?="));
    EXPECT_GE(QString::fromLatin1(headers).count(encodedWord), 3) << headers.toStdString();
    const ParsedMessage parsed = ParsedMessage::parse(bytes);
    EXPECT_EQ(parsed.subject, subject);
    EXPECT_EQ(parsed.fromName, fromName);
    EXPECT_EQ(parsed.fromAddress, sender);
    EXPECT_EQ(parsed.toName, toName);
    EXPECT_EQ(parsed.toAddress, recipient);
}

TEST(MessageAssembly, NamesWithSpecialsAreQuoted) {
    const QString fromName = QStringLiteral("Doe, John \"JD\" <Sales>");
    MessageAssembly message;
    message.setFrom(fromName, sender);
    message.setTo(QStringLiteral("Babbage; Charles"), recipient);
    const ParsedMessage parsed = parse(message);
    EXPECT_EQ(parsed.fromName, fromName);
    EXPECT_EQ(parsed.fromAddress, sender);
    EXPECT_EQ(parsed.toCount, 1);
    EXPECT_EQ(parsed.toName, QStringLiteral("Babbage; Charles"));
}

TEST(MessageAssembly, NonAsciiAndLongFileNamesFollowRfc2231) {
    Files files;
    const QString accented = QString::fromUtf8("Übersicht März.pdf");
    const QString longName = QString(90, QLatin1Char('n')) + QStringLiteral(" final.txt");
    MessageAssembly message;
    address(message);
    ASSERT_TRUE(message.addAttachment(files.write(accented, "%PDF")));
    ASSERT_TRUE(message.addAttachment(files.write(longName, "text")));
    const QByteArray bytes = message.toBytes();

    EXPECT_TRUE(bytes.contains("filename*=")) << "an extended (charset'language'value) form";
    EXPECT_TRUE(bytes.contains("filename*0*=")) << "a long name is continued";
    const ParsedMessage parsed = ParsedMessage::parse(bytes);
    ASSERT_EQ(parsed.parts.size(), 2u);
    EXPECT_EQ(parsed.parts[0].fileName, accented);
    EXPECT_EQ(parsed.parts[0].mimeType, "application/pdf");
    EXPECT_EQ(parsed.parts[1].fileName, longName);
}

TEST(MessageAssembly, EveryLineEndsInCrlf) {
    Files files;
    MessageAssembly message;
    message.setSubject(QString::fromUtf8("A long subject that GMime folds over more than one line, "
                                         "with ümlauts to encode and more words after them"));
    address(message);
    message.addBodyPart(QStringLiteral("line\nline\n"), QStringLiteral("text/plain"), 0);
    message.addBodyPart(QStringLiteral("<p>\n</p>\n"), QStringLiteral("text/html"), 2);
    ASSERT_TRUE(message.addAttachment(files.write(QStringLiteral("report.pdf"), binaryBytes())));
    const QByteArray bytes = message.toBytes();

    ASSERT_FALSE(bytes.isEmpty());
    EXPECT_TRUE(bytes.endsWith("\r\n"));
    for (qsizetype i = 0; i < bytes.size(); ++i) {
        if (bytes[i] == '\n') {
            ASSERT_TRUE(i > 0 && bytes[i - 1] == '\r') << "bare LF at " << i;
        }
        if (bytes[i] == '\r') {
            ASSERT_TRUE(i + 1 < bytes.size() && bytes[i + 1] == '\n') << "bare CR at " << i;
        }
    }
}

TEST(MessageAssembly, EnvelopeIsTheSenderAndTheOneRecipient) {
    MessageAssembly message;
    EXPECT_TRUE(message.envelopeSender().isEmpty());
    EXPECT_TRUE(message.envelopeRecipients().isEmpty());
    address(message);
    EXPECT_EQ(message.envelopeSender(), sender);
    EXPECT_EQ(message.envelopeRecipients(), QStringList{recipient});
    message.setTo(QStringLiteral("Alan"), QStringLiteral("alan@example.com"));
    EXPECT_EQ(message.envelopeRecipients(), QStringList{QStringLiteral("alan@example.com")});
    EXPECT_EQ(parse(message).toCount, 1) << "setTo replaces the recipient";
}

std::string failureName(const std::function<void()>& step) {
    try {
        step();
    } catch (const PelmoException& failure) {
        EXPECT_FALSE(failure.reason().isEmpty());
        return failure.name().toStdString();
    }
    return "no failure";
}

// A line break in any header text could add headers of the sender's making.
TEST(MessageAssembly, LineBreaksNeverReachAHeader) {
    Files files;
    const QString evilFile = files.write(QStringLiteral("evil\nname.txt"), "x");
    MessageAssembly message;
    message.setSubject(QStringLiteral("Kept"));
    address(message);
    const QString injected = QStringLiteral("x\r\nBcc: victim@example.com");
    struct Row {
        const char* name;
        std::function<void()> step;
    };
    const Row rows[] = {
        {"subject CRLF", [&] { message.setSubject(injected); }},
        {"subject LF", [&] { message.setSubject(QStringLiteral("a\nb")); }},
        {"subject CR", [&] { message.setSubject(QStringLiteral("a\rb")); }},
        {"subject NUL", [&] { message.setSubject(QString(QStringLiteral("a%1b")).arg(QChar(0))); }},
        {"sender name", [&] { message.setFrom(injected, sender); }},
        {"sender address", [&] { message.setFrom(QStringLiteral("Eve"), injected); }},
        {"recipient name", [&] { message.setTo(injected, recipient); }},
        {"recipient address", [&] { message.setTo(QStringLiteral("Eve"), injected); }},
        {"body type", [&] { message.addBodyPart(QStringLiteral("x"), injected, 0); }},
        {"attachment name", [&] { message.addAttachment(evilFile); }},
    };
    for (const Row& row : rows)
        EXPECT_EQ(failureName(row.step), "BadHeaderText") << row.name;

    const QByteArray bytes = message.toBytes();
    EXPECT_FALSE(bytes.contains("victim")) << "nothing refused reached the message";
    const ParsedMessage parsed = ParsedMessage::parse(bytes);
    EXPECT_EQ(parsed.subject, QStringLiteral("Kept"));
    EXPECT_EQ(parsed.fromAddress, sender);
    EXPECT_EQ(parsed.toAddress, recipient);
    EXPECT_EQ(message.envelopeSender(), sender);
    EXPECT_EQ(message.envelopeRecipients(), QStringList{recipient});
    EXPECT_TRUE(parsed.parts.empty());
}

TEST(MessageAssembly, MissingAddressesAreRefused) {
    MessageAssembly message;
    EXPECT_EQ(failureName([&] { message.toBytes(); }), "IncompleteMessage");
    EXPECT_EQ(failureName([&] { message.setFrom(QStringLiteral("Ada"), QString()); }),
              "BadAddress");
    message.setFrom(QStringLiteral("Ada"), sender);
    EXPECT_EQ(failureName([&] { message.toBytes(); }), "IncompleteMessage");
    EXPECT_EQ(failureName([&] { message.setTo(QStringLiteral("Charles"), QString()); }),
              "BadAddress");
    message.setTo(QStringLiteral("Charles"), recipient);
    EXPECT_FALSE(message.toBytes().isEmpty());
}

// The whole message as it goes on the wire, with what changes from one run to the next (the
// date, the Message-ID and the boundary) replaced by placeholders.
TEST(MessageAssembly, WireFormat) {
    Files files;
    MessageAssembly message;
    message.setSubject(QString::fromUtf8("Hello from Pelmo – für Sie"));
    message.setFrom(QString::fromUtf8("Jörg Müller"), QStringLiteral("jorg@example.org"));
    message.setTo(QStringLiteral("Ada Lovelace"), QStringLiteral("ada@example.net"));
    message.addBodyPart(QStringLiteral("Dear Ada,\nsee the report.\n"),
                        QStringLiteral("text/plain"), 2);
    message.addBodyPart(QStringLiteral("<html><body>Page</body></html>"),
                        QStringLiteral("text/html"), 2);
    ASSERT_TRUE(message.addAttachment(
        files.write(QStringLiteral("report.pdf"), "%PDF-1.4\n\xe2\x82\xac = 3 \n")));

    QString wire = QString::fromLatin1(message.toBytes());
    const QString boundary =
        QRegularExpression(QStringLiteral("boundary=\"([^\"]+)\"")).match(wire).captured(1);
    ASSERT_FALSE(boundary.isEmpty());
    wire.replace(boundary, QStringLiteral("BOUNDARY"));
    const auto line = [](const char* pattern) {
        return QRegularExpression(QString::fromLatin1(pattern),
                                  QRegularExpression::MultilineOption);
    };
    wire.replace(line("^Date: [^\\r]+"), QStringLiteral("Date: DATE"));
    wire.replace(line("^Message-Id: <[^>\\r]+@example.org>"),
                 QStringLiteral("Message-Id: <ID@example.org>"));

    QFile expectedFile(QStringLiteral(PELMO_TEST_DATA "/mime/wire-format.eml"));
    ASSERT_TRUE(expectedFile.open(QIODevice::ReadOnly));
    // The file is kept with LF line ends; the message has CRLF.
    const QString expected = QString::fromLatin1(expectedFile.readAll())
                                 .replace(QStringLiteral("\n"), QStringLiteral("\r\n"));
    EXPECT_EQ(wire.toStdString(), expected.toStdString());
}

} // namespace
