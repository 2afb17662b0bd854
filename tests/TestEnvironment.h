#pragma once

#include <QByteArray>

// What every test program starts with, whatever the shell running the tests holds: English
// texts (the transcripts compare them byte for byte, and the programs they start inherit
// this), and a cache folder of the build's own rather than the user's.
inline void useTestEnvironment() {
    qputenv("LANG", "C.UTF-8");
    qputenv("LC_ALL", "C.UTF-8");
    qunsetenv("LANGUAGE");
    qputenv("XDG_CACHE_HOME", PELMO_TEST_CACHE);
}
