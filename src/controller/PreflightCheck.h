#pragma once

#include "controller/CopyPreview.h"

#include <QList>
#include <QObject>
#include <QPointer>
#include <QString>
#include <QStringList>

/**
 * What is worth a second look before a group is mailed, found on the first member's copy:
 * braces that look like a tag but are none of the five, an attachment missing or unreadable,
 * a copy larger than the server announced (SIZE, remembered from its last connection) or than
 * the 25 MB many servers take, an empty subject, a web page that does not answer. Each finding
 * is only a warning; the user decides whether the run goes. Nothing is sent or changed.
 */
class PreflightCheck : public QObject {
    Q_OBJECT

public:
    struct Finding {
        enum class Kind {
            EmptySubject,
            UnknownTag,
            MissingAttachment,
            UnreadableAttachment,
            TooLargeForServer,
            TooLarge,
            PageNotAnswering,
        };
        Kind kind;
        /** The finding as the user reads it. */
        QString text;
    };

    /** What the findings are made of. */
    struct Input {
        QString subject;
        /** The message as typed, its tags not replaced. */
        QString body;
        /** The downloaded page, its tags not replaced; its scripts and styles are not read. */
        QString page;
        QStringList attachments;
        /** The size of one copy in bytes; negative when it could not be made. */
        qint64 messageBytes = -1;
        QString server;
        /** What server announced as its SIZE; 0 when not known. */
        qint64 serverLimit = 0;
        /** The page's address when it did not answer, with why. */
        QString pageAddress, pageError;
    };

    /** The size above which many servers refuse a message. */
    static constexpr qint64 kCommonLimit = 25 * 1024 * 1024;

    enum class State {
        Idle,     ///< start() not yet called
        Checking, ///< the first copy (and its page) is being made
        Done,     ///< findings() holds the outcome; finished() was emitted
    };
    Q_ENUM(State)

    explicit PreflightCheck(const CopyPreview::Parts& parts, QObject* parent = nullptr);

    /** Checks on the main loop, never blocking it; finished() follows, once. */
    void start();
    State state() const { return m_state; }
    const QList<Finding>& findings() const { return m_findings; }

    /** The findings for input, in the order the user would mend them. */
    static QList<Finding> check(const Input& input);

Q_SIGNALS:
    void finished();

private:
    CopyPreview::Parts m_parts;
    State m_state = State::Idle;
    QPointer<CopyPreview> m_copy;
    QList<Finding> m_findings;
};
