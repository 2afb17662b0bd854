// What goes into a message: its assembly, read back with GMime's parser as a receiving mail
// reader would; the quoted-printable encoding of its files; the HTML of its body.

#include "SmtpData.h"
#include "e2e/E2eSupport.h"
#include "smtp/Base64Lines.h"
#include "smtp/EncodedAttachments.h"
#include "smtp/MessageAssembly.h"
#include "smtp/QuotedPrintable.h"
#include "util/PelmoException.h"

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QRandomGenerator>
#include <gmime/gmime.h>
#include <gtest/gtest.h>

#include <functional>
#include <optional>

namespace {

// Every byte value, line break bytes included, as a binary file may hold them.
QByteArray binary() {
    QByteArray bytes("%PDF-1.4\r\n\n\r");
    for (int value = 255; value >= 0; --value)
        bytes += static_cast<char>(value);
    return bytes + "\n%%EOF ";
}

// A message from Ada to Charles (who replaced an earlier recipient), then made by a recipe.
struct Mail {
    MessageAssembly message;
    QTemporaryDir dir;
    QList<QByteArray> files; // what each attached file holds, in order
    QString sender = QStringLiteral("ada@example.org"), recipient = "charles@example.net";

    Mail() {
        message.setTo(QStringLiteral("Someone Else"), QStringLiteral("else@example.com"));
        message.setFrom(QStringLiteral("Ada Lovelace"), sender);
        message.setTo(QStringLiteral("Charles Babbage"), recipient);
    }

    // Returns the name of the PelmoException the recipe ended in, if any.
    std::string make(const QString& recipe) try {
        for (const QString& step : recipe.split('\n', Qt::SkipEmptyParts)) {
            const QString verb = step.section(' ', 0, 0);
            QByteArrayList raw = step.mid(verb.size() + 1).toUtf8().split('|');
            QStringList field;
            for (QByteArray& value : raw)
                field += QString::fromUtf8(value = unescape(value.trimmed()));
            if (verb == "subject")
                message.setSubject(field[0]);
            else if (verb == "from")
                message.setFrom(field[0], field.value(1)), sender = field.value(1);
            else if (verb == "to")
                message.setTo(field[0], field.value(1)), recipient = field.value(1);
            else if (verb == "part")
                message.addBodyPart(field[2], field[0], field[1].toInt());
            else if (verb == "alternative")
                message.addAlternativeBodyParts(field[1], field[2], field[0].toInt());
            else if (verb == "unsubscribe")
                EXPECT_EQ(message.setListUnsubscribe(field[0]), field.value(1) != "refused")
                    << step.toStdString();
            else if (QFile file(dir.filePath(field[0])); verb == "file") {
                const QByteArray bytes = raw[1] == "binary" ? binary() : raw[1];
                EXPECT_TRUE(file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size());
                file.close();
                EXPECT_TRUE(message.addAttachment(file.fileName())) << step.toStdString();
                files += bytes; // once attached
            } else if (verb == "unreadable" &&
                       (!field[0].endsWith('/') || QDir(dir.path()).mkpath(field[0])))
                EXPECT_FALSE(message.addAttachment(
                    field[0].isEmpty() ? "" : QDir(dir.path()).filePath(field[0])));
            else
                ADD_FAILURE() << "cannot " << step.toStdString();
        }
        return {};
    } catch (const PelmoException& failure) {
        EXPECT_FALSE(failure.reason().isEmpty());
        return failure.name().toStdString();
    }
};

// What a reader sees, a line per header and part, bytes beyond printable ASCII %-encoded. The
// content of a file is left out: it is compared with the file itself.
QString outline(const ReceivedMessage& message) {
    QStringList lines = {"From: " + message.from,
                         "To: " + message.to,
                         QStringList{"Subject:", message.subject}.join(' ').trimmed(),
                         "Message-Id at " + message.messageId.section('@', -1),
                         "MIME-Version: " + message.mimeVersion,
                         message.topType};
    for (const ReceivedPart& part : message.parts) {
        const QByteArray shown = part.content.toPercentEncoding(" !\"#$&'()*+,/:;<=>?@[\\]^`{|}");
        lines += QStringList{part.mimeType, part.charset, part.encoding, part.filename,
                             part.filename.isEmpty() ? '"' + QString::fromLatin1(shown) + '"' : ""}
                     .filter(QRegularExpression(QStringLiteral(".")))
                     .join(' ');
    }
    return lines.join('\n');
}

// The message as it goes on the wire, LF for CRLF, with what changes from one run to the next
// (the date, the Message-ID and the boundaries) made placeholders.
QString wire(const QByteArray& bytes) {
    QString text = QString::fromLatin1(bytes).replace(QStringLiteral("\r\n"), QStringLiteral("\n"));
    const QRegularExpression::PatternOption lines = QRegularExpression::MultilineOption;
    // The outer boundary, then a nested part's.
    for (const char* name : {"BOUNDARY", "INNER"})
        if (const QString boundary =
                QRegularExpression("boundary=\"(?!BOUNDARY\")([^\"]+)\"").match(text).captured(1);
            !boundary.isEmpty())
            text.replace(boundary, QLatin1String(name));
    text.replace(QRegularExpression("^Date: .+$", lines), QStringLiteral("Date: DATE"));
    return text.replace(QRegularExpression("^Message-Id: <[^@]+@", lines), "Message-Id: <ID@");
}

// A section: the recipe, "--" and the failure it ends in if any, what a reader sees, and maybe
// "-- wire" and the message on the wire.
class Message : public ::testing::TestWithParam<std::string> {};

TEST_P(Message, ReadBack) {
    const QString section = sectionOf(smtpData("messages.txt"), GetParam());
    const QString expected = section.section("\n--", 1);
    Mail mail;
    EXPECT_EQ(mail.make(section.section("\n--", 0, 0)),
              expected.section('\n', 0, 0).trimmed().toStdString());
    const QByteArray bytes = mail.message.toBytes();
    const ReceivedMessage read = parseMessage(bytes);
    EXPECT_EQ(outline(read).toStdString(),
              expected.section('\n', 1).section("\n-- wire\n", 0, 0).trimmed().toStdString());
    if (expected.contains("\n-- wire\n")) {
        EXPECT_EQ(wire(bytes).trimmed().toStdString(),
                  expected.section("\n-- wire\n", 1).trimmed().toStdString());
    }

    // RFC 5322 2.1, 2.2: CRLF line ends only; headers in ASCII, RFC 2047 words for the rest.
    EXPECT_TRUE(bytes.endsWith("\r\n") && bytes.count('\r') == bytes.count("\r\n") &&
                bytes.count('\n') == bytes.count("\r\n"));
    const QByteArray headers = bytes.left(bytes.indexOf("\r\n\r\n"));
    EXPECT_TRUE(std::all_of(headers.begin(), headers.end(), [](char c) { return c > 0; }));
    EXPECT_FALSE(headers.contains("Content-Transfer-Encoding") || bytes.contains("victim"));
    const QDateTime date = QDateTime::fromString(read.date, Qt::RFC2822Date);
    EXPECT_TRUE(date.isValid() && std::abs(date.secsTo(QDateTime::currentDateTime())) <= 60);
    EXPECT_NE(read.messageId, parseMessage(Mail().message.toBytes()).messageId);
    EXPECT_EQ(mail.message.envelopeSender(), mail.sender);
    EXPECT_EQ(mail.message.envelopeRecipients(), QStringList{mail.recipient});
    QList<QByteArray> attached;
    for (const ReceivedPart& part : read.parts)
        attached += part.filename.isEmpty() ? QList<QByteArray>() : QList{part.content};
    EXPECT_EQ(attached, mail.files);
}

INSTANTIATE_TEST_SUITE_P(MessageAssembly, Message,
                         ::testing::ValuesIn(sectionNames(smtpData("messages.txt"))),
                         [](const auto& row) { return row.param; });

TEST(MessageAssembly, NoMessageWithoutSenderAndRecipient) {
    MessageAssembly message;
    EXPECT_TRUE(message.envelopeSender().isEmpty() && message.envelopeRecipients().isEmpty());
    for (int step = 0; step < 2;
         ++step, message.setFrom("Ada", QStringLiteral("ada@example.org"))) {
        try {
            message.toBytes(), ADD_FAILURE() << "a message at step " << step;
        } catch (const PelmoException& refusal) {
            EXPECT_EQ(refusal.name(), QStringLiteral("IncompleteMessage"));
        }
    }
}

// RFC 2045 6.7: each row's bytes encode exactly as the row says; they and random bytes come back
// through GMime's decoder as they went in, in lines of 76 at most, broken only softly.
TEST(QuotedPrintable, EncodesExactlyAndDecodesBack) {
    QRandomGenerator random(20240501);
    QByteArrayList inputs = {QByteArray(6000, '\0') + "ends with a space "};
    std::generate_n(inputs[0].begin(), 6000,
                    [&] { return static_cast<char>(random.bounded(256)); });
    for (const QString& row : smtpData("quoted-printable.txt").split('\n')) {
        const QStringList field = row.split('|');
        if (row.startsWith('#') || field.size() != 3)
            continue;
        inputs += unescape(field[1].trimmed().toUtf8());
        EXPECT_EQ(EncodeQuotedPrintable(inputs.last()).toStdString(),
                  unescape(field[2].trimmed().toUtf8()).toStdString())
            << field[0].toStdString();
    }
    EXPECT_EQ(inputs.size(), 13);
    for (const QByteArray& bytes : inputs) {
        const QByteArray encoded = EncodeQuotedPrintable(bytes);
        const auto read = parseMessage("Content-Type: multipart/mixed; boundary=b\n\n--b\n"
                                       "Content-Transfer-Encoding: quoted-printable\n\n" +
                                       encoded + "\n--b--\n");
        EXPECT_EQ(read.parts.value(0).content, bytes);
        for (const QByteArray& line : encoded.split('\n'))
            EXPECT_LE(line.size(), 76);
        EXPECT_TRUE(encoded.count("=\n") == encoded.count('\n') && !encoded.contains('\r'));
    }
}

// RFC 2045 6.8: the same lines as GMime's encoder writes, at the lengths where a line or a
// quantum fills up and around them.
TEST(Base64Lines, SameAsGMime) {
    QRandomGenerator random(7);
    for (const int size : {0, 1, 2, 3, 56, 57, 58, 113, 114, 115, 171, 5000}) {
        QByteArray bytes(size, Qt::Uninitialized);
        std::generate(bytes.begin(), bytes.end(), [&] { return char(random.bounded(256)); });
        QByteArray gmime(qsizetype(GMIME_BASE64_ENCODE_LEN(size)), Qt::Uninitialized);
        int state = 0;
        guint32 save = 0;
        gmime.truncate(qsizetype(g_mime_encoding_base64_encode_close(
            reinterpret_cast<const unsigned char*>(bytes.constData()), size_t(size),
            reinterpret_cast<unsigned char*>(gmime.data()), &state, &save)));
        EXPECT_EQ(EncodeBase64Lines(bytes).toStdString(), gmime.toStdString()) << size;
    }
}

// A run encodes each attached file once; a copy must still carry the file as it is when the
// copy is built. Each row changes the file between two copies and says what the second holds.
TEST(EncodedAttachments, ASecondCopyCarriesTheFileAsItIsThen) {
    struct Row {
        const char* name;
        std::function<void(const QString& path)> change;
        std::optional<QByteArray> second;
    };
    const auto write = [](const QString& path, const QByteArray& bytes) {
        QFile file(path);
        ASSERT_TRUE(file.open(QIODevice::WriteOnly | QIODevice::Truncate));
        file.write(bytes);
    };
    const QList<Row> rows = {
        {"unchanged", [](const QString&) {}, QByteArray("first=3D")},
        // Two writes may fall in one tick of the file system's clock; the edit's time does not.
        {"rewritten, same size",
         [&](const QString& path) {
             write(path, "other=");
             QFile file(path);
             ASSERT_TRUE(file.open(QIODevice::ReadWrite));
             file.setFileTime(QDateTime::currentDateTime().addSecs(5),
                              QFileDevice::FileModificationTime);
         },
         QByteArray("other=3D")},
        {"replaced by a new file, as an editor saves",
         [&](const QString& path) {
             write(path + ".new", "saved=");
             ASSERT_TRUE(QFile::remove(path) && QFile::rename(path + ".new", path));
         },
         QByteArray("saved=3D")},
        {"emptied", [&](const QString& path) { write(path, ""); }, QByteArray("")},
        {"removed", [](const QString& path) { QFile::remove(path); }, std::nullopt},
        {"replaced by a folder",
         [](const QString& path) { ASSERT_TRUE(QFile::remove(path) && QDir().mkdir(path)); },
         std::nullopt},
    };
    for (const Row& row : rows) {
        QTemporaryDir dir;
        const QString path = dir.filePath(QStringLiteral("file.pdf"));
        write(path, "first=");
        EncodedAttachments run;
        EXPECT_EQ(run.quotedPrintable(path), QByteArray("first=3D")) << row.name;
        row.change(path);
        const std::optional<QByteArray> second = run.quotedPrintable(path);
        EXPECT_EQ(second.has_value(), row.second.has_value()) << row.name;
        if (second && row.second) {
            EXPECT_EQ(second->toStdString(), row.second->toStdString()) << row.name;
        }
    }
}

} // namespace
