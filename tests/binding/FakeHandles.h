// A host of script handles that notes what it is asked for and answers as told: the base classes
// of the program that is linked with FakeHandles.cpp, in place of the host's library.
#ifndef VORKEL_TESTS_BINDING_FAKEHANDLES_H_
#define VORKEL_TESTS_BINDING_FAKEHANDLES_H_

#include <functional>
#include <string>
#include <vector>

struct FakeHandles {
  static FakeHandles& Instance();

  // Every handle made, made the result or destroyed, in order.
  std::vector<std::string> calls;

  // The value of the last handle made with one.
  void* value = nullptr;

  // Run while a handle is made, and while it is made the result; they may throw.
  std::function<void()> whileMade;
  std::function<void()> whileMadeTheResult;

  // What SetResult answers.
  int setResultStatus = 0;
};

#endif  // VORKEL_TESTS_BINDING_FAKEHANDLES_H_
