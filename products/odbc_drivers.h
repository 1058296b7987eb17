#pragma once

#include <cstdint>

class CODBCDriversList {
 public:
  void Collect();
  void Print();
};
