#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "platform/posix/descriptor.h"

// All bytes from a descriptor's current offset to the end; nothing if a read fails.
std::optional<std::string> ReadAll(const Descriptor& file);

// All bytes of a file; nothing if it cannot be opened or read.
std::optional<std::string> ReadTextFile(const std::string& path);

// Writes at the current offset. False if not all bytes were written.
bool WriteAll(const Descriptor& file, std::string_view bytes);
