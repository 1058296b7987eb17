#include "platform/windows/file_handle.h"

#include <algorithm>

#include "platform/windows/patience.h"

// A size as the calls take it, which count in 32 bits.
static DWORD InOneCall(size_t size) { return static_cast<DWORD>(std::min(size, size_t{1} << 30)); }

UniqueHandle OpenExisting(const std::string& path, DWORD access, DWORD share, DWORD flags) {
  return OwnIfValid(::CreateFileA(path.c_str(), access, share, /*lpSecurityAttributes=*/nullptr,
                                  OPEN_EXISTING, flags, /*hTemplateFile=*/nullptr));
}

UniqueHandle OpenPatiently(int attempts, const std::string& path, DWORD access, DWORD share,
                           DWORD flags) {
  UniqueHandle file;
  CallWithPatience(attempts, AccessDenied::kIsFinal, [&] {
    file = OpenExisting(path, access, share, flags);
    return file != nullptr;
  });
  return file;
}

UniqueHandle CreateNew(const std::string& path) {
  return OwnIfValid(::CreateFileA(path.c_str(), GENERIC_WRITE, /*dwShareMode=*/0,
                                  /*lpSecurityAttributes=*/nullptr, CREATE_NEW,
                                  FILE_ATTRIBUTE_NORMAL, /*hTemplateFile=*/nullptr));
}

std::optional<uint64_t> RegularFileSize(const UniqueHandle& file) {
  LARGE_INTEGER size = {};
  if (!file || ::GetFileType(file.get()) != FILE_TYPE_DISK ||
      ::GetFileSizeEx(file.get(), &size) == FALSE) {
    return std::nullopt;
  }
  return static_cast<uint64_t>(size.QuadPart);
}

std::optional<size_t> ReadSome(const UniqueHandle& file, char* buffer, size_t size,
                               OVERLAPPED* position) {
  DWORD count = 0;
  const BOOL isRead = ::ReadFile(file.get(), buffer, InOneCall(size), &count, position);
  return isRead == FALSE ? std::nullopt : std::optional<size_t>(count);
}

bool WriteAll(const UniqueHandle& file, std::string_view bytes) {
  while (!bytes.empty()) {
    DWORD count = 0;
    if (::WriteFile(file.get(), bytes.data(), InOneCall(bytes.size()), &count,
                    /*lpOverlapped=*/nullptr) == FALSE ||
        count == 0) {
      return false;
    }
    bytes.remove_prefix(count);
  }
  return true;
}

bool CopyBytes(const UniqueHandle& source, uint64_t size, const UniqueHandle& target) {
  char buffer[65536];
  while (size > 0) {
    const auto most = static_cast<size_t>(std::min<uint64_t>(size, sizeof buffer));
    const std::optional<size_t> count = ReadSome(source, buffer, most);
    if (!count || !WriteAll(target, {buffer, *count})) {
      return false;
    }
    if (*count == 0) {
      break;
    }
    size -= *count;
  }
  return true;
}
