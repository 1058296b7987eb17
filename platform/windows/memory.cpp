#include "platform/memory.h"

void KeepFreedMemory() {}
