// Prints the manual page of the program, when the package is built.
#include <cstdio>

#include "cli/Manual.h"

int main() {
  const std::string page = cli::Manual();
  const bool is_written = std::fwrite(page.data(), 1, page.size(), stdout) == page.size();
  return std::fflush(stdout) == 0 && is_written ? 0 : 1;
}
