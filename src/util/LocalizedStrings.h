#pragma once

#include <QString>
#include <QStringList>

/**
 * Every user-visible text is looked up here by its English text in the Qt translation context
 * "LocalizedStrings"; the key is its own fallback. Each key is translated once per process and
 * then served from a cache, so translators must be installed before the first lookup. Any
 * thread: copies are built on workers.
 */
QString LocalizedString(const QString& key);

/** The key as UTF-8 bytes. */
QString LocalizedString(const char* key);

/** The same lookup, for window code. */
QString LocalizedStringNS(const char* key);

/** The localized key used as a format: each "%@" in turn takes the next argument. */
QString LocalizedFormat(const char* key, const QStringList& arguments);

/** Marks a key written where it is not yet looked up (in a table, or passed on to a helper) so
 *  that lupdate finds it there; the key itself, unchanged. */
constexpr const char* LocalizedKey(const char* key) {
    return key;
}
