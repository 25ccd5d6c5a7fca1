#include "platform/FileLock.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>

#include "platform/FileSystem.h"

namespace quendal {

namespace {

// Waits for the write lock on the whole file. Open file description locks
// first; a system without them gets the process-wide record lock.
bool LockWhole(int fd) {
  struct flock whole {};
  whole.l_type = F_WRLCK;
  whole.l_whence = SEEK_SET;
  whole.l_start = 0;
  whole.l_len = 0;
#ifdef F_OFD_SETLKW
  for (;;) {
    if (::fcntl(fd, F_OFD_SETLKW, &whole) == 0) return true;
    if (errno == EINTR) continue;
    if (errno != EINVAL) return false;
    break;
  }
#endif
  for (;;) {
    if (::fcntl(fd, F_SETLKW, &whole) == 0) return true;
    if (errno != EINTR) return false;
  }
}

}  // namespace

std::string FileLock::LockPathOf(const std::string& path) {
  return HiddenBeside(path, ".lock");
}

bool FileLock::Acquire(const std::string& path) {
  Release();
  const std::string lockPath = LockPathOf(path);
  for (;;) {
    const int fd = ::open(lockPath.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0644);
    if (fd < 0) return false;
    if (!LockWhole(fd)) {
      ::close(fd);
      return false;
    }
    // The lock counts only while its file still has the name: the holder
    // before may have removed it while this call waited.
    if (NamesOpenFile(lockPath, fd)) {
      fd_ = fd;
      lockPath_ = lockPath;
      return true;
    }
    ::close(fd);
  }
}

void FileLock::Release() {
  if (fd_ < 0) return;
  // Removed while still held, so nobody can lock the name in between and
  // believe the lock theirs while a waiter on this file gets it too.
  ::unlink(lockPath_.c_str());
  ::close(fd_);
  fd_ = -1;
  lockPath_.clear();
}

}  // namespace quendal
