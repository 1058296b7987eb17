#pragma once

#include <cstdint>

// One piece of the machine's state: gathered into memory, then written to the event log. Objects
// live for one section of a snapshot. Neither result is looked at: what cannot be gathered is
// missing from what is printed, and no error text reaches the report.
class Info {
 public:
  virtual ~Info() = default;

  // Gathers the data. 0, or the code of the step that failed.
  virtual int32_t Collect() = 0;

  // Writes the data to the CLogger stream.
  virtual int32_t Print() = 0;
};
