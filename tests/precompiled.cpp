// Holds the headers that are compiled once for all tests; see CMakeLists.txt.
int main() {}
