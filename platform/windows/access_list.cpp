#include "platform/windows/access_list.h"

// It needs windows.h.
#include <sddl.h>

AccessList::AccessList(const char* text) {
  ::ConvertStringSecurityDescriptorToSecurityDescriptorA(text, SDDL_REVISION_1,
                                                         &Attributes.lpSecurityDescriptor,
                                                         /*SecurityDescriptorSize=*/nullptr);
}

AccessList::~AccessList() { ::LocalFree(Attributes.lpSecurityDescriptor); }

SECURITY_ATTRIBUTES* AccessList::Get() {
  return Attributes.lpSecurityDescriptor == nullptr ? nullptr : &Attributes;
}
