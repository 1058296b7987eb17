#include "products/odbc_drivers.h"

void CODBCDriversList::Collect() {}

void CODBCDriversList::Print() {}
