// The host services that the binding keeps up: their order, and that the table of methods
// comes after them.
//
// This program has initialiser objects of its own in place of the host's. They take notes.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "binding/MethodTable.h"
#include "host/Initialisers.h"

namespace {

// Notes are taken before main, and before any object of this file is constructed: constants
// until then.
constinit std::array<const char*, 16> constructed{};
constinit std::size_t constructions = 0;
constinit bool tableWasThere = false;
constinit bool announceDestruction = false;

template <typename Service>
const char* ServiceName();
template <>
const char* ServiceName<Port::FileInit>() { return "FileInit"; }
template <>
const char* ServiceName<Port::PathListInit>() { return "PathListInit"; }
template <>
const char* ServiceName<CitP::InstanceTableInit>() { return "InstanceTableInit"; }
template <>
const char* ServiceName<CitP::FactoryInit>() { return "FactoryInit"; }
template <>
const char* ServiceName<Port_MsgManInit>() { return "MsgManInit"; }

}  // namespace

template <typename Service>
Host::Initialiser<Service>::Initialiser() {
  // A table that is not built yet is zero memory.
  if (Ip::MethodTable()[0].name.Length() != 0) tableWasThere = true;
  if (constructions < constructed.size()) constructed[constructions++] = ServiceName<Service>();
}

template <typename Service>
Host::Initialiser<Service>::~Initialiser() {
  if (announceDestruction) std::fprintf(stderr, "%s down\n", ServiceName<Service>());
}

template <typename Service>
int Host::Initialiser<Service>::UserCount() {
  return 0;
}

template class Host::Initialiser<Port::FileInit>;
template class Host::Initialiser<Port::PathListInit>;
template class Host::Initialiser<CitP::InstanceTableInit>;
template class Host::Initialiser<CitP::FactoryInit>;
template class Host::Initialiser<Port_MsgManInit>;

namespace {

TEST(Initialisers, AreConstructedOnceEachInOrderBeforeTheTable) {
  EXPECT_THAT(std::vector<std::string>(constructed.begin(), constructed.begin() + constructions),
              testing::ElementsAre("FileInit", "PathListInit", "InstanceTableInit",
                                   "FactoryInit", "MsgManInit"));
  EXPECT_FALSE(tableWasThere);
  EXPECT_STREQ(Ip::MethodTable()[0].name.CStr(), "GetSpdKeyValue");
}

TEST(InitialisersDeathTest, AreDestroyedAtExitTheOtherWayRound) {
  EXPECT_EXIT(
      {
        announceDestruction = true;
        std::exit(0);
      },
      testing::ExitedWithCode(0),
      testing::EndsWith("MsgManInit down\nFactoryInit down\nInstanceTableInit down\n"
                        "PathListInit down\nFileInit down\n"));
}

}  // namespace
