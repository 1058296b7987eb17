#include "platform/process_setup.h"

#include "platform/windows/system.h"

void PrepareProcess() { ::SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOOPENFILEERRORBOX); }
