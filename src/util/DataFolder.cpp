#include "util/DataFolder.h"

#include <QStandardPaths>

#include <system_error>

bool GetOurApplicationSupportFolder(std::filesystem::path& folder) {
    const QString base = QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation);
    if (base.isEmpty())
        return false;
    const std::filesystem::path ours =
        std::filesystem::path(base.toStdString()) / "Orvale Software" / "Pelmo";
    std::error_code error;
    std::filesystem::create_directories(ours, error);
    if (error || !std::filesystem::is_directory(ours, error))
        return false;
    folder = ours;
    return true;
}
