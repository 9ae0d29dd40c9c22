// The lines of a text that comes in pieces.
//
// A line ends in a newline, or with the text. However long it is, no more than a certain number of
// its bytes are kept; its digest is that of all of them.
//
// Tested by lines_test.cpp.
#ifndef VORKEL_PLANNER_BATCH_LINES_H_
#define VORKEL_PLANNER_BATCH_LINES_H_

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace planner::batch {

// FNV-1a in 64 bits: http://www.isthe.com/chongo/tech/comp/fnv. It tells a line from one that has
// been changed by mistake, not by intent.
class Digest {
 public:
  Digest() = default;
  // Of what follows a text.
  explicit Digest(std::string_view text) { Add(text); }

  void Add(std::string_view text) {
    for (const char letter : text) Add(letter);
  }
  void Add(char letter) { value_ = (value_ ^ static_cast<unsigned char>(letter)) * 0x100000001b3; }
  std::uint64_t Value() const { return value_; }
  // 16 digits, 0 to 9 and a to f.
  static std::string Text(std::uint64_t value);

 private:
  std::uint64_t value_ = 0xcbf29ce484222325;
};

struct Line {
  std::int64_t number = 0;   // from 1
  std::uint64_t digest = 0;  // of all its bytes but the newline, behind those of `Lines`
  std::string text;          // without the newline; only its beginning when it is too long
  bool is_too_long = false;
  std::size_t size = 0;  // in bytes, without the newline
  bool IsBlank() const;  // nothing but blanks
};

class Lines {
 public:
  // Of each line so many bytes are kept at most. The digests begin with `digest`.
  explicit Lines(std::size_t most, const Digest& digest = {}) : most_(most), start_(digest) {
    Start();
  }

  // Takes a piece of the text, and calls `take` with each line that ends in it.
  template <typename Take>
  void Add(std::string_view piece, const Take& take) {
    while (!piece.empty()) {
      const std::size_t end = piece.find('\n');
      AddToLine(piece.substr(0, end));
      if (end == std::string_view::npos) return;
      piece.remove_prefix(end + 1);
      take(Ended());
    }
  }
  // Whether something stands behind the last newline.
  bool HasBegun() const { return has_begun_; }
  // At the end of the text: what stands behind the last newline, if there is anything.
  template <typename Take>
  void End(const Take& take) {
    if (has_begun_) take(Ended());
  }

 private:
  void Start();
  void AddToLine(std::string_view piece);
  Line Ended();

  std::size_t most_;
  Digest start_;
  Digest digest_;
  Line line_;
  bool has_begun_ = false;
  std::int64_t count_ = 0;
};

// Every `of`-th line, beginning with line `index`, which is from 1 to `of`.
struct Shard {
  std::int64_t index = 1;
  std::int64_t of = 1;
  bool Has(const Line& line) const { return (line.number - index) % of == 0; }
};

}  // namespace planner::batch

#endif  // VORKEL_PLANNER_BATCH_LINES_H_
