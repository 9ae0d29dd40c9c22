#include "tests/binding/FakeStubs.h"

#include <array>
#include <cstdio>

namespace {

std::string Address(const void* pointer) {
  return pointer == nullptr ? "null" : pointer == FakeStubs::Interp() ? "interp" : "other";
}

void Note(const std::string& call) { FakeStubs::Instance().calls.push_back(call); }

Tcl_Command CreateObjCommand(Tcl_Interp* interp, const char* name, Tcl_ObjCmdProc* procedure,
                             ClientData data, Tcl_CmdDeleteProc* deleteProcedure) {
  Note("create " + Address(interp) + " " + name + " data " + Address(data) + " delete " +
       (deleteProcedure == nullptr ? "null" : "other"));
  FakeStubs::Instance().procedure = procedure;
  return FakeStubs::Instance().createdCommand;
}

int Eval(Tcl_Interp* interp, const char* script) {
  Note("eval " + Address(interp) + " " + script);
  return FakeStubs::Instance().evalStatus;
}

int PkgProvide(Tcl_Interp* interp, const char* name, const char* version) {
  Note("provide " + Address(interp) + " " + name + " " + version);
  return FakeStubs::Instance().provideStatus;
}

char* GetString(Tcl_Obj* object) {
  static std::array<char, 256> text;
  std::snprintf(text.data(), text.size(), "%s", reinterpret_cast<const char*>(object));
  FakeStubs::Instance().reads.push_back(std::string("text ") + text.data());
  return text.data();
}

void SetResult(Tcl_Interp* interp, char* text, Tcl_FreeProc* freeProcedure) {
  Note("result " + Address(interp) + (freeProcedure == TCL_VOLATILE ? " volatile" : " kept"));
  FakeStubs::Instance().result = text;
}

constexpr TclStubs FiveFunctions() {
  TclStubs table{};
  table.tcl_CreateObjCommand = CreateObjCommand;
  table.tcl_Eval = Eval;
  table.tcl_PkgProvide = PkgProvide;
  table.tcl_GetString = GetString;
  table.tcl_SetResult = SetResult;
  return table;
}

constinit const TclStubs fiveFunctions = FiveFunctions();

}  // namespace

// What a Tcl library exports.
extern "C" constinit const TclStubs* tclStubsPtr;
constinit const TclStubs* tclStubsPtr = &fiveFunctions;

// In place of the stub library, which could not make anything of an interpreter like this.
#undef Tcl_InitStubs
extern "C" const char* Tcl_InitStubs(Tcl_Interp*, const char*, int) {
  ++FakeStubs::Instance().stubLibraryCalls;
  return nullptr;
}

FakeStubs& FakeStubs::Instance() {
  static FakeStubs stubs;
  return stubs;
}

Tcl_Interp* FakeStubs::Interp() {
  // Zero: a library that looks for a stubs table in it finds none.
  static std::array<void*, 64> place{};
  return reinterpret_cast<Tcl_Interp*>(place.data());
}

Tcl_Obj* FakeStubs::ObjectOf(const std::string& text) {
  return reinterpret_cast<Tcl_Obj*>(const_cast<char*>(text.c_str()));
}
