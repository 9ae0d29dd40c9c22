#include "host/Initialisers.h"

#include <gtest/gtest.h>

namespace {

template <typename Service>
class InitialiserTest : public testing::Test {};

using Services = testing::Types<Port::FileInit, Port::PathListInit, CitP::InstanceTableInit,
                                CitP::FactoryInit, Port_MsgManInit>;
TYPED_TEST_SUITE(InitialiserTest, Services);

TYPED_TEST(InitialiserTest, CountsItsUsers) {
  const int before = TypeParam::UserCount();
  {
    const TypeParam first;
    EXPECT_EQ(TypeParam::UserCount(), before + 1);
    const TypeParam second;
    EXPECT_EQ(TypeParam::UserCount(), before + 2);
  }
  EXPECT_EQ(TypeParam::UserCount(), before);
}

TEST(Initialisers, CountEachServiceApart) {
  const int before = Port::PathListInit::UserCount();
  const Port::FileInit file;
  EXPECT_EQ(Port::PathListInit::UserCount(), before);
}

}  // namespace
