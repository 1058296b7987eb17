#pragma once

// From here on the process keeps the memory that it frees and uses it again. Otherwise a loop that
// allocates and frees some hundred kilobytes may get them from the system, page by page, each time.
// Windows: does nothing. POSIX: mallopt.
void KeepFreedMemory();
