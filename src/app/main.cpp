#include <iostream>

#include "app/Commands.h"

int main(int argc, char** argv) {
  return quarvo::app::runCommandLine(argc, argv, std::cout, std::cerr);
}
