// A C++ program that does nothing: what every program costs.

int main() {}
