#pragma once

#include "util/PelmoException.h"

#include <QList>
#include <QString>
#include <QStringList>

class EncodedAttachments;

#include <functional>
#include <memory>
#include <optional>

/** A login for the server, or the failure that ends the delivery instead. */
struct Credentials {
    QString user;
    QString password;
    std::optional<PelmoException> failure;
};

/**
 * Everything one delivery needs, read before it starts, so that nothing the user changes while
 * the copy is on its way (the To field, a setting) changes what is sent or what is recorded.
 * Only the credentials are asked for when the server wants them, as a keyring may take a
 * moment to answer.
 */
struct DeliveryRequest {
    /** Asked once, when the server is ready for the login; answers now or later, once. */
    using CredentialsRequest = std::function<void(std::function<void(const Credentials&)> answer)>;

    /** A text part of the message: its text and MIME type ("text/html", "text/plain"). */
    struct BodyPart {
        QString text;
        QString mimeType;
    };

    QString server;
    int port = 25;
    /** TLS wanted: STARTTLS on a plain transport, the handshake on an implicit-TLS one. */
    bool useSSL = false;
    /** 0 no login, 1 PLAIN, 2 LOGIN, 3 CRAM-MD5; any other value stalls after the list. */
    int loginMechanism = 0;
    CredentialsRequest credentials;

    QString subject;
    QString senderName;
    QString sender;
    QString recipientName;
    QString recipient;
    /** The character-set setting's index of the text parts. */
    int characterSet = 0;
    QList<BodyPart> bodyParts;
    /** Not null: the first body part (HTML) goes with this plain text as its alternative. */
    QString plainAlternative;
    /** A mailto: or https: address for List-Unsubscribe; anything else adds no header. */
    QString listUnsubscribe;
    /** Full paths; a file that cannot be read when the message is built is left out. */
    QStringList attachments;
    /** The attachments as the run's earlier copies encoded them; null: read for this copy. */
    std::shared_ptr<EncodedAttachments> encodedAttachments;
};
