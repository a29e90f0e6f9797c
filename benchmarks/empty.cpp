// The least that a C++ program does: the yardstick of start-up times. It links the standard library for good.
#include <iostream>

int main() { return std::cout.good() ? 0 : 1; }
