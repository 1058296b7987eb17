#include "platform/posix/profile_store.h"

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <utility>

#include "platform/posix/file_calls.h"
#include "platform/posix/text_file.h"

ProfileStore& ProfileStore::GetInstance() {
  static ProfileStore instance;
  return instance;
}

static std::string FolderOf(const std::string& path) { return path.substr(0, path.rfind('/') + 1); }

bool ProfileStore::IsCurrent(const std::string& path) const {
  struct stat now = {};
  return Text && path == Path && StatusOf(path, Links::kFollow, now) &&
         now.st_dev == Status.st_dev && now.st_ino == Status.st_ino &&
         now.st_size == Status.st_size && now.st_ctim.tv_sec == Status.st_ctim.tv_sec &&
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
  if (!StatusOf(File, Status)) {
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
  if (Folder.IsOpen() && RetryOnInterrupt([&] { return ::flock(Folder.Get(), LOCK_EX); }) != 0) {
    Folder.Reset(-1);
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

// Anew, after removing a file of that name.
static Descriptor OpenAnew(const std::string& path) {
  RemoveFile(path);
  return Descriptor(RetryOnInterrupt([&] {
    return ::open(path.c_str(), O_RDWR | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0666);
  }));
}

// Writes the text beside the file and renames it over.
bool ProfileStore::Store() {
  // Only the holder of the lock writes here, and what stands here is of a run that was killed.
  std::string growing = FolderOf(Path) + ".History.tmp";
  Descriptor file = Folder.IsOpen() ? OpenAnew(growing) : Descriptor();
  if (!file.IsOpen()) {
    // There is no lock to be had, or a folder of that name: an event can be called anything.
    growing = FolderOf(Path) + ".History-" + std::to_string(::getpid()) + ".tmp";
    file = OpenAnew(growing);
  }
  if (!file.IsOpen()) {
    return false;
  }
  const bool isReplacement = Status.st_mode != 0;
  if (isReplacement) {
    // The owner first, as a change of it can clear bits of the mode; not everyone may give away.
    RetryOnInterrupt([&] { return ::fchown(file.Get(), Status.st_uid, Status.st_gid); });
    RetryOnInterrupt([&] { return ::fchmod(file.Get(), Status.st_mode & 07777); });
  }
  if (!WriteAll(file, Text->Get()) ||
      RetryOnInterrupt([&] { return ::fdatasync(file.Get()); }) != 0 ||
      !RenameOver(growing, Path)) {
    RemoveFile(growing);
    return false;
  }
  Keep(std::move(file));
  return true;
}
