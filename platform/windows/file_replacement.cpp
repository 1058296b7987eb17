#include "platform/windows/file_replacement.h"

#include <algorithm>

#include "platform/windows/patience.h"

UniqueHandle OpenShared(const std::string& path, DWORD access) {
  return OwnIfValid(::CreateFileA(path.c_str(), access,
                                  FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                                  /*lpSecurityAttributes=*/nullptr, OPEN_EXISTING,
                                  FILE_ATTRIBUTE_NORMAL, /*hTemplateFile=*/nullptr));
}

static UniqueHandle OpenPatiently(const std::string& path, DWORD access) {
  UniqueHandle file;
  CallWithPatience(25, AccessDenied::kIsFinal, [&] {
    file = OpenShared(path, access);
    return file != nullptr;
  });
  return file;
}

bool FlushToDisk(const std::string& path) {
  const UniqueHandle file = OpenPatiently(path, GENERIC_WRITE);
  return file && CallWithPatience(25, AccessDenied::kIsFinal,
                                  [&] { return ::FlushFileBuffers(file.get()) != FALSE; });
}

bool RenameOver(const std::string& source, const std::string& target) {
  return CallWithPatience(25, AccessDenied::kMayPass, [&] {
    return ::MoveFileExA(source.c_str(), target.c_str(),
                         MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH) != FALSE;
  });
}

static bool SetSize(HANDLE file, LONGLONG size) {
  LARGE_INTEGER offset;
  offset.QuadPart = size;
  return ::SetFilePointerEx(file, offset, /*lpNewFilePointer=*/nullptr, FILE_BEGIN) != FALSE &&
         ::SetEndOfFile(file) != FALSE;
}

static bool CopyBytes(HANDLE source, HANDLE target) {
  char buffer[65536];
  for (;;) {
    DWORD count = 0;
    if (::ReadFile(source, buffer, sizeof buffer, &count, /*lpOverlapped=*/nullptr) == FALSE) {
      return false;
    }
    if (count == 0) {
      return true;
    }
    DWORD written = 0;
    if (::WriteFile(target, buffer, count, &written, /*lpOverlapped=*/nullptr) == FALSE ||
        written != count) {
      return false;
    }
  }
}

static bool WriteInto(const std::string& source, const std::string& target) {
  const UniqueHandle from = OpenPatiently(source, GENERIC_READ);
  const UniqueHandle to = OpenPatiently(target, GENERIC_WRITE);
  LARGE_INTEGER newSize = {};
  LARGE_INTEGER oldSize = {};
  if (!from || !to || ::GetFileSizeEx(from.get(), &newSize) == FALSE ||
      ::GetFileSizeEx(to.get(), &oldSize) == FALSE) {
    return false;
  }
  // Takes the space first, so that a full disk is noticed while the old contents are still there.
  if (!SetSize(to.get(), std::max(oldSize.QuadPart, newSize.QuadPart))) {
    SetSize(to.get(), oldSize.QuadPart);
    return false;
  }
  const LARGE_INTEGER start = {};
  return ::SetFilePointerEx(to.get(), start, /*lpNewFilePointer=*/nullptr, FILE_BEGIN) != FALSE &&
         CopyBytes(from.get(), to.get()) && SetSize(to.get(), newSize.QuadPart) &&
         ::FlushFileBuffers(to.get()) != FALSE;
}

bool ReplaceFileBy(const std::string& source, const std::string& target) {
  return FlushToDisk(source) && (RenameOver(source, target) || WriteInto(source, target));
}
