#include "platform/posix/profile_store.h"

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <cstdio>
#include <utility>

#include "platform/posix/text_file.h"

ProfileStore& ProfileStore::GetInstance() {
  static ProfileStore instance;
  return instance;
}

static std::string FolderOf(const std::string& path) { return path.substr(0, path.rfind('/') + 1); }

bool ProfileStore::IsCurrent(const std::string& path) const {
  struct stat now = {};
  return Text && path == Path && ::stat(path.c_str(), &now) == 0 && now.st_dev == Status.st_dev &&
         now.st_ino == Status.st_ino && now.st_size == Status.st_size &&
         now.st_ctim.tv_sec == Status.st_ctim.tv_sec &&
         now.st_ctim.tv_nsec == Status.st_ctim.tv_nsec;
}

ProfileText* ProfileStore::Load(const std::string& path) {
  if ((IsChanged && path == Path) || IsCurrent(path)) {
    return Text.get();
  }
  Path = path;
  Text.reset();
  File.Reset(-1);
  // A link in the file's place could lead anywhere, and a pipe would hold up the run.
  Descriptor file(RetryOnInterrupt(
      [&] { return ::open(path.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC); }));
  if (!file.IsOpen()) {
    if (errno == ENOENT) {
      Text = std::make_unique<ProfileText>("");
      Status = {};
    }
    return Text.get();
  }
  Keep(std::move(file));
  if (S_ISREG(Status.st_mode)) {
    if (std::optional<std::string> text = ReadAll(File)) {
      Text = std::make_unique<ProfileText>(std::move(*text));
    }
  }
  return Text.get();
}

void ProfileStore::Keep(Descriptor file) {
  File = std::move(file);
  if (::fstat(File.Get(), &Status) != 0) {
    Status = {};
  }
}

void ProfileStore::Lock(const std::string& path) {
  if (Depth++ > 0) {
    return;
  }
  const std::string folder = FolderOf(path);
  Folder.Reset(
      RetryOnInterrupt([&] { return ::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC); }));
  if (Folder.IsOpen()) {
    RetryOnInterrupt([&] { return ::flock(Folder.Get(), LOCK_EX); });
  }
}

bool ProfileStore::Unlock() {
  if (--Depth > 0) {
    return true;
  }
  const bool isStored = !IsChanged || Store();
  IsChanged = false;
  if (!isStored) {
    Text.reset();
  }
  Folder.Reset(-1);
  return isStored;
}

// Writes the text beside the file and renames it over. The name beside it is free: only the holder
// of the lock writes one, and what stands there is of a run that was killed.
bool ProfileStore::Store() {
  const std::string growing = FolderOf(Path) + ".History.tmp";
  ::unlink(growing.c_str());
  Descriptor file(RetryOnInterrupt([&] {
    return ::open(growing.c_str(), O_RDWR | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0666);
  }));
  if (!file.IsOpen()) {
    return false;
  }
  const bool isReplacement = Status.st_mode != 0;
  if (isReplacement) {
    // The owner first, as a change of it can clear bits of the mode; not everyone may give away.
    static_cast<void>(::fchown(file.Get(), Status.st_uid, Status.st_gid) == 0);
    static_cast<void>(::fchmod(file.Get(), Status.st_mode & 07777) == 0);
  }
  if (!WriteAll(file, Text->Get()) || ::fdatasync(file.Get()) != 0 ||
      ::rename(growing.c_str(), Path.c_str()) != 0) {
    ::unlink(growing.c_str());
    return false;
  }
  Keep(std::move(file));
  return true;
}
