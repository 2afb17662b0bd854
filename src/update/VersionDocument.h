#pragma once

#include <QByteArray>
#include <QString>

#include <optional>

/** What the version document says is the latest Pelmo. */
struct PublishedVersion {
    int number = 0; // "CurrentVersion", compared with getVersionNumber() of our own version
    QString string; // "CurrentVersionString", shown to the user
};

/**
 * Reads a version document: a property list (XML or binary) whose top dictionary holds a
 * "Pelmo" dictionary with an integer "CurrentVersion" and a string "CurrentVersionString".
 * Nothing when the bytes are not such a document.
 */
std::optional<PublishedVersion> ReadVersionDocument(const QByteArray& bytes);
