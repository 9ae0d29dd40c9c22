#include <gtest/gtest.h>

#include <atomic>
#include <cstddef>
#include <string>
#include <thread>
#include <vector>

#include "host/Util_SharedObjects.h"

namespace {

using Util::SharedResourceMgr;

TEST(SharedResourceMgr, FindsWhatWasInserted) {
  int resource = 0;
  EXPECT_EQ(SharedResourceMgr::find("test: never inserted"), nullptr);
  SharedResourceMgr::insert("test: found", &resource);
  EXPECT_EQ(SharedResourceMgr::find("test: found"), &resource);
  EXPECT_EQ(SharedResourceMgr::find("test: foun"), nullptr);
}

TEST(SharedResourceMgr, KeepsTheFirstOfAName) {
  int first = 0;
  int second = 0;
  SharedResourceMgr::insert("test: twice", &first);
  SharedResourceMgr::insert("test: twice", &second);
  EXPECT_EQ(SharedResourceMgr::find("test: twice"), &first);
}

struct Key {};
struct Value {};
struct OtherValue {};
using Objects = Util::SharedObjects<Key, Value>;

// Entries outlive the tests that make them, so every key is one that was never used.
const Key& NewKey() { return *new Key; }

TEST(SharedObjects, AreOneMapForEachPairOfTypes) {
  const Key& key = NewKey();
  auto& objects = Objects::Instance(&key);
  EXPECT_EQ(&objects, &Objects::Instance(&key));
  const void* const others = &Util::SharedObjects<Key, OtherValue>::Instance(&key);
  EXPECT_NE(static_cast<const void*>(&objects), others);
  const std::string name = std::string(typeid(const Key*).name()) + typeid(Value).name();
  EXPECT_EQ(SharedResourceMgr::find(std::string_view(name)), &objects);
}

TEST(SharedObjects, CountTheUsersOfEachKey) {
  const Key& key = NewKey();
  const Key& other_key = NewKey();
  Value value;
  EXPECT_EQ(Objects::Instance(&key).Find(), nullptr);
  EXPECT_EQ(Objects::Instance(&key).Get(), nullptr);
  EXPECT_EQ(Objects::Instance(&key).Create(&value), &value);
  ASSERT_NE(Objects::Instance(&key).Find(), nullptr);
  EXPECT_EQ(Objects::Instance(&key).Find()->useCount, 1);
  EXPECT_EQ(Objects::Instance(&key).Get(), &value);
  EXPECT_EQ(Objects::Instance(&key).Find()->useCount, 2);
  EXPECT_EQ(Objects::Instance(&other_key).Find(), nullptr);
}

TEST(SharedObjects, RefuseASecondObjectForAKey) {
  const Key& key = NewKey();
  Value first;
  Value second;
  Objects::Instance(&key).Create(&first);
  try {
    Objects::Instance(&key).Create(&second);
    FAIL() << "a second object was taken";
  } catch (const Util::IllegalMethodCalledException& error) {
    EXPECT_EQ(error.Category(), Port::StringBase("DesignEntry"));
    EXPECT_STREQ(error.what(), "Shared Object already exists. Use Get() instead of Create().\n");
  }
  EXPECT_EQ(Objects::Instance(&key).Find()->object, &first);
  EXPECT_EQ(Objects::Instance(&key).Find()->useCount, 1);
}

// Each thread has keys of its own, and meets the others in the map, which they make together.
TEST(SharedObjects, AreForSeveralThreads) {
  struct ThreadsValue {
    int number;
  };
  using ThreadsObjects = Util::SharedObjects<Key, ThreadsValue>;
  constexpr int kKeys = 2000;
  std::vector<int> wrong(3, 0);
  std::vector<std::thread> threads;
  std::atomic<std::size_t> waiting = wrong.size();
  for (std::size_t t = 0; t < wrong.size(); ++t) {
    threads.emplace_back([&waiting, &wrong, t] {
      Key* const keys = new Key[kKeys];  // for good, see above
      std::vector<ThreadsValue> values(kKeys);
      --waiting;
      while (waiting > 0) std::this_thread::yield();
      for (std::size_t i = 0; i < kKeys; ++i) {
        auto& objects = ThreadsObjects::Instance(&keys[i]);
        if (objects.Get() != nullptr) ++wrong[t];
        if (objects.Create(&values[i]) != &values[i]) ++wrong[t];
        if (objects.Get() != &values[i]) ++wrong[t];
      }
      for (std::size_t i = 0; i < kKeys; ++i) {
        const auto* const entry = ThreadsObjects::Instance(&keys[i]).Find();
        if (entry == nullptr || entry->object != &values[i] || entry->useCount != 2) ++wrong[t];
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(wrong, (std::vector<int>{0, 0, 0}));
}

TEST(Exception, IsCaughtAsEveryBase) {
  const auto raise = [] { throw Util::IllegalMethodCalledException("Area", "reason"); };
  EXPECT_THROW(raise(), Port::Exception);
  EXPECT_THROW(raise(), std::exception);
  const Port::Exception error("Area", "reason");
  EXPECT_EQ(error.Category(), Port::StringBase("Area"));
  EXPECT_EQ(error.Message(), Port::StringBase("reason"));
  EXPECT_STREQ(error.what(), "reason");
}

}  // namespace
