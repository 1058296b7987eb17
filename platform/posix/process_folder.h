#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

// The parts of platform/processes.h that tests supply with other values than those of /proc.

// The entries of a folder that are numbers, at most 8192; nothing if it cannot be opened.
std::optional<std::vector<uint32_t>> ListNumbers(const std::string& folder);

// The name of an executable, at most 259 bytes, from what the link /proc/ID/exe contains: a path,
// after which the kernel adds " (deleted)" once the file has been removed or replaced.
std::string ExecutableName(std::string link);
