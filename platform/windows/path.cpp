#include "platform/path.h"

#include <algorithm>

#include "platform/ascii_case.h"
#include "platform/windows/system.h"

const char kPathSeparator = '\\';
const std::string_view kPathSeparators = "\\/";

static UINT FileCodePage() { return ::AreFileApisANSI() != FALSE ? CP_ACP : CP_OEMCP; }

bool IsLeadByte(char byte) {
  return ::IsDBCSLeadByteEx(FileCodePage(), static_cast<BYTE>(byte)) != FALSE;
}

bool IsRootedPath(const std::string& path) { return path.find(':') != std::string::npos; }

// The digits of the serial and parallel ports can be superscript too.
static bool IsPortDigit(std::string_view text) {
  wchar_t digit[2] = {};
  const int count = ::MultiByteToWideChar(FileCodePage(), /*dwFlags=*/0, text.data(),
                                          static_cast<int>(text.size()), digit, 2);
  return count == 1 && std::wstring_view(L"0123456789\u00B9\u00B2\u00B3").find(digit[0]) !=
                           std::wstring_view::npos;
}

static bool IsDeviceName(std::string_view part) {
  constexpr std::string_view devices[] = {"CON", "PRN", "AUX", "NUL", "CONIN$", "CONOUT$"};
  std::string_view name = part.substr(0, part.find('.'));
  name = name.substr(0, name.find_last_not_of(' ') + 1);
  const auto is = [name](std::string_view device) { return EqualsIgnoringCase(name, device); };
  const std::string_view port = name.substr(0, 3);
  const bool isPort = EqualsIgnoringCase(port, "COM") || EqualsIgnoringCase(port, "LPT");
  return std::any_of(std::begin(devices), std::end(devices), is) ||
         (isPort && IsPortDigit(name.substr(3)));
}

bool IsKeptName(std::string_view part) {
  if (part.empty() || part == "." || part == "..") {
    return true;
  }
  const auto isRefused = [](char c) {
    return static_cast<unsigned char>(c) < ' ' ||
           std::string_view("<>:\"|?*").find(c) != std::string_view::npos;
  };
  return part.back() != ' ' && part.back() != '.' && !IsDeviceName(part) &&
         std::none_of(part.begin(), part.end(), isRefused);
}

bool FitsPathLimit(const std::string& path) {
  const int length = ::MultiByteToWideChar(FileCodePage(), /*dwFlags=*/0, path.data(),
                                           static_cast<int>(path.size()),
                                           /*lpWideCharStr=*/nullptr, /*cchWideChar=*/0);
  return length < MAX_PATH;
}

std::optional<std::string> AbsolutePath(const std::string& path) {
  char buffer[MAX_PATH] = {};
  const DWORD length =
      ::GetFullPathNameA(path.c_str(), sizeof buffer, buffer, /*lpFilePart=*/nullptr);
  if (length == 0 || length >= sizeof buffer) {
    return std::nullopt;
  }
  return buffer;
}
