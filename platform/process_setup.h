#pragma once

// Prepares this process against what its caller may have left: to be called first in main, before
// any file is opened. It cannot fail.
//
// POSIX: opens /dev/null on those of the descriptors 0 to 2 that are closed, so that no file gets
// one of these numbers and receives the text for standard output; ignores SIGPIPE and SIGXFSZ, so
// that a closed pipe or a file size limit makes a write fail and does not end the process.
// Windows: SetErrorMode, so that an empty drive or a missing disk makes a call fail and does not
// open a message box; SetDefaultDllDirectories, where the system has it, so that libraries loaded
// later come from the system folder.
void PrepareProcess();
