// Files that the user names.
#ifndef VORKEL_CLI_INPUTFILE_H_
#define VORKEL_CLI_INPUTFILE_H_

#include <cstddef>
#include <stdexcept>
#include <string>

namespace cli {

// Why a file cannot be read, without its name: "no such file or directory".
class FileError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// The bytes of a file, or of standard input for "-"; of one that is longer than `most`, one byte
// more than that. Throws FileError.
std::string ReadFile(const std::string& name, std::size_t most);

}  // namespace cli

#endif  // VORKEL_CLI_INPUTFILE_H_
