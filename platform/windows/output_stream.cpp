#include "platform/output_stream.h"

#include "platform/windows/file_handle.h"
#include "platform/windows/patience.h"

void OpenStream(std::ofstream& stream, const std::string& path, std::ios_base::openmode mode) {
  // The stream's own failure does not say whether another program was the reason.
  OpenPatiently(kShortPatience, path, GENERIC_WRITE);
  stream.open(path, mode);
}
