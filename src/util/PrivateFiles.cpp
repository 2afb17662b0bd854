#include "util/PrivateFiles.h"

#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

constexpr mode_t kOthersBits = S_IRWXG | S_IRWXO;

// Clears the group and other bits of the open file; the bits it keeps are its own, so a mode
// narrower than private stays narrower.
bool tighten(int fd, const struct stat& status) {
    if ((status.st_mode & kOthersBits) == 0)
        return true;
    return ::fchmod(fd, status.st_mode & 07777 & ~kOthersBits) == 0;
}

// Closes fd keeping the errno of what went before.
bool closeAfter(int fd, bool done) {
    const int saved = errno;
    ::close(fd);
    errno = saved;
    return done;
}

} // namespace

bool MakePrivateFolder(const std::filesystem::path& folder) {
    if (folder.empty()) {
        errno = ENOENT;
        return false;
    }
    // mkdir with 0700 makes each missing level private from its first moment; levels that
    // exist answer EEXIST and are left alone.
    std::filesystem::path level;
    for (const std::filesystem::path& part : folder) {
        level /= part;
        if (::mkdir(level.c_str(), 0700) != 0 && errno != EEXIST)
            return false;
    }
    const int fd = ::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (fd < 0)
        return false;
    struct stat status {};
    return closeAfter(fd, ::fstat(fd, &status) == 0 && tighten(fd, status));
}

bool MakePrivateFile(const std::filesystem::path& file) {
    // O_EXCL refuses whatever already has the name, a dangling symbolic link included, so a
    // file made here is ours and was 0600 from the start.
    int fd = ::open(file.c_str(), O_RDONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0600);
    if (fd >= 0) {
        // The umask may have taken owner bits away from the new file.
        return closeAfter(fd, ::fchmod(fd, 0600) == 0);
    }
    if (errno != EEXIST)
        return false;
    // lstat first so that a device or a pipe is never opened; fstat on what was opened then
    // answers for the file really changed, should the name have been replaced in between.
    struct stat status {};
    if (::lstat(file.c_str(), &status) != 0)
        return false;
    if (!S_ISREG(status.st_mode)) {
        errno = S_ISDIR(status.st_mode) ? EISDIR : EINVAL;
        return false;
    }
    fd = ::open(file.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC);
    if (fd < 0)
        return false;
    if (::fstat(fd, &status) != 0)
        return closeAfter(fd, false);
    if (!S_ISREG(status.st_mode)) {
        errno = EINVAL;
        return closeAfter(fd, false);
    }
    return closeAfter(fd, tighten(fd, status));
}
