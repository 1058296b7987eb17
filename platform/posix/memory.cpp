#include "platform/memory.h"

#include <malloc.h>

void KeepFreedMemory() {
  constexpr int neverGiveBack = -1;
  ::mallopt(M_TRIM_THRESHOLD, neverGiveBack);
}
