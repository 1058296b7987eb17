#pragma once

#include <cstdint>
#include <string>
#include <string_view>

// A file that the object makes, under a name that nothing has yet, and writes once from its
// beginning to its end. Only its owner may read it (POSIX: mode 0600; Windows: default security).
// What was not finished is removed with the object.
// Windows: CreateFileA with CREATE_NEW. POSIX: open with O_EXCL.
class NewFile {
 public:
  // Not open if anything of that name exists (a link that leads nowhere too), if the folder is
  // missing, or if the name is that of a device.
  explicit NewFile(const std::string& path);
  ~NewFile();
  NewFile(const NewFile&) = delete;
  NewFile& operator=(const NewFile&) = delete;

  bool IsOpen() const;

  // False if not all bytes were written.
  bool Write(std::string_view bytes);

  // Closes the file, which stays from then on. False if it was not open or could not be closed.
  bool Finish();

 private:
  std::string Path;
  intptr_t Handle = -1;
};
