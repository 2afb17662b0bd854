#include "util/DataFolder.h"

#include "util/AppIdentity.h"
#include "util/PrivateFiles.h"

#include <QStandardPaths>
#include <QtGlobal>

#include <cerrno>
#include <cstring>
#include <system_error>

namespace {

// Files left by a Pelmo that made them readable by all lose that here, whatever their name:
// the log, the address book and its journals. Only regular files are touched; one that cannot
// be tightened does not keep the folder from being used, and is reported.
void tightenFilesIn(const std::filesystem::path& folder) {
    std::error_code error;
    for (std::filesystem::directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error)) {
        std::error_code gone; // a file removed meanwhile needs no tightening
        if (entry->symlink_status(gone).type() != std::filesystem::file_type::regular)
            continue;
        if (!MakePrivateFile(entry->path()))
            qWarning("Pelmo: %s cannot be made private: %s", entry->path().c_str(),
                     std::strerror(errno));
    }
    if (error)
        qWarning("Pelmo: the files in %s cannot be made private: %s", folder.c_str(),
                 error.message().c_str());
}

} // namespace

bool GetOurApplicationSupportFolder(std::filesystem::path& folder) {
    const QString base = QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation);
    if (base.isEmpty())
        return false;
    const std::filesystem::path company =
        std::filesystem::path(base.toStdString()) / kOrganisationName;
    const std::filesystem::path ours = company / kApplicationName;
    if (!MakePrivateFolder(company) || !MakePrivateFolder(ours))
        return false;
    tightenFilesIn(ours);
    folder = ours;
    return true;
}
