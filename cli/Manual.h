// The manual page of the program, made of what its help is made of.
//
// Tested by manual.test.
#ifndef VORKEL_CLI_MANUAL_H_
#define VORKEL_CLI_MANUAL_H_

#include <string>

namespace cli {

// In the macros of man(7).
std::string Manual();

}  // namespace cli

#endif  // VORKEL_CLI_MANUAL_H_
