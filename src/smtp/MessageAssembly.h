#pragma once

#include <QByteArray>
#include <QString>
#include <QStringList>

#include <memory>
#include <optional>

class EncodedAttachments;

/**
 * One message for one recipient: a multipart/mixed container (always, even with no part or a
 * single one) holding the body parts and attachments in the order they are added, with the
 * headers every receiving server expects (Date, Message-ID, MIME-Version), non-ASCII header
 * text encoded (RFC 2047, RFC 2231) and CRLF line ends throughout.
 *
 * Text that goes into a header (subject, names, addresses, attachment file names) must hold
 * no CR, LF or NUL: it is refused with PelmoException "BadHeaderText" and the message stays as
 * it was before the call.
 */
class MessageAssembly {
public:
    /** An empty message dated now. */
    MessageAssembly();
    ~MessageAssembly();
    MessageAssembly(const MessageAssembly&) = delete;
    MessageAssembly& operator=(const MessageAssembly&) = delete;

    /**
     * Throws as setSubject(), setFrom(), setTo() and addAttachment() would, in that order,
     * without building anything; an attachment's name is checked whether or not its file can
     * be read. A message whose texts pass is refused by nothing else.
     */
    static void checkHeaders(const QString& subject, const QString& senderName,
                             const QString& sender, const QString& recipientName,
                             const QString& recipient, const QStringList& attachments);

    void setSubject(const QString& subject);
    /**
     * The sender: the From mailbox, the envelope sender and the domain of the Message-ID.
     * An empty name gives the bare address; an empty address throws "BadAddress".
     */
    void setFrom(const QString& name, const QString& address);
    /** The one recipient: the To mailbox and the envelope recipient; as setFrom otherwise. */
    void setTo(const QString& name, const QString& address);

    /**
     * Appends a base64 part of mimeType ("text/html", "text/plain") holding text in the
     * character set of the character-set setting's index: 0 utf-8, 1 us-ascii, 2 iso-8859-1,
     * 3 shift-jis, named in the charset parameter; any other index sets no parameter and the
     * text goes in UTF-8. Characters the set cannot hold become numeric character references
     * in text/html and "?" in any other type. Line ends become CRLF (RFC 2046 4.1.1).
     */
    void addBodyPart(const QString& text, const QString& mimeType, int characterSetIndex);
    /**
     * Appends a multipart/alternative (RFC 2046 5.1.4) of plain, then html, each as
     * addBodyPart() makes it: a reader shows the last it can, and spam filters trust a
     * message that has both.
     */
    void addAlternativeBodyParts(const QString& plain, const QString& html, int characterSetIndex);
    /**
     * Adds List-Unsubscribe (RFC 2369 3.2) with address when it is a mailto: or https: URL,
     * and with an https: one List-Unsubscribe-Post for one-click unsubscribing (RFC 8058 3.1);
     * any other address, or one too long for a header line, adds nothing and answers false.
     */
    bool setListUnsubscribe(const QString& address);

    /**
     * Appends the file at path as a quoted-printable attachment named after the path's last
     * component, typed by MimeTypeForPath. A file of unknown type gets no type of ours: GMime
     * writes its default for an untyped part, application/octet-stream, which a mail reader
     * offers to save rather than display. Answers false and adds nothing when the file cannot
     * be read (vanished, a folder, no permission).
     */
    bool addAttachment(const QString& path);
    /** As above, the file's encoding taken from encoded, which keeps it for the next copy. */
    bool addAttachment(const QString& path, EncodedAttachments& encoded);

    /**
     * The whole message with CRLF line ends, ready for SMTP DATA (not dot-stuffed). Throws
     * "IncompleteMessage" when setFrom or setTo has not been called.
     */
    QByteArray toBytes() const;
    /** The sender's address, for MAIL FROM; empty before setFrom. */
    QString envelopeSender() const;
    /** The recipient's address, for RCPT TO; empty before setTo. */
    QStringList envelopeRecipients() const;
    /** The Message-ID made by setFrom, without its angle brackets; empty before. */
    QString messageId() const;

private:
    bool attach(const QString& path, const std::optional<QByteArray>& encoded);

    struct Message;
    std::unique_ptr<Message> message;
};
