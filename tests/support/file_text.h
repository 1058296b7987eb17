#pragma once

#include <cstdint>
#include <string>
#include <utility>

// All bytes of a file; empty if it cannot be read.
std::string FileText(const std::string& path);
void WriteFileText(const std::string& path, const std::string& text);

// The bytes of a file of tests/golden/.
std::string Golden(const std::string& name);

// The text with "<time>" for each time stamp.
std::string WithoutTimes(const std::string& text);

// The text with each occurrence replaced.
std::string Replaced(std::string text, const std::string& old, const std::string& by);

std::string Repeated(const std::string& text, size_t times);

// Reads bytes as a file is read: fills at most size bytes of the buffer from the offset on, and
// returns how many.
inline auto ReaderOf(std::string bytes) {
  return [bytes = std::move(bytes)](uint64_t offset, char* buffer, size_t size) {
    return offset < bytes.size() ? bytes.copy(buffer, size, offset) : size_t{0};
  };
}
