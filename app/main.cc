#include <iostream>
int main() { std::cout << "mirvae\n"; }
