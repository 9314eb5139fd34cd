// Built with the same and with other containers and texts than the library: then linking it must fail.
#include TARVIK_HEADER

int main() { return 0; }
