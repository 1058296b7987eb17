#include "platform/output_stream.h"

#include "platform/windows/patience.h"

void OpenStream(std::ofstream& stream, const std::string& path, std::ios_base::openmode mode) {
  // The stream's own failure does not say whether another program was the reason.
  CallWithPatience(/*attempts=*/10, AccessDenied::kIsFinal, [&path] {
    return OwnIfValid(::CreateFileA(path.c_str(), GENERIC_WRITE,
                                    FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                                    /*lpSecurityAttributes=*/nullptr, OPEN_EXISTING,
                                    FILE_ATTRIBUTE_NORMAL, /*hTemplateFile=*/nullptr)) != nullptr;
  });
  stream.open(path, mode);
}
