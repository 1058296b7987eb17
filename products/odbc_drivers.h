#pragma once

#include <string>
#include <vector>

#include "products/parameter.h"

struct CODBCDriver {
  explicit CODBCDriver(const std::string& name);

  // Fills Parameters; a driver without a key of its own keeps none.
  void Collect();

  std::string Name;  // as the catalogue holds it
  std::vector<CParameter> Parameters;
};

// The product family's drivers in the machine's ODBC catalogue, in its order. Not one of the Info
// lists, though of their shape.
class CODBCDriversList {
 public:
  // Appends the drivers whose names hold "ZEK ORX", case respected.
  void Collect();

  // Writes to the CLogger stream; fields are padded as the stream's adjustment says.
  void Print();

  std::vector<CODBCDriver> Drivers;
};
