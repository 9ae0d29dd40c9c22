// The handle class: what it holds, what it makes and what it leaves alone.
#include "tests/binding/ScriptCalls.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <cstring>
#include <memory>
#include <typeinfo>

#include "binding/VorkelPtrHandle.h"

namespace {

using TypedHandle = Script::PtrHandle<Ip::VorkelImp>;

// Tells when it is destroyed.
class WatchedImp : public Ip::VorkelImp {
 public:
  WatchedImp(Tcl_Interp* owner, bool* destroyed) : VorkelImp(owner), destroyed_(destroyed) {}
  ~WatchedImp() override { *destroyed_ = true; }

 private:
  bool* destroyed_;
};

void* ValueOf(const Script::PtrHandleBase& handle) {
  void* value = nullptr;
  EXPECT_EQ(handle.GetValue(&value), TCL_OK);
  return value;
}

void ExpectNoValue(const Script::PtrHandleBase& handle) {
  int mark = 0;
  void* value = &mark;
  EXPECT_NE(handle.GetValue(&value), TCL_OK);
  EXPECT_EQ(value, &mark);
}

TEST(HandleClass, HoldsTheObjectByPointer) {
  BoundInterp interp;
  Ip::VorkelImp imp(interp.get());
  const Ip::VorkelPtrHandle handle(&imp, interp.get());
  EXPECT_EQ(ValueOf(handle), &imp);
  EXPECT_EQ(handle.GetTclInterp(), interp.get());
}

TEST(HandleClass, FromAnInterpreterAloneHasNoValue) {
  BoundInterp interp;
  const Ip::VorkelPtrHandle handle(interp.get());
  ExpectNoValue(handle);
  EXPECT_EQ(handle.GetTclInterp(), interp.get());
}

TEST(HandleClass, AroundANullObjectHasNoValue) {
  BoundInterp interp;
  const Ip::VorkelPtrHandle handle(nullptr, interp.get());
  ExpectNoValue(handle);
}

TEST(HandleClass, HasNoStateOfItsOwn) {
  EXPECT_EQ(sizeof(Ip::VorkelPtrHandle), sizeof(Script::PtrHandleBase));
  EXPECT_EQ(sizeof(TypedHandle), sizeof(Script::PtrHandleBase));
}

// CreateHandle on a handle with a value: the new one is of the same class and has none.
template <typename Handle>
void ExpectCreatesEmptyHandlesOfItsClass() {
  BoundInterp interp;
  BoundInterp other;
  Ip::VorkelImp imp(interp.get());
  const Handle handle(&imp, interp.get());
  const std::unique_ptr<Script::Handle> first(handle.CreateHandle(other.get()));
  const std::unique_ptr<Script::Handle> second(handle.CreateHandle(other.get()));
  ASSERT_NE(first, nullptr);
  EXPECT_NE(first, second);
  EXPECT_TRUE(typeid(*first.get()) == typeid(Handle));
  const auto* made = dynamic_cast<const Handle*>(first.get());
  ASSERT_NE(made, nullptr);
  ExpectNoValue(*made);
  EXPECT_EQ(made->GetTclInterp(), other.get());
}

TEST(HandleClass, CreatesEmptyHandles) {
  ExpectCreatesEmptyHandlesOfItsClass<Ip::VorkelPtrHandle>();
}

TEST(TypedHandleClass, CreatesEmptyHandles) { ExpectCreatesEmptyHandlesOfItsClass<TypedHandle>(); }

// The prototype lives until the process ends, and so must the interpreter of the handle that
// had it made.
Tcl_Interp* LastingInterp() {
  static Tcl_Interp* const interp = Tcl_CreateInterp();
  return interp;
}

TEST(HandleClass, HasOnePrototypePerClass) {
  Ip::VorkelImp imp(LastingInterp());
  const Ip::VorkelPtrHandle first(&imp, LastingInterp());
  Script::PtrHandleBase* const prototype = first.GetPtrHandleBase();
  ASSERT_NE(prototype, nullptr);
  EXPECT_TRUE(typeid(*prototype) == typeid(Ip::VorkelPtrHandle));
  EXPECT_NE(prototype, &first);
  ExpectNoValue(*prototype);
  EXPECT_EQ(prototype->GetTclInterp(), LastingInterp());

  EXPECT_EQ(first.GetPtrHandleBase(), prototype);
  BoundInterp interp;
  const Ip::VorkelPtrHandle second(interp.get());
  EXPECT_EQ(second.GetPtrHandleBase(), prototype);
  EXPECT_EQ(prototype->GetPtrHandleBase(), prototype);
  EXPECT_EQ(prototype->GetTclInterp(), LastingInterp());
}

TEST(TypedHandleClass, HasAPrototypeOfItsOwn) {
  const TypedHandle first(LastingInterp());
  const Ip::VorkelPtrHandle derived(LastingInterp());
  Script::PtrHandleBase* const prototype = first.GetPtrHandleBase();
  ASSERT_NE(prototype, nullptr);
  EXPECT_TRUE(typeid(*prototype) == typeid(TypedHandle));
  ExpectNoValue(*prototype);
  EXPECT_EQ(TypedHandle(LastingInterp()).GetPtrHandleBase(), prototype);
  EXPECT_NE(derived.GetPtrHandleBase(), prototype);
}

TEST(HandleClass, LeavesItsObjectAliveWhenItIsDeleted) {
  BoundInterp interp;
  bool destroyed = false;
  WatchedImp imp(interp.get(), &destroyed);
  delete static_cast<Script::Handle*>(new Ip::VorkelPtrHandle(&imp, interp.get()));
  EXPECT_FALSE(destroyed);
  delete static_cast<Script::Handle*>(new TypedHandle(&imp, interp.get()));
  EXPECT_FALSE(destroyed);
}

TEST(HandleClass, LeavesItsObjectAliveWhenTheScriptDropsIt) {
  BoundInterp interp;
  bool destroyed = false;
  WatchedImp imp(interp.get(), &destroyed);
  auto* handle = new Ip::VorkelPtrHandle(&imp, interp.get());
  ASSERT_EQ(handle->SetResult(interp.get()), TCL_OK);
  const std::string name = interp.Result();
  ASSERT_EQ(interp.Eval("info commands " + name), TCL_OK);
  ASSERT_EQ(interp.Result(), name);
  ASSERT_EQ(interp.Eval("rename " + name + " {}"), TCL_OK);
  ASSERT_EQ(interp.Eval("info commands " + name), TCL_OK);
  EXPECT_EQ(interp.Result(), "");
  EXPECT_FALSE(destroyed);
}

TEST(HandleClass, LeavesItsObjectAliveWhenTheInterpreterEnds) {
  BoundInterp interp;
  bool destroyed = false;
  WatchedImp imp(interp.get(), &destroyed);
  auto* handle = new Ip::VorkelPtrHandle(&imp, interp.get());
  ASSERT_EQ(handle->SetResult(interp.get()), TCL_OK);
  interp.End();
  EXPECT_FALSE(destroyed);
}

TEST(HandleClass, IsCalledByScriptsUnderItsName) {
  BoundInterp interp;
  Ip::VorkelImp imp(interp.get());
  auto* handle = new Ip::VorkelPtrHandle(&imp, interp.get());
  ASSERT_EQ(handle->SetVariable(interp.get(), "h"), TCL_OK);
  EXPECT_EQ(interp.Eval("$h GetChosenVCO"), TCL_OK);
  EXPECT_EQ(interp.Result(), "0.000");
  EXPECT_EQ(interp.Eval("$h SetDevice some-part"), TCL_OK);
  EXPECT_EQ(interp.Result(), "");
  EXPECT_STREQ(imp.partName.CStr(), "some-part");
  EXPECT_EQ(interp.Eval("$h SetDevice {}"), TCL_OK);
  EXPECT_STREQ(imp.partName.CStr(), "some-part");
}

TEST(HandleClass, SetsLowBandwidthByExactlyTrue) {
  BoundInterp interp;
  Ip::VorkelImp imp(interp.get());
  auto* handle = new Ip::VorkelPtrHandle(&imp, interp.get());
  ASSERT_EQ(handle->SetVariable(interp.get(), "h"), TCL_OK);
  for (const char* word : {"1", "yes", "on", "TRUE", "True", "{ true}", "{true }", "t", "{}",
                           "truer", "false"}) {
    imp.lowBandwidth = true;
    EXPECT_EQ(interp.Eval(std::string("$h SetLowBandwidth ") + word), TCL_OK);
    EXPECT_EQ(interp.Result(), "");
    EXPECT_FALSE(imp.lowBandwidth) << word;
  }
  EXPECT_EQ(interp.Eval("$h SetLowBandwidth true"), TCL_OK);
  EXPECT_EQ(interp.Result(), "");
  EXPECT_TRUE(imp.lowBandwidth);
}

// The place of a virtual operation in the class's table of them, from 0. A pointer to a
// virtual member holds the offset of its entry, plus 1.
template <typename Member>
std::size_t Slot(Member member) {
  std::ptrdiff_t offset = 0;
  std::memcpy(&offset, &member, sizeof offset);
  return static_cast<std::size_t>(offset - 1) / sizeof(void*);
}

TEST(HandleClass, KeepsTheOrderOfTheVirtualOperations) {
  using Handle = Ip::VorkelPtrHandle;
  EXPECT_EQ(Slot(&Handle::Attached), 0u);
  EXPECT_EQ(Slot(&Handle::Detached), 1u);
  // The destructor takes two entries, with and without freeing the memory.
  EXPECT_EQ(Slot(&Handle::Execute), 4u);
  EXPECT_EQ(Slot(&Handle::GetTclObj), 5u);
  EXPECT_EQ(Slot(&Handle::GetString), 6u);
  EXPECT_EQ(Slot(static_cast<int (Handle::*)(Tcl_Interp*)>(&Handle::SetResult)), 7u);
  EXPECT_EQ(Slot(&Handle::SetVariable), 8u);
  EXPECT_EQ(Slot(&Handle::CreateHandle), 9u);
  EXPECT_EQ(Slot(&Handle::GetPtrHandleBase), 10u);
}

}  // namespace
