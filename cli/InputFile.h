// Files that the user names.
#ifndef VORKEL_CLI_INPUTFILE_H_
#define VORKEL_CLI_INPUTFILE_H_

#include <cstddef>
#include <stdexcept>
#include <string>
#include <string_view>

namespace cli {

// Why a file cannot be read, without its name: "no such file or directory".
class FileError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// The bytes of a file, or of standard input for "-"; of one that is longer than `most`, one byte
// more than that. Throws FileError.
std::string ReadFile(const std::string& name, std::size_t most);

// The same for one that is a `kind`, such as "plan", and is the value of an option, or of none: it
// throws Failure, also when the file is longer.
std::string ReadFileOf(std::string_view kind, const std::string& name, std::size_t most,
                       std::string_view option = "");

}  // namespace cli

#endif  // VORKEL_CLI_INPUTFILE_H_
