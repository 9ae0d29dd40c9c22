// Mistakes as sentences: the only place that has any.
//
// Tested by mistake_text_test.cpp.
#ifndef VORKEL_PLANNER_READ_MISTAKETEXT_H_
#define VORKEL_PLANNER_READ_MISTAKETEXT_H_

#include <string>

#include "planner/read/Mistake.h"

namespace planner::read {

// A mistake as one line without its end, beginning with its place: "--in: ..." of an option,
// "FILE:LINE:COLUMN: ..." in a file.
std::string TextOf(const Mistake& mistake);
std::string TextOf(const Doubt& doubt);

// How a place begins a sentence: "--in", "FILE:1:13: input 0", "FILE:3: output 0: -phase".
std::string TextOf(const Place& place);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_MISTAKETEXT_H_
