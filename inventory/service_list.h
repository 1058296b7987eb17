#pragma once

#include <cstdint>

#include "inventory/info.h"

class CServicesList : public Info {
 public:
  int32_t Collect() override;
  int32_t Print() override;
};
