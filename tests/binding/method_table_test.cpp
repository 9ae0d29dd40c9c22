// The method table, the lookup in it, and the dispatch of a call.
#include "tests/binding/ScriptCalls.h"

#include <gtest/gtest.h>

#include <string>
#include <string_view>

#include "binding/MethodTable.h"
#include "tests/binding/MethodFacts.h"

namespace {

TEST(MethodTable, HasThe40NamesInOrder) {
  ASSERT_EQ(Ip::MethodTable().size(), 40u);
  for (std::size_t i = 0; i < kMethodFacts.size(); ++i) {
    EXPECT_STREQ(Ip::MethodTable()[i].name.CStr(), kMethodFacts[i].name) << "entry " << i + 1;
  }
}

TEST(MethodTable, NamesAreUniqueAndKeepTheirLength) {
  for (std::size_t i = 0; i < 40; ++i) {
    const auto& name = Ip::MethodTable()[i].name;
    EXPECT_EQ(name.Length(), std::string_view(kMethodFacts[i].name).size());
    for (std::size_t j = 0; j < i; ++j) EXPECT_NE(name, Ip::MethodTable()[j].name);
  }
}

TEST(MethodTable, EveryNameFindsItsOwnEntry) {
  for (std::size_t i = 0; i < 40; ++i) {
    EXPECT_EQ(Ip::FindMethod(kMethodFacts[i].name), &Ip::MethodTable()[i]);
  }
}

TEST(MethodTable, NothingButTheWholeNameMatches) {
  for (const MethodFacts& method : kMethodFacts) {
    const std::string name = method.name;
    EXPECT_EQ(Ip::FindMethod(name + " "), nullptr);
    EXPECT_EQ(Ip::FindMethod(" " + name), nullptr);
    EXPECT_EQ(Ip::FindMethod(name + "\n"), nullptr);
    EXPECT_EQ(Ip::FindMethod(name + std::string(1, '\0')), nullptr);
    std::string lower = name;
    for (char& c : lower) c = static_cast<char>(c >= 'A' && c <= 'Z' ? c - 'A' + 'a' : c);
    EXPECT_EQ(Ip::FindMethod(lower), nullptr) << lower;
    // No name is another name less its last letter.
    EXPECT_EQ(Ip::FindMethod(name.substr(0, name.size() - 1)), nullptr) << name;
  }
  for (const char* name : {"", "NULL", "Get", "GetChosen", "getchosenm", "GETCHOSENM",
                           "GetChosenm", "GetKRUChosenM", "KRUCalculateActuals",
                           "GetKruPkToPkJitter", "GetPllPeriodPhaseDutyCycle",
                           "TSYNCalculateActualOutFreq", "PLLCalculateActualOutFreq"}) {
    EXPECT_EQ(Ip::FindMethod(name), nullptr) << name;
  }
}

class Dispatch : public testing::Test {
 protected:
  int Execute(const std::vector<std::string>& texts) {
    const TestWords words(handle_, texts);
    return handle_.Execute(words.Count(), words.Data(), interp_.get());
  }

  BoundInterp interp_;
  Ip::VorkelPtrHandle handle_{interp_.get()};
};

TEST_F(Dispatch, ACallWithoutMethodIsMissingItsCommand) {
  EXPECT_EQ(Execute({}), TCL_ERROR);
  EXPECT_EQ(interp_.Result(), "Error: Missing Tcl command.");
}

TEST_F(Dispatch, FewerWordsThanTheHandleAreMissingTheirCommandToo) {
  const TestWords words(handle_, {"SetVcoMinThreshold", "5"});
  for (const int objc : {1, 0, -1}) {
    interp_.SetResult("before");
    EXPECT_EQ(handle_.Execute(objc, words.Data(), interp_.get()), TCL_ERROR) << objc;
    EXPECT_EQ(interp_.Result(), "Error: Missing Tcl command.") << objc;
  }
}

TEST_F(Dispatch, AnEmptyNameIsReportedAsNull) {
  EXPECT_EQ(Execute({""}), TCL_ERROR);
  EXPECT_EQ(interp_.Result(), "Error: Unknown Tcl command \"NULL\".");
  EXPECT_EQ(Execute({"", "5"}), TCL_ERROR);
  EXPECT_EQ(interp_.Result(), "Error: Unknown Tcl command \"NULL\".");
}

TEST_F(Dispatch, AnUnknownNameIsEchoedAsTyped) {
  for (const char* name : {"getchosenm", "GetChosen", "GetChosenM ", " GetChosenM", "NULL",
                           "%s%n%d", "a \"quoted\" name", "\xc3\xa9\xc3\xa8", "a\nb"}) {
    EXPECT_EQ(Execute({name}), TCL_ERROR) << name;
    EXPECT_EQ(interp_.Result(), std::string("Error: Unknown Tcl command \"") + name + "\".");
  }
}

TEST_F(Dispatch, AnUnknownNameOfAnyLengthIsEchoedWhole) {
  const std::string name(200000, 'x');
  EXPECT_EQ(Execute({name}), TCL_ERROR);
  EXPECT_EQ(interp_.Result(), "Error: Unknown Tcl command \"" + name + "\".");
}

TEST_F(Dispatch, TheMethodStatusComesBackUnchanged) {
  interp_.SetResult("before");
  EXPECT_EQ(Execute({"SetVcoMinThreshold", "5"}), TCL_OK);
  EXPECT_EQ(interp_.Result(), "before");
  EXPECT_EQ(Execute({"SetVcoMinThreshold", "5", "6"}), TCL_ERROR);
  EXPECT_EQ(interp_.Result(), "SetVcoMinThreshold: Invalid number of arguments.");
}

TEST_F(Dispatch, IsReachedThroughTheHandleInterface) {
  Script::Handle& handle = handle_;
  const TestWords words(handle, {"GetChosenM"});
  EXPECT_EQ(handle.Execute(words.Count(), words.Data(), interp_.get()), TCL_ERROR);
  EXPECT_EQ(interp_.Result(),
            "Unable to obtain Implementation object for VorkelPtrHandle::GetChosenM");
}

}  // namespace
