#pragma once

#include <string>

#include "tests/support/file_text.h"

// An empty folder, removed with the object. Paths are written with slashes, whatever the platform's
// separator.
class ScratchFolder {
 public:
  ScratchFolder();
  ~ScratchFolder();
  ScratchFolder(const ScratchFolder&) = delete;
  ScratchFolder& operator=(const ScratchFolder&) = delete;

  std::string In(const std::string& path) const;

  // Makes a file with this text, or a folder if the path ends in a slash, and the parent folders.
  // Returns the full path.
  std::string Make(const std::string& path, const std::string& text) const;

  // The same, with the path as the text.
  std::string Make(const std::string& path) const { return Make(path, path); }

  // Every file and folder, a line each, a folder's with a slash at its end.
  std::string Tree() const;

  // A text with "@" for the root, "<time>" for a time stamp, slashes and plain line ends: the same
  // on every machine, as the golden texts are. Native is the reverse for paths.
  std::string Neutral(std::string text) const;
  std::string Native(const std::string& text) const;

  std::string Root;
};
