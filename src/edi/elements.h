// Where the elements of a segment stand, by counting separators; the tag is element 0. One index serves every syntax:
// X12 counts "*", EANCOM "+" and ":", flat files "|".
#pragma once

#include <cstdint>
#include <string_view>
#include <vector>

namespace partnerkit {

class Elements {
 public:
  explicit Elements(char separator) : separator_(separator) {}

  // Takes the segment in hand; the text must outlive the reading.
  void Take(std::string_view segment);

  // Where element n starts, counted from 1, or 0. The element is found by n searches for a separator, each from behind
  // the one before; a search that fails leaves off in front of the segment, and the next begins there anew. So with k
  // separators the answers run in a cycle of k + 1: the first missing element gives 0, the next ones give the elements
  // from the first again. Raises error 6 beyond 32,767, for positions are 16-bit numbers.
  std::int16_t PosBeg(int n) const;
  // The length of element n, or 0 when it is the last one, missing or empty: the same with n + 1 searches, less
  // PosBeg(n).
  std::int16_t PosEnd(int n) const;
  std::int16_t Count() const;

 private:
  // Of the separator that the nth search finds, counted from 1; 0 when it finds none.
  std::size_t Found(int n) const;

  char separator_;
  std::vector<std::uint32_t> separators_;  // their positions, counted from 1
};

}  // namespace partnerkit
