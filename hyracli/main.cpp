#include <iostream>
#include <string>
#include <vector>

#include "hyracli/HyraCli.h"

int main(int argc, char** argv) {
  return Hyracli::Main(std::vector<std::string>(argv + 1, argv + argc), std::cout, std::cerr);
}
