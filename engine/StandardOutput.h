// C's standard output, for text that must not get lost and must not get elsewhere.
//
// A script can close its standard output. Then the next file that anybody opens has its number, and
// what is printed goes there: into a list of the script's, or a database of its host. Such a file
// can be told from a standard output that somebody has put there: a file that is opened for oneself
// is not handed on to other programs (close-on-exec), which is what a standard output is for, and
// what dup2 makes of a file.
//
// Tested by standard_output_test.cpp.
#ifndef VORKEL_ENGINE_STANDARDOUTPUT_H_
#define VORKEL_ENGINE_STANDARDOUTPUT_H_

#include <string_view>

namespace Ip {

// How text has got lost; positive numbers are those of errno.
inline constexpr int kWritten = 0;
inline constexpr int kStandsForAnother = -1;  // the number is that of a file of somebody else's

// Writes a text behind all that C has printed so far, and past its buffer, so that it is out when
// this returns and no part of it stays behind to come out later. How it has got lost, or kWritten:
// a file that does not block and takes nothing for ten seconds gets no more.
// Several threads can write: each text comes out whole.
int WriteToStandardOutput(std::string_view text);

}  // namespace Ip

#endif  // VORKEL_ENGINE_STANDARDOUTPUT_H_
