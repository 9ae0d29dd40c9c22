// The text of a device file that is safe to parse.
//
// Tested by device_file_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_FILETEXT_H_
#define VORKEL_HOST_BUNDLED_DEVICE_FILETEXT_H_

#include <cstddef>
#include <string>
#include <string_view>

namespace Device {

// The longest device file, in bytes. One speed grade takes about 3 KiB.
inline constexpr std::size_t kLargestFile = 256 * 1024;

// The most dots in a device file; a speed grade has some 40. Each dot of a dotted key nests
// one table in another, and a parser that follows the nesting must not run out of stack.
inline constexpr std::size_t kMostDots = 4096;

// The bytes of the regular file at `path`. Throws DeviceError when it cannot be read, is no
// regular file, or is too long. Never blocks, not even on a named pipe.
std::string ReadFileText(const std::string& path);

// Throws DeviceError when a text exceeds a limit from above; `path` is for the message.
void RequireParsable(const std::string& path, std::string_view text);

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_FILETEXT_H_
