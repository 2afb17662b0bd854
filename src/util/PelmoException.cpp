#include "util/PelmoException.h"

#include "util/LocalizedStrings.h"

QString PelmoException::statusText() const {
    return LocalizedFormat("Error (%@): %@", {failureName, failureReason});
}
