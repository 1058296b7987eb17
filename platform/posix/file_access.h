#pragma once

#include <sys/stat.h>

#include "platform/posix/descriptor.h"

// Copies the owner, group, permissions and access control list of a file to the one that is to
// replace it, as far as the process may and the file system can. If the group or the list cannot be
// copied, the target's group gets no more than what everybody has: it may be another group, and
// with a list the group bits of the mode are the list's mask. The status is the source's.
void CopyAccess(const Descriptor& source, const struct stat& status, const Descriptor& target);
