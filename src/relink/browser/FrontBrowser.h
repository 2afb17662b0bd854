#pragma once

#include <QString>

#include <chrono>

/**
 * The text of the page at url, fetched now (never from a cache), following redirects: UTF-8
 * when the bytes are valid UTF-8, else the charset the server or the page declares, else Mac
 * OS Roman. Null when the address is no valid URL, the fetch fails or times out, or nothing
 * came back; why is in *error when given.
 *
 * Blocks the caller, running a local event loop until the answer or the time-out.
 */
QString DownloadURL(const QString& url,
                    std::chrono::milliseconds timeout = std::chrono::seconds(30),
                    QString* error = nullptr);
