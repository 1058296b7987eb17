#include "platform/windows/profile_store.h"

#include "platform/files.h"
#include "platform/path.h"
#include "platform/temporary_path.h"
#include "platform/windows/file_entry.h"
#include "platform/windows/file_handle.h"
#include "platform/windows/file_replacement.h"
#include "platform/windows/patience.h"

ProfileStore& ProfileStore::GetInstance() {
  static ProfileStore instance;
  return instance;
}

static bool IsMissing(DWORD error) {
  return error == ERROR_FILE_NOT_FOUND || error == ERROR_PATH_NOT_FOUND;
}

void ProfileStore::Enter(const std::string& path) {
  ++Depth;
  const std::string folder = FolderPart(path);
  if (!Locks.contains(folder)) {
    Locks.try_emplace(folder, folder, LockTime);
  }
}

bool ProfileStore::Leave() {
  if (--Depth > 0) {
    return true;
  }
  bool areStored = true;
  for (const auto& [path, file] : Files) {
    if (file.Changes == State::kChanged && !ReplaceFileBy(file.Copy, path)) {
      areStored = false;
    }
    if (!file.Copy.empty()) {
      RemoveFile(file.Copy);
    }
  }
  Files.clear();
  Locks.clear();
  return areStored;
}

ProfileStore::Readable ProfileStore::OpenForReading(const std::string& path) {
  File& file = Files[path];
  if (file.Changes == State::kFailed || IsSymbolicLink(path)) {
    file.Changes = State::kFailed;
    return {};
  }
  Readable readable;
  readable.Path = file.Changes == State::kChanged ? file.Copy : path;
  const bool isOpen = CallWithPatience(kLongPatience, AccessDenied::kIsFinal, [&] {
    readable.Opened = OpenExisting(readable.Path, GENERIC_READ);
    char byte = 0;
    return readable.Opened && ReadSome(readable.Opened, &byte, sizeof byte);
  });
  if (!isOpen && !IsMissing(::GetLastError())) {
    file.Changes = State::kFailed;
    return {};
  }
  return readable;
}

// True without a copy too if there is no file yet.
bool ProfileStore::MakeCopy(const std::string& path, File& file) const {
  file.Copy = FixedPathBeside(path);
  if (Locks.at(FolderPart(path)).IsLocked()) {
    RemoveFile(file.Copy);  // only a run that was killed can have left it
  }
  if (KindOf(file.Copy) != FileKind::kNone) {
    // No lock, or something of that name that cannot be removed: an event can be called anything.
    file.Copy = RandomPathBeside(path);
  }
  return CallWithPatience(kLongPatience, AccessDenied::kIsFinal,
                          [&] {
                            return ::CopyFileA(path.c_str(), file.Copy.c_str(),
                                               /*bFailIfExists=*/TRUE) != FALSE;
                          }) ||
         IsMissing(::GetLastError());
}

bool ProfileStore::Write(const std::string& path, const std::string& section,
                         const std::string& key, const std::string& value) {
  File& file = Files[path];
  if (file.Changes == State::kUnchanged) {
    const bool isReadable = !OpenForReading(path).Path.empty();
    file.Changes = isReadable && MakeCopy(path, file) ? State::kChanged : State::kFailed;
  }
  const bool isWritten =
      file.Changes == State::kChanged &&
      CallWithPatience(kLongPatience, AccessDenied::kIsFinal, [&] {
        return ::WritePrivateProfileStringA(section.c_str(), key.c_str(), value.c_str(),
                                            file.Copy.c_str()) != FALSE;
      });
  if (!isWritten) {
    file.Changes = State::kFailed;
  }
  return isWritten;
}
