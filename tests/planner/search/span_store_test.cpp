// Tests of the store of spans.
#include "planner/search/SpanStore.h"

#include <gtest/gtest.h>

namespace planner::search {
namespace {

// Asks for the spans of a case, of which there are so many; counts how often they are made.
struct Asker {
  SpanCase one{};
  std::size_t many = 1;
  int made = 0;
  SpanStore::Kept Ask(SpanStore* store, bool wants_many = true) {
    return store->Of(one, wants_many, [this] {
      ++made;
      return Spans(many, Span{1.0, 2.0});
    });
  }
};

TEST(SpanStore, KeepsWhatIsAskedTwice) {
  SpanStore store;
  Asker asker;
  EXPECT_EQ(asker.Ask(&store, false), nullptr);
  EXPECT_EQ(asker.made, 0);
  const SpanStore::Kept kept = asker.Ask(&store, false);
  ASSERT_NE(kept, nullptr);
  EXPECT_EQ(kept->size(), 1u);
  EXPECT_EQ(asker.Ask(&store, false), kept);
  EXPECT_EQ(asker.made, 1);
}

TEST(SpanStore, MakesManyAtOnce) {
  SpanStore store;
  Asker asker;
  EXPECT_NE(asker.Ask(&store), nullptr);
  EXPECT_EQ(asker.made, 1);
}

// At most half a million of them are kept.
TEST(SpanStore, ForgetsTheOthersWhereThereAreTooMany) {
  SpanStore store;
  Asker first;
  first.many = 300'000;
  Asker second;
  second.one.phase = true;
  second.many = 200'000;
  Asker third;
  third.one.duty = true;
  const SpanStore::Kept kept = first.Ask(&store);
  second.Ask(&store);
  EXPECT_EQ(first.Ask(&store), kept);
  third.Ask(&store);
  EXPECT_EQ(kept->size(), 300'000u);  // whoever has them still does

  third.Ask(&store);
  EXPECT_EQ(third.made, 1);
  first.Ask(&store);
  second.Ask(&store);
  EXPECT_EQ(first.made, 2);
  EXPECT_EQ(second.made, 2);
}

}  // namespace
}  // namespace planner::search
