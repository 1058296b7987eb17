#pragma once

#include <chrono>
#include <functional>
#include <string>

#include "platform/posix/descriptor.h"

// Runs work that may never return in a child process (fork), and returns what it has written to the
// output when it ends or the limit has passed, whichever is first. The child is killed then,
// and also if this process ends before. It has no other descriptors than its output and /dev/null
// as the three standard ones, so that it holds no lock and no pipe of the caller. A child that even
// SIGKILL does not end within a second, in a system call that nothing interrupts, is left to init.
// Returns an empty text if there can be no child.
std::string ChildOutput(const std::function<void(const Descriptor& output)>& work,
                        std::chrono::milliseconds limit);
