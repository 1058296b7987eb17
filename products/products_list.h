#pragma once

#include <cstdint>
#include <vector>

#include "inventory/info.h"
#include "products/copy_records.h"

// The installed copies of the product family, in one of two registry layouts. The copy generation
// (products/copy_generation.h) selects the layout for Collect and the report for Print.
class CORXProductsList : public Info {
 public:
  // Appends the copies, in the registry's order. Returns 0.
  int32_t Collect() override;

  int32_t Print() override;

  // Empties the list. Needed between the two layouts, as Collect appends.
  void Clear();

  std::vector<CORXCopy> Copies;

 private:
  void PrintBeforeV9() const;
  void PrintSinceV9() const;
};
