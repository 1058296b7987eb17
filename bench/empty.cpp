// The least that a program costs: it is loaded and ends.
int main() { return 0; }
