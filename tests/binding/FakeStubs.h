// A Tcl of five functions: the exported stubs table of the program that is linked with
// FakeStubs.cpp. Every other entry is null, so that a call of it ends the program.
//
// The functions note what they are asked for. Interpreters and Tcl objects are mere addresses;
// an object is the text it has.
#ifndef VORKEL_TESTS_BINDING_FAKESTUBS_H_
#define VORKEL_TESTS_BINDING_FAKESTUBS_H_

#include <tcl.h>

#include <string>
#include <vector>

struct FakeStubs {
  static FakeStubs& Instance();

  // The interpreter to pass; it has nothing in it.
  static Tcl_Interp* Interp();
  // The object of a text, which must outlive it.
  static Tcl_Obj* ObjectOf(const std::string& text);

  // Every call but those of Tcl_GetString, in order: the function, then its arguments as text.
  std::vector<std::string> calls;

  // Every text that Tcl_GetString was asked for, in order, behind the word "text". A test may note
  // other looks at words among them. A text is gone with the next call, as if all objects were
  // one; it has at most 255 characters.
  std::vector<std::string> reads;

  // Of the last command created, and of the last result set.
  Tcl_ObjCmdProc* procedure = nullptr;
  std::string result;

  // What the functions answer.
  Tcl_Command createdCommand = nullptr;
  int evalStatus = TCL_OK;
  int provideStatus = TCL_OK;

  // How often the stub library was asked for a table.
  int stubLibraryCalls = 0;
};

#endif  // VORKEL_TESTS_BINDING_FAKESTUBS_H_
