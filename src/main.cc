#include <iostream>

#include "cli/Run.h"

int main(int argc, char** argv) {
  std::ios::sync_with_stdio(false);
  return bw::runMain(argc, argv);
}
