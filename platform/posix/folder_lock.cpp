#include "platform/posix/folder_lock.h"

#include <fcntl.h>
#include <sys/file.h>

#include <thread>

#include "platform/posix/file_calls.h"

FolderLock::FolderLock(const std::string& folder, std::chrono::nanoseconds& timeLeft)
    : Folder(OpenFile(folder, O_RDONLY | O_DIRECTORY)) {
  if (!Folder.IsOpen()) {
    State = LockResult::kNoFolder;
    return;
  }
  // Any process that may open the folder can keep the lock for ever, so a call that waits for it
  // may never return.
  while (RetryOnInterrupt([&] { return ::flock(Folder.Get(), LOCK_EX | LOCK_NB); }) != 0) {
    if (errno != EWOULDBLOCK || timeLeft <= timeLeft.zero()) {
      return;
    }
    const auto begin = std::chrono::steady_clock::now();
    std::this_thread::sleep_for(std::chrono::milliseconds(2));
    timeLeft -= std::chrono::steady_clock::now() - begin;
  }
  State = LockResult::kLocked;
}
