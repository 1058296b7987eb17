#include "inventory/software_list.h"

int32_t CProductsList::Collect() { return 0; }

int32_t CProductsList::Print() { return 0; }
