// Does nothing: the cost of loading and ending a program.
int main() { return 0; }
