#include "platform/new_file.h"

#include "platform/posix/file_calls.h"
#include "platform/posix/text_file.h"

struct NewFile::State {
  Descriptor File;
};

NewFile::NewFile(const std::string& path) : Path(path) {
  Descriptor file = CreateNew(path, /*mode=*/0600);
  if (file.IsOpen()) {
    Opened = std::make_unique<State>(State{std::move(file)});
  }
}

NewFile::~NewFile() {
  if (IsOpen()) {
    RemoveFile(Path);
  }
}

bool NewFile::Write(std::string_view bytes) { return IsOpen() && WriteAll(Opened->File, bytes); }

bool NewFile::Finish() {
  const bool isClosed = IsOpen() && ::close(Opened->File.Release()) == 0;
  Opened.reset();
  return isClosed;
}
