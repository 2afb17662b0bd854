#pragma once

#include <QByteArray>
#include <QString>

#include <exception>

/**
 * A named failure: a fixed, untranslated name that code can test ("NoServer") and a reason
 * for the user, already localised. Raised by the settings getters and caught where a message
 * is prepared, which shows both.
 */
class PelmoException : public std::exception {
public:
    PelmoException(QString name, QString reason)
        : failureName(std::move(name)), failureReason(std::move(reason)),
          whatText((failureName + QStringLiteral(": ") + failureReason).toUtf8()) {}

    const QString& name() const noexcept { return failureName; }
    const QString& reason() const noexcept { return failureReason; }
    /** The line the status line and the activity log show: "Error (name): reason". */
    QString statusText() const;
    /** "name: reason" in UTF-8, valid for the life of the object. */
    const char* what() const noexcept override { return whatText.constData(); }

private:
    QString failureName;
    QString failureReason;
    QByteArray whatText;
};
