#pragma once

#include <cstdint>
#include <vector>

#include "inventory/info.h"
#include "products/copy_records.h"

// The installed copies of the product family, in one registry layout at a time: the copy
// generation in force (products/copy_generation.h) tells Collect where to look and Print which of
// the two reports to write.
class CORXProductsList : public Info {
 public:
  // Appends the copies to what the list holds, in the registry's order. Always 0.
  int32_t Collect() override;

  int32_t Print() override;

  // Between the two layouts, so that the copies of one do not stand in the report of the other.
  void Clear();

  std::vector<CORXCopy> Copies;

 private:
  void PrintBeforeV9() const;
  void PrintSinceV9() const;
};
