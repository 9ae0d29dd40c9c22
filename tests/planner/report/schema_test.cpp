// The check must see what is wrong, or it would prove nothing.
#include "schema.h"

#include <gtest/gtest.h>

namespace schema {
namespace {

using nlohmann::ordered_json;

std::string Fault(const char* value, const char* rules) {
  return FaultOf(ordered_json::parse(value), ordered_json::parse(rules));
}

TEST(Schema, Types) {
  EXPECT_EQ(Fault("1", R"({"type": "number"})"), "");
  EXPECT_EQ(Fault("1.5", R"({"type": "integer"})"), " is a number");
  EXPECT_EQ(Fault("\"1\"", R"({"type": ["number", "null"]})"), " is a string");
  EXPECT_EQ(Fault("null", R"({"type": ["number", "null"]})"), "");
}

TEST(Schema, Objects) {
  const char* const rules =
      R"({"type": "object", "required": ["a"], "additionalProperties": false,
          "properties": {"a": {"$ref": "#/$defs/flag"}, "b": {"minimum": 1}},
          "$defs": {"flag": {"type": "boolean"}}})";
  EXPECT_EQ(Fault(R"({"a": true, "b": 1})", rules), "");
  EXPECT_EQ(Fault(R"({"b": 1})", rules), " lacks a");
  EXPECT_EQ(Fault(R"({"a": 1})", rules), ".a is a number");
  EXPECT_EQ(Fault(R"({"a": true, "b": 0})", rules), ".b is too small");
  EXPECT_EQ(Fault(R"({"a": true, "c": 1})", rules), " has c");
}

TEST(Schema, Arrays) {
  const char* const rules = R"({"minItems": 1, "maxItems": 2, "items": {"exclusiveMinimum": 0}})";
  EXPECT_EQ(Fault("[1, 2]", rules), "");
  EXPECT_EQ(Fault("[]", rules), " is short");
  EXPECT_EQ(Fault("[1, 2, 3]", rules), " is long");
  EXPECT_EQ(Fault("[1, 0]", rules), "[1] is too small");
}

TEST(Schema, Choices) {
  const char* const rules = R"({"oneOf": [{"const": 1}, {"enum": ["a", "b"]}]})";
  EXPECT_EQ(Fault("1", rules), "");
  EXPECT_EQ(Fault("\"b\"", rules), "");
  EXPECT_EQ(Fault("2", rules), " is 2 or  is 2");
  EXPECT_EQ(Fault("1", R"({"oneOf": [{"type": "number"}, {"const": 1}]})"), " is of several kinds");
  const char* const conditions = R"({"allOf": [{"if": {"type": "number"}, "then": {"const": 1}}]})";
  EXPECT_EQ(Fault("1", conditions), "");
  EXPECT_EQ(Fault("2", conditions), " is 2");
  EXPECT_EQ(Fault("\"2\"", conditions), "");
}

TEST(Schema, UnknownWordsAreNotPassedOver) {
  EXPECT_THROW(Fault("1", R"({"pattern": "x"})"), std::runtime_error);
}

}  // namespace
}  // namespace schema
