#include "platform/held_file.h"

#include "platform/windows/patience.h"

void WaitWhileHeld(const std::string& path) {
  CallWithPatience(/*attempts=*/10, AccessDenied::kIsFinal, [&path] {
    return OwnIfValid(::CreateFileA(path.c_str(), GENERIC_WRITE,
                                    FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                                    /*lpSecurityAttributes=*/nullptr, OPEN_EXISTING,
                                    FILE_ATTRIBUTE_NORMAL, /*hTemplateFile=*/nullptr)) != nullptr;
  });
}
