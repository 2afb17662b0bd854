#pragma once

#include <QSettings>
#include <QString>
#include <QStringList>
#include <QVariant>
#include <QVariantMap>

#include <optional>

/**
 * Pelmo's settings: the one table of their keys, types, defaults and validation. The
 * controller, the preferences and `pelmo send --set` read and write through it, so a key is
 * spelled here and nowhere else.
 *
 * Reads come from memory; the mailing run syncs the store before each message, so that a
 * change another process just saved is seen by the next message, as one the preferences make
 * in this process is at once. The file is read again only when its inode, size or time stamps
 * differ from the last look, so a run of many copies pays one stat() a copy, not a parse (an
 * edit in place that keeps the size within the file system's clock tick goes unseen until the
 * next change, as with QSettings' own check). A value overridden for this process (a command-line
 * run with another server) wins over the stored one and is never written. The settings folder and
 * file are kept private to the user (0700, 0600), as they may hold the password.
 */
class MailSettings {
public:
    enum class Key {
        SenderEmail,
        SenderName,
        DefaultRecipientEmail,
        DefaultRecipientName,
        SelectedContentType,
        SelectedCharacterSet,
        SelectedAuthentication,
        UseSSL,
        ServerAddress,
        ServerPort,
        CompletionAction,
        LoginUsername,
        LoginPassword,
        SmtpTimeout,
        ImplicitTLS,
        CheckForSoftwareUpdates,
        ReuseConnection,
        AddPlainTextAlternative,
        ListUnsubscribe,
        ContinueAfterRefusal,
        DelayBetweenMessages,
        MaxMessagesPerHour,
        RetryTemporaryFailures,
        ServerSizeLimits,
    };

    /** The bounds of the pace settings, for the forms and the command line that set them. */
    static constexpr int kMaxDelaySeconds = 86400;
    static constexpr int kMaxMessagesPerHour = 100000;

    /** The store of the current user; makes its folder and file private. */
    MailSettings();

    /** The key as stored in the settings file (such as the sender's address key). */
    static QString name(Key key);
    /** The key stored under name, if it is one of ours. */
    static std::optional<Key> keyNamed(const QString& name);
    /** Every key's name, in table order. */
    static QStringList names();
    /** The value a form shows for a key that is not stored (port 25); invalid for none. */
    static QVariant suggested(Key key);

    /** The overridden value, else the stored one; invalid when neither. */
    QVariant value(Key key);
    bool contains(Key key);
    /** A string setting; null when missing. A list (an unquoted comma) reads joined. */
    QString string(Key key);
    /** An integer setting; 0 when missing or not a number. */
    int integer(Key key);
    /** A boolean setting; false when missing. */
    bool boolean(Key key);
    /**
     * A setting that must be present and non-empty; throws PelmoException with the key's
     * failure name and reason otherwise.
     */
    QString required(Key key);
    /** The server port, 1 to 65365 inclusive; throws BadPort otherwise (missing is 0). */
    int port();
    /** Seconds between two copies, fractions allowed (missing is 0); throws BadDelay unless
     *  a number from 0 to kMaxDelaySeconds. */
    double delayBetweenMessages();
    /** Copies in any hour, 0 for no limit (missing is 0); throws BadHourlyLimit unless a whole
     *  number from 0 to kMaxMessagesPerHour. */
    int maxMessagesPerHour();
    bool isOverridden(Key key) const;
    /** The largest message host:port announced (SIZE) on its last connection; 0 unknown. */
    qint64 sizeLimit(const QString& host, int port);
    /** Remembers what host:port announced; a limit of 0 or less forgets it. */
    void rememberSizeLimit(const QString& host, int port, qint64 limit);

    /** Stores value (an empty string removes the key) and writes the file at once. */
    void setValue(Key key, const QVariant& value);
    void remove(Key key);
    /** Makes value stand for key in this process only, without writing it. */
    void overrideValue(Key key, const QVariant& value);
    /** Writes pending changes and re-reads what another process saved since the last look. */
    void sync();

    /** The settings file's path, for telling the user where a password is kept. */
    QString fileName() const { return store.fileName(); }

private:
    /** The file as last read: equal stamps mean nothing to read again. */
    struct FileStamp {
        bool operator==(const FileStamp&) const = default;
        bool exists = false;
        unsigned long long device = 0, inode = 0;
        long long size = 0, modified = 0, changed = 0;
    };
    FileStamp stampOfFile() const;
    void save();

    QSettings store;
    QVariantMap overrides;
    std::optional<FileStamp> lastRead;
};
