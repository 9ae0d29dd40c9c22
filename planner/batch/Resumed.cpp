// Tested by resumed_test.cpp.
#include "planner/batch/Resumed.h"

#include "planner/batch/Lines.h"

namespace planner::batch {

namespace {

// Takes a text apart from its beginning on.
class Rest {
 public:
  explicit Rest(std::string_view text) : text_(text) {}

  bool Take(std::string_view word) {
    if (text_.substr(0, word.size()) != word) return false;
    text_.remove_prefix(word.size());
    return true;
  }
  // What stands before a letter; nothing when there is no such letter.
  std::optional<std::string_view> TakeUntil(char letter) {
    const std::size_t end = text_.find(letter);
    if (end == std::string_view::npos) return std::nullopt;
    const std::string_view taken = text_.substr(0, end);
    text_.remove_prefix(end);
    return taken;
  }

 private:
  std::string_view text_;
};

// A whole number in digits of a base, up to so many of them.
std::optional<std::uint64_t> NumberOf(std::string_view digits, unsigned base, std::size_t most) {
  constexpr std::string_view kDigits = "0123456789abcdef";
  if (digits.empty() || digits.size() > most) return std::nullopt;
  std::uint64_t number = 0;
  for (const char digit : digits) {
    const std::size_t value = kDigits.substr(0, base).find(digit);
    if (value == std::string_view::npos) return std::nullopt;
    number = number * base + value;
  }
  return number;
}

std::optional<Status> StatusOf(std::string_view name) {
  for (const Status status : kStatuses) {
    if (Name(status) == name) return status;
  }
  return std::nullopt;
}

}  // namespace

std::string TextOf(const Head& head) {
  std::string text = "{\"line\":" + std::to_string(head.line) + ",\"digest\":\"" +
                     Digest::Text(head.digest) + "\",\"status\":\"";
  text += Name(head.status);
  text += "\",\"primitive\":";
  if (head.primitive) {
    text += '"';
    text += Name(*head.primitive);
    text += '"';
  } else {
    text += "null";
  }
  return text;
}

std::optional<Head> ReadHead(std::string_view text) {
  constexpr std::size_t kMostDigits = 18;
  constexpr std::size_t kDigestDigits = 16;
  Rest rest(text);
  Head head;
  if (!rest.Take("{\"line\":")) return std::nullopt;
  const auto line = NumberOf(rest.TakeUntil(',').value_or(""), 10, kMostDigits);
  if (!line || !rest.Take(",\"digest\":\"")) return std::nullopt;
  const auto digest = NumberOf(rest.TakeUntil('"').value_or(""), 16, kDigestDigits);
  if (!digest || !rest.Take("\",\"status\":\"")) return std::nullopt;
  const auto status = StatusOf(rest.TakeUntil('"').value_or(""));
  if (!status || !rest.Take("\",\"primitive\":")) return std::nullopt;
  head.line = static_cast<std::int64_t>(*line);
  head.digest = *digest;
  head.status = *status;
  if (rest.Take("null,")) return head;
  for (const Primitive primitive : hardware::kPrimitives) {
    if (!rest.Take('"' + std::string(Name(primitive)) + "\",")) continue;
    head.primitive = primitive;
    return head;
  }
  return std::nullopt;
}

}  // namespace planner::batch
