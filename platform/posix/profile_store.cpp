#include "platform/posix/profile_store.h"

#include <fcntl.h>
#include <unistd.h>

#include <utility>

#include "platform/path.h"
#include "platform/posix/file_access.h"
#include "platform/posix/file_calls.h"
#include "platform/posix/text_file.h"
#include "platform/temporary_path.h"

ProfileStore& ProfileStore::GetInstance() {
  static ProfileStore instance;
  return instance;
}

bool ProfileStore::IsCurrent(const std::string& path, const File& file) {
  struct stat now = {};
  return file.Text && StatusOf(path, Links::kFollow, now) && now.st_dev == file.Status.st_dev &&
         now.st_ino == file.Status.st_ino && now.st_size == file.Status.st_size &&
         now.st_ctim.tv_sec == file.Status.st_ctim.tv_sec &&
         now.st_ctim.tv_nsec == file.Status.st_ctim.tv_nsec;
}

void ProfileStore::Read(const std::string& path, File& file) {
  file.Text.reset();
  file.Opened.Reset(-1);
  file.Status = {};
  file.Opened = OpenRegularFile(path, Links::kNoFollow, file.Status);  // a link can lead anywhere
  std::optional<std::string> text;
  if (file.Opened.IsOpen()) {
    text = ReadAll(file.Opened);
  } else if (errno == ENOENT) {
    text = "";
  }
  if (text) {
    file.Text = std::make_unique<ProfileText>(std::move(*text));
  }
}

const ProfileText* ProfileStore::Load(const std::string& path) {
  File& file = Files[path];
  if (file.Changes == State::kUnchanged && !IsCurrent(path, file)) {
    Read(path, file);
    if (!file.Text && Depth > 0) {
      file.Changes = State::kFailed;
    }
  }
  return file.Text.get();
}

bool ProfileStore::Set(const std::string& path, const std::string& section, const std::string& key,
                       const std::string& value) {
  if (Load(path) == nullptr) {
    return false;
  }
  File& file = Files[path];
  file.Text->Set(section, key, value);
  file.Changes = State::kChanged;
  return true;
}

void ProfileStore::Enter(const std::string& path) {
  ++Depth;
  const std::string folder = FolderPart(path);
  if (Locks.contains(folder)) {
    return;
  }
  FolderLock lock(folder, LockTime);
  // A folder that is made later can be locked then.
  if (lock.Result() != LockResult::kNoFolder) {
    Locks.emplace(folder, std::move(lock));
  }
}

bool ProfileStore::Leave() {
  if (--Depth > 0) {
    return true;
  }
  bool areStored = true;
  for (auto& [path, file] : Files) {
    if (file.Changes == State::kChanged && !Store(path, file)) {
      file.Text.reset();
      areStored = false;
    }
    file.Changes = State::kUnchanged;
  }
  Locks.clear();
  return areStored;
}

bool ProfileStore::IsLocked(const std::string& path) const {
  const auto lock = Locks.find(FolderPart(path));
  return lock != Locks.end() && lock->second.Result() == LockResult::kLocked;
}

// Makes the temporary file and sets its path. Not open if it cannot be made.
Descriptor ProfileStore::NewFileBeside(const std::string& path, mode_t mode,
                                       std::string& temporary) const {
  temporary = FixedPathBeside(path);
  Descriptor file;
  if (IsLocked(path)) {
    RemoveFile(temporary);  // only a run that was killed can have left it
    file = CreateNew(temporary, mode);
  }
  if (!file.IsOpen()) {
    // No lock, or something of that name that cannot be removed: an event can be called anything.
    temporary = RandomPathBeside(path);
    file = CreateNew(temporary, mode);
  }
  return file;
}

// Writes the text to a temporary file and renames it over the profile file.
bool ProfileStore::Store(const std::string& path, File& file) const {
  const bool isReplacement = file.Status.st_mode != 0;
  const mode_t mode = isReplacement ? 0600 : 0666;  // closed, until CopyAccess opens it
  std::string temporary;
  Descriptor written = NewFileBeside(path, mode, temporary);
  if (!written.IsOpen()) {
    return false;
  }
  const bool isWritten = WriteAll(written, file.Text->Get());
  if (isWritten && isReplacement) {
    CopyAccess(file.Opened, file.Status, written);
  }
  if (!isWritten || !FlushToDisk(written) || !RenameOver(temporary, path)) {
    RemoveFile(temporary);
    return false;
  }
  file.Opened = std::move(written);
  if (!StatusOf(file.Opened, file.Status)) {
    file.Status = {};
  }
  return true;
}
