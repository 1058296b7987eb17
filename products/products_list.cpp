#include "products/products_list.h"

int32_t CORXProductsList::Collect() { return 0; }

int32_t CORXProductsList::Print() { return 0; }

void SetCopyGeneration(int32_t) {}
