// The entry point of the library of script handles.
#include <gtest/gtest.h>

#include "tests/host/script_fixture.h"

namespace {

TEST(Entry, ProvidesThePackageInEveryInterpreter) {
  const Interpreter one;
  const Interpreter two;
  EXPECT_EQ(one.Eval("info commands ::Vorkel::*"), "");
  for (const Interpreter* tcl : {&one, &two}) {
    EXPECT_EQ(Ptrhandleqrm_Init(tcl->get()), TCL_OK);
    EXPECT_EQ(tcl->Eval("package present PtrHandleQrm"), "1.0");
    EXPECT_EQ(tcl->Eval("info commands ::Vorkel::*"), "::Vorkel::Devices");
  }
}

TEST(Entry, CanRunTwiceInOneInterpreter) {
  const Interpreter tcl;
  EXPECT_EQ(Ptrhandleqrm_Init(tcl.get()), TCL_OK);
  EXPECT_EQ(Ptrhandleqrm_Init(tcl.get()), TCL_OK);
  EXPECT_EQ(tcl.Eval("package present PtrHandleQrm"), "1.0");
  EXPECT_EQ(tcl.Eval("llength [::Vorkel::Devices keywords]"), "31");
}

TEST(Entry, NeedsAnInterpreter) { EXPECT_EQ(Ptrhandleqrm_Init(nullptr), TCL_ERROR); }

// The name of the entry point is the one that `load` makes of the file name, and the bare file
// name means the library that is in the process already.
TEST(Entry, IsFoundByLoad) {
  const std::string library = "libPtrHandleQrm.dll";
  const Interpreter by_path;
  EXPECT_EQ(by_path.Eval("load " VORKEL_PACKAGE_DIR "/" + library), "");
  EXPECT_EQ(by_path.Eval("package present PtrHandleQrm"), "1.0");
  const Interpreter by_name;
  EXPECT_EQ(by_name.Eval("load " + library), "");
  EXPECT_EQ(by_name.Eval("package present PtrHandleQrm"), "1.0");
}

}  // namespace
