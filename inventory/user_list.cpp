#include "inventory/user_list.h"

int32_t CUsersList::Collect() { return 0; }

int32_t CUsersList::Print() { return 0; }
