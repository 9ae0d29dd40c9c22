// The binding as a user of the host's services.
#include <gtest/gtest.h>

#include "binding/MethodTable.h"
#include "host/Initialisers.h"

namespace {

// One user more while an object of the service lives, on top of the binding's own.
template <typename Service>
void ExpectServiceIsUp() {
  const int users = Service::UserCount();
  EXPECT_GE(users, 1);
  {
    const Service another;
    EXPECT_EQ(Service::UserCount(), users + 1);
  }
  EXPECT_EQ(Service::UserCount(), users);
}

TEST(ServiceUsers, TheBindingIsOneOfEachService) {
  ASSERT_NE(Ip::FindMethod("SetDevice"), nullptr);
  ExpectServiceIsUp<Port::FileInit>();
  ExpectServiceIsUp<Port::PathListInit>();
  ExpectServiceIsUp<CitP::InstanceTableInit>();
  ExpectServiceIsUp<CitP::FactoryInit>();
  ExpectServiceIsUp<Port_MsgManInit>();
}

}  // namespace
