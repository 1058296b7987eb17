#include "platform/output_stream.h"

#include "platform/posix/descriptor.h"

void OpenStream(std::ofstream& stream, const std::string& path, std::ios_base::openmode mode) {
  RetryOnInterrupt([&] {
    stream.open(path, mode);
    return stream.is_open() ? 0 : -1;
  });
}
