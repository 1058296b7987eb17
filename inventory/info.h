#pragma once

#include <cstdint>

// One part of the machine's state: collected into memory, then written to the event log. An object
// lives for one section of a snapshot. The callers ignore both results: what cannot be collected is
// missing from the report, and the report contains no error text.
class Info {
 public:
  virtual ~Info() = default;

  // Collects the data. Returns 0, or the code of the step that failed.
  virtual int32_t Collect() = 0;

  // Writes the data to the CLogger stream. Returns 0.
  virtual int32_t Print() = 0;
};
