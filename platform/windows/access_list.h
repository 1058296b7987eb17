#pragma once

#include "platform/windows/system.h"

// The access list for a new object, from the system's text form (SDDL).
class AccessList {
 public:
  explicit AccessList(const char* text);
  ~AccessList();
  AccessList(const AccessList&) = delete;
  AccessList& operator=(const AccessList&) = delete;

  // For the call that creates the object. Null, which means default security, if the system did not
  // accept the text.
  SECURITY_ATTRIBUTES* Get();

 private:
  SECURITY_ATTRIBUTES Attributes = {sizeof Attributes, /*lpSecurityDescriptor=*/nullptr,
                                    /*bInheritHandle=*/FALSE};
};
