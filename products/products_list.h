#pragma once

#include <cstdint>

#include "inventory/info.h"

void SetCopyGeneration(int32_t generation);

class CORXProductsList : public Info {
 public:
  int32_t Collect() override;
  int32_t Print() override;
  void Clear() {}
};
