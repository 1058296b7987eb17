#pragma once

// From here on, memory that the process frees is kept for what it needs next. Without that, a loop
// that takes and frees some hundred kilobytes each time may get them from the system, page by page,
// each time.
// Windows: nothing. POSIX: mallopt.
void KeepFreedMemory();
