#pragma once

#include <sys/stat.h>

#include "platform/posix/descriptor.h"

// Gives a file the owner, group, permissions and access control list of the one that it is to
// replace, as far as the process may and the file system can. Where the group or the list cannot be
// kept, the group of the file gets no more than what everybody has: it may be another group, and
// with a list the bits for the group are the list's mask. The status is the source's.
void CopyAccess(const Descriptor& source, const struct stat& status, const Descriptor& target);
