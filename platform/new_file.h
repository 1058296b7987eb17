#pragma once

#include <memory>
#include <string>
#include <string_view>

// A new file that is written once from its beginning to its end. Only its owner may read it (POSIX:
// mode 0600; Windows: the security that new files inherit from the folder). The destructor removes
// it unless it was finished.
// Windows: CreateFileA with CREATE_NEW, WriteFile. POSIX: open with O_EXCL, write.
class NewFile {
 public:
  // Not open if anything of that name exists (a dangling link too), if the folder is missing, or if
  // the name is that of a device.
  explicit NewFile(const std::string& path);
  ~NewFile();
  NewFile(const NewFile&) = delete;
  NewFile& operator=(const NewFile&) = delete;

  bool IsOpen() const { return Opened != nullptr; }

  // Appends the bytes. False if not all of them were written, or without an open file.
  bool Write(std::string_view bytes);

  // Closes the file and keeps it. False without an open file, or if closing it fails.
  bool Finish();

 private:
  struct State;  // the system's handle of the file

  std::string Path;
  std::unique_ptr<State> Opened;  // null without an open file
};
