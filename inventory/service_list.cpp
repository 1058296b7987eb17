#include "inventory/service_list.h"

int32_t CServicesList::Collect() { return 0; }

int32_t CServicesList::Print() { return 0; }
