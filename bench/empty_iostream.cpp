// The least that a program with streams costs, the C++ library being loaded as usual.
#include <iostream>

int main() { return 0; }
