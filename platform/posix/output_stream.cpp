#include "platform/output_stream.h"

#include <cerrno>

void OpenStream(std::ofstream& stream, const std::string& path, std::ios_base::openmode mode) {
  do {
    errno = 0;  // a failure need not set it
    stream.open(path, mode);
  } while (!stream.is_open() && errno == EINTR);
}
