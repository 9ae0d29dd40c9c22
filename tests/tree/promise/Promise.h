// What it says of its tests is wrong but for the first one, and for the folder.
//
// Tested by fractions_test.cpp, no_such_test.cpp and, as a whole,
// by tests/tree/no_such.test and tests/tree. What no_other_test.cpp does is another matter.
