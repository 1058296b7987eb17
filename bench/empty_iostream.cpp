// Does nothing: the cost of loading and ending a program with streams and the shared C++ library.
#include <iostream>

int main() { return 0; }
