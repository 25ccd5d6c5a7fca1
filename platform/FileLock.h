// An exclusive advisory lock that lets the writers of one file on several
// stations (processes, and objects within one process) take their turns:
// whoever holds it may look into the file and add to it without another
// writer doing the same in between.
//
// The lock is an fcntl record lock (which also holds across NFS) on a
// hidden lock file beside the file it guards, not on the file itself, so
// it stays valid while the file is missing, being created, or replaced by a
// rename. The lock belongs to the open file description where the system
// offers that, so opening and closing the guarded file elsewhere in the
// same process never drops it, and two objects of one process wait for
// each other as two processes do.
//
// Whoever holds the lock removes the lock file before letting go; a waiter
// that then finds its lock on a removed file starts again on the current
// one. A crash releases the lock with the process and may leave the lock
// file behind, which the next holder takes over and removes.
//
//   FileLock lock;
//   if (!lock.Acquire(path)) ...  // the lock file could not be made
//   ... check the file, append to it ...
//   lock.Release();               // or let the lock go out of scope
#pragma once

#include <string>

namespace quendal {

class FileLock {
 public:
  FileLock() = default;
  ~FileLock() { Release(); }
  FileLock(const FileLock&) = delete;
  FileLock& operator=(const FileLock&) = delete;

  // Waits until this object holds the lock of `path`; false when the lock
  // file can't be created or locked. Holding a lock already, it lets that go first.
  bool Acquire(const std::string& path);
  void Release();
  bool Held() const { return fd_ >= 0; }

  // The lock file of `path`: hidden, beside it, never named like a carrier file.
  static std::string LockPathOf(const std::string& path);

 private:
  int fd_ = -1;
  std::string lockPath_;
};

}  // namespace quendal
