// A set of slot numbers of a fixed table, walked in rising order.
//
// The solver's passes visit the occupied slots of a large and mostly empty table thousands of
// times; a bit a slot lets a pass jump from one to the next.
#ifndef VORKEL_ENGINE_PLL_SLOTSET_H_
#define VORKEL_ENGINE_PLL_SLOTSET_H_

#include <array>
#include <bit>
#include <cstddef>
#include <cstdint>

namespace Ip::Pll {

template <int kSlots>
class SlotSet {
 public:
  void Insert(int slot) { Word(slot) |= Bit(slot); }
  void Erase(int slot) { Word(slot) &= ~Bit(slot); }
  void Clear() { words_.fill(0); }
  void Remove(const SlotSet& others) {
    for (std::size_t word = 0; word < kWords; ++word) words_[word] &= ~others.words_[word];
  }

  // The same with the slots `first` to `last`, of which there are none when `first` is above
  // `last`. `visit` gets those that were in the set.
  void InsertRange(int first, int last) {
    VisitWords(first, last, [&](std::size_t word, std::uint64_t bits) { words_[word] |= bits; });
  }
  template <typename Visit>
  void EraseRange(int first, int last, Visit visit) {
    VisitWords(first, last, [&](std::size_t word, std::uint64_t bits) {
      for (bits &= words_[word]; bits != 0; bits &= bits - 1) {
        visit(static_cast<int>(word * 64) + std::countr_zero(bits));
      }
    });
    EraseRange(first, last);
  }
  void EraseRange(int first, int last) {
    VisitWords(first, last, [&](std::size_t word, std::uint64_t bits) { words_[word] &= ~bits; });
  }

  bool Contains(int slot) const {
    return (words_[static_cast<std::size_t>(slot) / 64] & Bit(slot)) != 0;
  }

  bool IsEmpty() const {
    for (const std::uint64_t word : words_) {
      if (word != 0) return false;
    }
    return true;
  }

  int Count() const {
    int count = 0;
    for (const std::uint64_t word : words_) count += std::popcount(word);
    return count;
  }

  // The lowest slot of the set that is not below `slot`, or kSlots.
  int NextFrom(int slot) const {
    if (slot >= kSlots) return kSlots;
    std::size_t word = static_cast<std::size_t>(slot) / 64;
    std::uint64_t bits = words_[word] & (~std::uint64_t{0} << (slot % 64));
    while (bits == 0) {
      if (++word == kWords) return kSlots;
      bits = words_[word];
    }
    return static_cast<int>(word * 64) + std::countr_zero(bits);
  }

  // Range-for over the slot numbers. A slot may be erased while the loop stands on it.
  class Iterator {
   public:
    Iterator(const SlotSet* set, int slot) : set_(set), slot_(slot) {}
    int operator*() const { return slot_; }
    Iterator& operator++() {
      slot_ = set_->NextFrom(slot_ + 1);
      return *this;
    }
    bool operator!=(const Iterator& other) const { return slot_ != other.slot_; }

   private:
    const SlotSet* set_;
    int slot_;
  };
  Iterator begin() const { return {this, NextFrom(0)}; }
  Iterator end() const { return {this, kSlots}; }

 private:
  static constexpr std::size_t kWords = (kSlots + 63) / 64;

  static std::uint64_t Bit(int slot) { return std::uint64_t{1} << (slot % 64); }
  // The words in which slots of the range have bits, and these bits.
  template <typename Visit>
  static void VisitWords(int first, int last, Visit visit) {
    if (first > last) return;
    const auto lastWord = static_cast<std::size_t>(last) / 64;
    std::uint64_t bits = ~std::uint64_t{0} << (first % 64);
    for (auto word = static_cast<std::size_t>(first) / 64; word < lastWord; ++word) {
      visit(word, bits);
      bits = ~std::uint64_t{0};
    }
    visit(lastWord, bits & (~std::uint64_t{0} >> (63 - last % 64)));
  }

  std::uint64_t& Word(int slot) { return words_[static_cast<std::size_t>(slot) / 64]; }

  std::array<std::uint64_t, kWords> words_{};
};

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_SLOTSET_H_
