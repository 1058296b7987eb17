#include "platform/new_file.h"

#include "platform/windows/file_entry.h"
#include "platform/windows/file_handle.h"

struct NewFile::State {
  UniqueHandle File;
};

NewFile::NewFile(const std::string& path) : Path(path) {
  UniqueHandle file = CreateNew(path);
  if (RegularFileSize(file)) {
    Opened = std::make_unique<State>(State{std::move(file)});
  }
}

NewFile::~NewFile() {
  if (IsOpen()) {
    Opened.reset();
    RemoveFile(Path);
  }
}

bool NewFile::Write(std::string_view bytes) { return IsOpen() && WriteAll(Opened->File, bytes); }

bool NewFile::Finish() {
  const bool isClosed = IsOpen() && ::CloseHandle(Opened->File.release()) != FALSE;
  Opened.reset();
  return isClosed;
}
