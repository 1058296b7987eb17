#pragma once

#include <string>
#include <vector>

#include "products/parameter.h"

struct CODBCDriver {
  explicit CODBCDriver(const std::string& name);

  // Fills Parameters; a driver without a key of its own has none.
  void Collect();

  std::string Name;  // as in the catalogue
  std::vector<CParameter> Parameters;
};

// The product family's drivers in the machine's ODBC catalogue, in its order. It has the operations
// of the Info lists and is not one of them.
class CODBCDriversList {
 public:
  // Appends the drivers whose names contain "ZEK ORX", case respected.
  void Collect();

  // Writes to the CLogger stream, whose adjustment decides on which side fields are padded.
  void Print();

  std::vector<CODBCDriver> Drivers;
};
