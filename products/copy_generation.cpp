#include "products/copy_generation.h"

static int32_t copyGeneration = 1;

int32_t GetCopyGeneration() { return copyGeneration; }

void SetCopyGeneration(int32_t generation) { copyGeneration = generation; }

std::string GetCopiesRootKey() {
  return copyGeneration == 0 ? "SOFTWARE\\ZEK" : "SOFTWARE\\ZEK\\ORX\\InstalledCopies";
}

bool IsCopyKey(std::string_view name) { return copyGeneration != 0 || name == "ORX"; }

bool IsProductKey(std::string_view name) { return name.starts_with("ORX "); }
