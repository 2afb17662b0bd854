#pragma once

#include <QString>

/** A value, line or whole contact of a contacts file that an import left out, and why. */
struct SkippedValue {
    /** The 1-based line of the file where the value stands. */
    int line = 0;
    /** Why it was left out, for the user; without the line number. */
    QString reason;
};
