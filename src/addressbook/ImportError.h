#pragma once

#include "util/LocalizedStrings.h"
#include "util/PelmoException.h"

/**
 * A contacts file that cannot be imported. line() is the 1-based line of the file where the
 * fault lies, or 0 when it concerns the whole file; the reason names that line.
 */
class ImportError : public PelmoException {
public:
    ImportError(int line, const QString& message)
        : PelmoException(QStringLiteral("MalformedContactsFile"),
                         line > 0
                             ? LocalizedString("line %1: %2").arg(QString::number(line), message)
                             : message),
          faultLine(line), faultDetail(message) {}

    int line() const noexcept { return faultLine; }
    /** The reason without the line number. */
    const QString& detail() const noexcept { return faultDetail; }

private:
    int faultLine;
    QString faultDetail;
};
