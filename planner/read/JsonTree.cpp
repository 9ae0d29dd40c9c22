// Tested by json_tree_test.cpp.
#include "planner/read/JsonTree.h"

#include <algorithm>
#include <cassert>
#include <cstddef>
#include <utility>

#include "planner/read/Letters.h"

namespace planner::read {

namespace {

// Nothing that a program reads on its own account is nested more deeply.
constexpr int kDeepest = 20;
constexpr std::string_view kEncodingMark = "\xef\xbb\xbf";

bool IsWordLetter(char letter) {
  return IsDigit(letter) || (Lower(letter) >= 'a' && Lower(letter) <= 'z') || letter == '_';
}

void AppendUtf8(char32_t code, std::string* text) {
  const auto add = [text](char32_t byte) { *text += static_cast<char>(byte); };
  if (code < 0x80) return add(code);
  if (code < 0x800) {
    add(0xc0 | code >> 6);
  } else {
    if (code < 0x10000) {
      add(0xe0 | code >> 12);
    } else {
      add(0xf0 | code >> 18);
      add(0x80 | (code >> 12 & 0x3f));
    }
    add(0x80 | (code >> 6 & 0x3f));
  }
  add(0x80 | (code & 0x3f));
}

// Ends the reading of a text; caught below.
struct Fault {
  SyntaxFault fault;
  std::size_t place;
  std::string seen;
};

class Reader {
 public:
  explicit Reader(std::string_view text) : text_(text) {}

  Node ReadAll() {
    SkipBlanks();
    Node node = Value(0);
    SkipBlanks();
    if (place_ < text_.size()) Fail(SyntaxFault::kMoreBehind);
    return node;
  }

  // Line and column of a place. Places are asked for in rising order: those of values and names as
  // they are read, and at the end that of a fault, which stands behind the last one of them.
  Position PositionOf(std::size_t place) {
    assert(place >= counted_);
    while (counted_ < place) {
      const Letter letter = LetterAt(text_, counted_);
      if (letter.code == U'\n') {
        ++position_.line;
        position_.column = 1;
      } else {
        ++position_.column;
      }
      counted_ += letter.size;
    }
    return position_;
  }

 private:
  [[noreturn]] void Fail(SyntaxFault fault) { FailAt(fault, place_, Seen()); }
  [[noreturn]] static void FailAt(SyntaxFault fault, std::size_t place, std::string seen = "") {
    throw Fault{fault, place, std::move(seen)};
  }

  // What stands here, for a message: a word, or a letter; nothing at the end.
  std::string Seen() const {
    const std::string_view rest = text_.substr(place_);
    if (rest.empty()) return "";
    const auto is_of_word = [](char letter) {
      return IsWordLetter(letter) || letter == '.' || letter == '+' || letter == '-';
    };
    const auto size = static_cast<std::size_t>(
        std::find_if_not(rest.begin(), rest.end(), is_of_word) - rest.begin());
    return std::string(rest.substr(0, size > 0 ? size : LetterAt(rest, 0).size));
  }

  char Here() const { return place_ < text_.size() ? text_[place_] : '\0'; }

  void SkipBlanks() {
    while (Here() == ' ' || Here() == '\t' || Here() == '\n' || Here() == '\r') ++place_;
  }

  Node Value(int depth) {
    if (depth > kDeepest) FailAt(SyntaxFault::kTooDeep, place_);
    Node node;
    node.position = PositionOf(place_);
    switch (Here()) {
      case '{':
        node.type = NodeType::kObject;
        Object(&node, depth);
        return node;
      case '[':
        node.type = NodeType::kArray;
        Array(&node, depth);
        return node;
      case '"':
        node.type = NodeType::kString;
        node.text = String();
        return node;
      default:
        if (!Number(&node) && !Word(&node)) Fail(SyntaxFault::kValueExpected);
        return node;
    }
  }

  void Object(Node* node, int depth) {
    ++place_;
    SkipBlanks();
    if (Here() == '}') {
      ++place_;
      return;
    }
    do {
      if (Here() != '"') Fail(SyntaxFault::kNameExpected);
      const std::size_t place = place_;
      Member member{String(), PositionOf(place), {}};
      if (node->Find(member.name)) FailAt(SyntaxFault::kEntryTwice, place, member.name);
      SkipBlanks();
      if (Here() != ':') Fail(SyntaxFault::kColonExpected);
      ++place_;
      SkipBlanks();
      member.value = Value(depth + 1);
      node->members.push_back(std::move(member));
    } while (GoesOn('}', SyntaxFault::kCommaOrBrace));
  }

  void Array(Node* node, int depth) {
    ++place_;
    SkipBlanks();
    if (Here() == ']') {
      ++place_;
      return;
    }
    do {
      node->items.push_back(Value(depth + 1));
    } while (GoesOn(']', SyntaxFault::kCommaOrBracket));
  }

  // Behind an entry: whether another one follows.
  bool GoesOn(char closing, SyntaxFault fault) {
    SkipBlanks();
    if (Here() == closing) {
      ++place_;
      return false;
    }
    if (Here() != ',') Fail(fault);
    ++place_;
    SkipBlanks();
    return true;
  }

  bool Number(Node* node) {
    std::size_t end = place_;
    const auto is_digit = [&] { return end < text_.size() && IsDigit(text_[end]); };
    const auto take = [&](std::string_view letters) {
      const bool is_there =
          end < text_.size() && letters.find(text_[end]) != std::string_view::npos;
      if (is_there) ++end;
      return is_there;
    };
    // Takes digits, one at least, or nothing of what stands before them.
    const auto take_digits = [&](std::size_t back) {
      if (!is_digit()) {
        end = back;
        return;
      }
      while (is_digit()) ++end;
    };
    take("-");
    if (!is_digit()) return false;
    if (!take("0")) take_digits(end);
    std::size_t back = end;
    if (take(".")) take_digits(back);
    back = end;
    if (take("eE")) {
      take("+-");
      take_digits(back);
    }
    node->type = NodeType::kNumber;
    node->text = text_.substr(place_, end - place_);
    place_ = end;
    return true;
  }

  bool Word(Node* node) {
    for (const std::string_view word : {"true", "false", "null"}) {
      if (text_.substr(place_, word.size()) != word) continue;
      const std::size_t end = place_ + word.size();
      if (end < text_.size() && IsWordLetter(text_[end])) return false;
      node->type = word == "null" ? NodeType::kNull : NodeType::kBoolean;
      node->truth = word == "true";
      place_ = end;
      return true;
    }
    return false;
  }

  std::string String() {
    const std::size_t begin = place_;
    std::string text;
    ++place_;
    for (;;) {
      const char letter = Here();
      if (place_ == text_.size() || letter == '\n' || letter == '\r') {
        FailAt(SyntaxFault::kTextNotClosed, begin);
      }
      if (letter == '"') {
        ++place_;
        return text;
      }
      if (static_cast<unsigned char>(letter) < 0x20) FailAt(SyntaxFault::kControlLetter, place_);
      if (letter == '\\') {
        Escape(&text);
        continue;
      }
      const std::size_t size = LetterAt(text_, place_).size;
      text += text_.substr(place_, size);
      place_ += size;
    }
  }

  void Escape(std::string* text) {
    constexpr std::string_view kLetters = "\"\\/bfnrt";
    constexpr std::string_view kMeant = "\"\\/\b\f\n\r\t";
    const std::size_t begin = place_;
    ++place_;
    const std::size_t simple = Here() == '\0' ? std::string_view::npos : kLetters.find(Here());
    if (simple != std::string_view::npos) {
      *text += kMeant[simple];
      ++place_;
      return;
    }
    std::optional<char32_t> code = CodeUnit();
    if (!code) FailAt(SyntaxFault::kNoEscape, begin);
    // Letters beyond 16 bits are two escapes; one of them alone is no letter.
    const bool is_first = *code >= 0xd800 && *code < 0xdc00;
    if (is_first && Here() == '\\') {
      ++place_;
      const std::optional<char32_t> second = CodeUnit();
      if (!second || *second < 0xdc00 || *second > 0xdfff) FailAt(SyntaxFault::kNoEscape, begin);
      code = 0x10000 + ((*code - 0xd800) << 10) + (*second - 0xdc00);
    }
    if (*code >= 0xd800 && *code < 0xe000) FailAt(SyntaxFault::kNoEscape, begin);
    AppendUtf8(*code, text);
  }

  // The four digits behind a u, or nothing.
  std::optional<char32_t> CodeUnit() {
    constexpr std::size_t kSize = 5;
    const std::string_view unit = text_.substr(place_, kSize);
    if (unit.size() < kSize || unit.front() != 'u') return std::nullopt;
    char32_t code = 0;
    for (const char digit : unit.substr(1)) {
      const char lower = Lower(digit);
      if (!IsDigit(lower) && (lower < 'a' || lower > 'f')) return std::nullopt;
      code = code << 4 | static_cast<char32_t>(IsDigit(lower) ? lower - '0' : lower - 'a' + 10);
    }
    place_ += kSize;
    return code;
  }

  std::string_view text_;
  std::size_t place_ = 0;
  // How far PositionOf has counted.
  std::size_t counted_ = 0;
  Position position_;
};

// The first byte that is no UTF-8, or the end.
std::size_t FirstInvalid(std::string_view text) {
  std::size_t place = 0;
  while (place < text.size()) {
    const Letter letter = LetterAt(text, place);
    if (!letter.is_valid) break;
    place += letter.size;
  }
  return place;
}

}  // namespace

std::optional<Node> ReadJsonTree(std::string_view text, std::string_view file, Mistakes* mistakes) {
  if (text.substr(0, kEncodingMark.size()) == kEncodingMark) {
    text.remove_prefix(kEncodingMark.size());
  }
  Reader reader(text);
  try {
    const std::size_t invalid = FirstInvalid(text);
    if (invalid < text.size()) throw Fault{SyntaxFault::kNoUnicode, invalid, ""};
    return reader.ReadAll();
  } catch (const Fault& fault) {
    const Position position = reader.PositionOf(fault.place);
    Mistake mistake;
    mistake.kind = MistakeKind::kSyntax;
    mistake.place.file = file;
    mistake.place.line = position.line;
    mistake.place.column = position.column;
    mistake.fault = fault.fault;
    mistake.text = fault.seen;
    mistakes->push_back(std::move(mistake));
    return std::nullopt;
  }
}

}  // namespace planner::read
