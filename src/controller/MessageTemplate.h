#pragma once

#include <QList>
#include <QObject>
#include <QString>

#include <optional>
#include <utility>

class MailSettings;
class PelmoView;
class QTextDocument;

/**
 * The message every copy is made from: the subject and recipient fields of the view, the body
 * (a rich-text document the window's editor shares), this run's web page, and the tags that
 * make each copy personal. The view and the settings are not owned and must outlive it.
 */
class MessageTemplate : public QObject {
    Q_OBJECT

public:
    MessageTemplate(PelmoView& view, MailSettings& settings, QObject* parent = nullptr);

    /** The body; owned by this object. */
    QTextDocument* body() const { return document; }
    /** Empties the body. */
    void clearBody();

    /** The To field; throws NoRecipientsEmail when empty. */
    QString getTo();
    /** The Name field; throws NoRecipientsName when empty. */
    QString getToName();
    /** The Subject field as it stands, maybe empty; its tags are never replaced. */
    QString getSubject();
    /** The sender's address setting; throws NoSenderEmailAddress. */
    QString getFrom();
    /** The sender's name setting; throws NoSenderName. */
    QString getFromName();

    /** The body's plain text with the tags replaced; throws what the tag getters throw. */
    QString getMessage();
    /**
     * The body as an HTML document in the character set of the settings, every
     * character the set cannot hold written as a numeric character reference, with the tags
     * replaced. Null when the export fails; throws what the tag getters throw.
     */
    QString getHTMLMessage();
    /**
     * text with "{to}", "{toName}", "{from}", "{fromName}" and "{subject}" replaced in any
     * letter case by their getters' values, in that order. Every getter is called on every
     * call, whether or not its tag occurs, so a missing value stops the message. Null for null.
     */
    QString replaceTags(const QString& text);

    /**
     * Makes getTo() and getToName() answer address and name instead of the fields, so that a
     * member's copy can be made without touching the window; clearRecipient() ends it.
     */
    void setRecipient(const QString& name, const QString& address);
    void clearRecipient() { recipient.reset(); }

    /** This run's page as downloaded and relinked, its tags not replaced; null for none. */
    const QString& page() const { return webPageOrFileContents; }
    /** Keeps page as this run's downloaded and relinked page; null for none. */
    void setPage(const QString& page) { webPageOrFileContents = page; }
    /** This run's page with the tags replaced for the current recipient; null without a page. */
    QString getWebPageOrFileContents();

private:
    /** A text replaceTags() was given and where its tags stand: offset and row of the table. */
    struct TagPositions {
        QString text;
        QList<std::pair<qsizetype, int>> tags;
        /** A tag other than the last row's stands next to a letter or brace. */
        bool touching;
    };
    static TagPositions findTags(const QString& text);
    const TagPositions& tagPositionsIn(const QString& text);

    PelmoView& view;
    MailSettings& settings;
    QTextDocument* document;
    /** The body as plain text, null until asked for after a change. */
    QString plainBody;
    /** The body as HTML in the set htmlCharset, null when the export failed; unset until
     * asked for after a change. Copies differ only by their tags, so it is made once a run. */
    std::optional<QString> htmlBody;
    int htmlCharset = -1;
    QString webPageOrFileContents;
    /** The name and address a copy is made for, when not the fields'. */
    std::optional<std::pair<QString, QString>> recipient;
    /** The last few texts whose tags were replaced, oldest first. */
    QList<TagPositions> tagPositions;
};
