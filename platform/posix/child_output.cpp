#include "platform/posix/child_output.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>

namespace {

using Clock = std::chrono::steady_clock;

[[noreturn]] void RunInChild(const std::function<void(const Descriptor&)>& work, int output,
                             pid_t parent) {
  ::prctl(PR_SET_PDEATHSIG, SIGKILL);
  if (::getppid() != parent) {  // it has ended before the call above
    ::_exit(1);
  }
  constexpr int ownOutput = STDERR_FILENO + 1;
  ::dup2(output, ownOutput);
  const int null = ::open("/dev/null", O_RDWR);
  for (int standard = STDIN_FILENO; standard < ownOutput; ++standard) {
    ::dup2(null, standard);
  }
  ::close_range(ownOutput + 1, ~0U, /*flags=*/0);
  work(Descriptor(ownOutput));
  ::_exit(0);
}

// Waits until one of the events, or the end of the other side, and returns whether it came.
bool Await(const Descriptor& pipe, short events, Clock::time_point deadline) {
  pollfd state = {pipe.Get(), events, 0};
  const int count = RetryOnInterrupt([&] {
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(deadline - Clock::now());
    return ::poll(&state, /*nfds=*/1, static_cast<int>(std::max<int64_t>(left.count(), 0)));
  });
  return count > 0;
}

std::string ReadUntil(const Descriptor& pipe, Clock::time_point deadline) {
  std::string text;
  char piece[65536];
  while (Clock::now() < deadline && Await(pipe, POLLIN, deadline)) {
    const ssize_t count = RetryOnInterrupt([&] { return ::read(pipe.Get(), piece, sizeof piece); });
    if (count <= 0) {
      break;
    }
    text.append(piece, static_cast<size_t>(count));
  }
  return text;
}

}  // namespace

std::string ChildOutput(const std::function<void(const Descriptor& output)>& work,
                        std::chrono::milliseconds limit) {
  const Clock::time_point deadline = Clock::now() + limit;
  int ends[2] = {};
  if (::pipe2(ends, O_CLOEXEC) != 0) {
    return "";
  }
  const Descriptor input(ends[0]);
  Descriptor output(ends[1]);
  const pid_t parent = ::getpid();
  const pid_t child = ::fork();
  if (child == 0) {
    RunInChild(work, output.Get(), parent);
  }
  output.Reset(-1);
  if (child < 0) {
    return "";
  }
  std::string text = ReadUntil(input, deadline);
  ::kill(child, SIGKILL);
  // A child that ends closes its side of the pipe first.
  if (Await(input, /*events=*/0, Clock::now() + std::chrono::seconds(1))) {
    RetryOnInterrupt([&] { return ::waitpid(child, /*wstatus=*/nullptr, /*options=*/0); });
  }
  return text;
}
