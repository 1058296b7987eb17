#include "platform/process_setup.h"

#include <fcntl.h>
#include <unistd.h>

#include <csignal>

#include "platform/posix/descriptor.h"

// The system assigns the lowest free number.
static void OpenStandardDescriptors() {
  int number = 0;
  while (number >= 0 && number <= STDERR_FILENO) {
    number = RetryOnInterrupt([] { return ::open("/dev/null", O_RDWR); });
  }
  const Descriptor notNeeded(number);
}

void PrepareProcess() {
  OpenStandardDescriptors();
  std::signal(SIGPIPE, SIG_IGN);
  std::signal(SIGXFSZ, SIG_IGN);
}
