// The package in a process that exports no stubs table, or a null one: it takes the table of
// the interpreter, and fails where that gives none.
#include "tests/binding/ScriptCalls.h"

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <string>

// Defined in binding/PackageEntry.cpp.
extern "C" int Ip_vorkel_Init(Tcl_Interp* interp);
extern "C" int InitVorkel(ClientData data, Tcl_Interp* interp, int objc, Tcl_Obj* const* objv);

// Implementation objects live until the process ends; the leak checker need not tell.
extern "C" const char* __asan_default_options() { return "detect_leaks=0"; }

namespace {

// The table once found serves the process, so the ways to it stand in one test: first none,
// then one.
TEST(StubLibrary, GivesTheTableWhereTheProcessExportsNone) {
  ASSERT_EQ(dlsym(RTLD_DEFAULT, "tclStubsPtr"), nullptr);

  // An interpreter of a Tcl that is too old.
  TestInterp old;
  ASSERT_EQ(old.Eval("package forget Tcl; package provide Tcl 8.3"), TCL_OK);
  EXPECT_EQ(Ip_vorkel_Init(old.get()), TCL_ERROR);
  EXPECT_EQ(old.Result(), "version conflict for package \"Tcl\": have 8.3, need 8.4");
  EXPECT_EQ(old.Eval("info commands ::Ip::Vorkel::Init"), TCL_OK);
  EXPECT_EQ(old.Result(), "");
  EXPECT_EQ(old.Eval("package provide Ip_vorkel"), TCL_OK);
  EXPECT_EQ(old.Result(), "");

  old.SetResult("before");
  EXPECT_EQ(InitVorkel(nullptr, old.get(), 0, nullptr), TCL_ERROR);
  EXPECT_EQ(old.Result(), "version conflict for package \"Tcl\": have 8.3, need 8.4");

  // Another library exports the pointer, but it points to nothing.
  ASSERT_NE(dlopen(VORKEL_NULL_TABLE_LIBRARY, RTLD_NOW | RTLD_GLOBAL), nullptr) << dlerror();
  void* const symbol = dlsym(RTLD_DEFAULT, "tclStubsPtr");
  ASSERT_NE(symbol, nullptr);
  ASSERT_EQ(*static_cast<void* const*>(symbol), nullptr);
  EXPECT_EQ(Ip_vorkel_Init(old.get()), TCL_ERROR);
  EXPECT_EQ(old.Result(), "version conflict for package \"Tcl\": have 8.3, need 8.4");

  TestInterp interp;
  ASSERT_EQ(Ip_vorkel_Init(interp.get()), TCL_OK) << interp.Result();
  EXPECT_EQ(interp.Eval("package present Ip_vorkel"), TCL_OK);
  EXPECT_EQ(interp.Result(), "1.1");
  EXPECT_EQ(interp.Eval("[Ip::Vorkel::Init a b] GetChosenVCO"), TCL_OK);
  EXPECT_EQ(interp.Result(), "0.000");

  // The host's library is in this process under the name that the package loads.
  EXPECT_EQ(interp.Eval("lsearch -glob -inline [info loaded {}] *libPtrHandleQrm.dll*"), TCL_OK);
  EXPECT_NE(interp.Result(), "");
}

}  // namespace
