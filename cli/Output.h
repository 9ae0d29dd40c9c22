// Where the text of a command goes: standard output, or a file that is written whole or not at all.
//
// Tested by output.test and wrong.test.
#ifndef VORKEL_CLI_OUTPUT_H_
#define VORKEL_CLI_OUTPUT_H_

#include <string>
#include <string_view>

namespace cli {

// Makes the streams of a process safe to write to: one that is closed takes nothing, instead of
// being the first file that is opened, and one whose reader has gone away is an error and no
// signal. To be called first.
void PrepareStreams();

// Writes a text to standard output, behind what others have written to its C stream. That its
// reader has gone away is no failure; that it takes nothing else, such as on a full disk, is thrown
// as Failure.
void WriteOut(const std::string& text);

// Writes a text to standard error, where nobody may be listening.
void WriteError(const std::string& text);

// Writes a text to the file of -o, or to standard output when its name is "-". The file appears
// under its name when all of it is on the disk; one that was there before is else as it was. A link
// is followed to what it stands for. What is no plain file, such as /dev/null, has nothing to keep
// whole. Throws Failure.
void WriteFile(const std::string& text, const std::string& name);

// --- For who writes piece by piece (Stream.h) ---

// Writes all of a text to a file descriptor; the error of the system call, or 0.
int WriteAll(int descriptor, std::string_view text);
// The path of the file of -o behind links, also where there is no such file yet. Throws Failure.
std::string TargetOf(const std::string& name);
// Throws the Failure that a file of -o cannot be written. The name may be to blame, or what
// happened later, such as a full disk.
[[noreturn]] void RefuseFile(const std::string& name, const std::string& reason,
                             bool name_is_wrong);
// Throws the Failure that standard output takes nothing, for the error of a system call.
[[noreturn]] void RefuseOut(int error);

// The error of a system call in words: "no such file or directory".
std::string SystemReason(int error);

}  // namespace cli

#endif  // VORKEL_CLI_OUTPUT_H_
