#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "platform/windows/system.h"

// The only way here to open, read and write files. Sizes and offsets count bytes.

inline constexpr DWORD kShareAll = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;

// Opens an existing file (CreateFileA with OPEN_EXISTING). Empty, with the reason in GetLastError,
// if that fails.
UniqueHandle OpenExisting(const std::string& path, DWORD access, DWORD share = kShareAll,
                          DWORD flags = FILE_ATTRIBUTE_NORMAL);

// The same, repeated while another program keeps the file from being opened (CallWithPatience).
UniqueHandle OpenPatiently(int attempts, const std::string& path, DWORD access,
                           DWORD share = kShareAll, DWORD flags = FILE_ATTRIBUTE_NORMAL);

// Creates a file for writing, which no other program can open until it is closed (CreateFileA with
// CREATE_NEW). Empty, with the reason in GetLastError, if anything of that name exists or it cannot
// be created.
UniqueHandle CreateNew(const std::string& path);

// Nothing without a file, and for a pipe or device (GetFileType, GetFileSizeEx).
std::optional<uint64_t> RegularFileSize(const UniqueHandle& file);

// Reads at most size bytes, from the current offset or the given position on, and returns how many:
// 0 at the end. Nothing if that fails (ReadFile).
std::optional<size_t> ReadSome(const UniqueHandle& file, char* buffer, size_t size,
                               OVERLAPPED* position = nullptr);

// False if not all bytes were written (WriteFile).
bool WriteAll(const UniqueHandle& file, std::string_view bytes);

// Copies that many bytes, or fewer if the source ends before. False if reading or writing fails.
bool CopyBytes(const UniqueHandle& source, uint64_t size, const UniqueHandle& target);
