// Exact decimal numbers for money and for every computation that involves it.
//
// A Decimal is an integer mantissa and a count of decimals: 119.60 is (11960, 2).
// Addition, subtraction, multiplication and comparison are exact; division keeps
// kDivisionDecimals decimals and rounds the last one to the nearest. Nothing here
// ever goes through binary floating point: a rate held in a double enters through
// its shortest decimal text (fromDouble(19.6) is exactly 19.6).
#pragma once

#include <compare>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace host {

class Decimal {
 public:
  static constexpr int kDivisionDecimals = 20;

  Decimal();  // zero
  Decimal(long long units);  // NOLINT(google-explicit-constructor): 0 and 100 read naturally
  Decimal(const Decimal& other);
  Decimal(Decimal&& other) noexcept;  // `other` stays usable: it may be assigned or destroyed
  Decimal& operator=(const Decimal& other);
  Decimal& operator=(Decimal&& other) noexcept;
  ~Decimal();

  // Parses "119.60", "-0,125", "+3", " 12 ". Returns nothing for anything else
  // (empty text, letters, two separators, exponents).
  static std::optional<Decimal> parse(std::string_view text);
  // The shortest decimal text that reads back as the same double / float.
  static Decimal fromDouble(double value);
  static Decimal fromFloat(float value);

  // Rounds to `decimals` places, to the nearest, ties away from zero
  // (0.125 -> 0.13, -0.125 -> -0.13).
  Decimal rounded(int decimals) const;
  // Drops decimals without rounding, towards zero.
  Decimal truncated(int decimals) const;

  // Text with at least `min_decimals` decimals and no trailing zero beyond them:
  // toString() of 119.6 is "119.60", of 1.125 is "1.125", of 1000 is "1000.00".
  std::string toString(int min_decimals = 2) const;
  // Text with exactly `decimals` decimals, rounded as rounded() does.
  std::string toFixed(int decimals) const;

  double toDouble() const;
  // The integer part, towards zero; throws std::overflow_error beyond 64 bits.
  long long toInteger() const;

  bool isZero() const;
  int sign() const;  // -1, 0 or 1
  Decimal abs() const;

  Decimal operator-() const;
  Decimal& operator+=(const Decimal& other);
  Decimal& operator-=(const Decimal& other);
  Decimal& operator*=(const Decimal& other);
  // Throws std::domain_error on division by zero.
  Decimal& operator/=(const Decimal& other);

  friend Decimal operator+(Decimal a, const Decimal& b) { return a += b; }
  friend Decimal operator-(Decimal a, const Decimal& b) { return a -= b; }
  friend Decimal operator*(Decimal a, const Decimal& b) { return a *= b; }
  friend Decimal operator/(Decimal a, const Decimal& b) { return a /= b; }
  friend bool operator==(const Decimal& a, const Decimal& b) { return compare(a, b) == 0; }
  friend std::strong_ordering operator<=>(const Decimal& a, const Decimal& b) {
    int c = compare(a, b);
    return c < 0 ? std::strong_ordering::less
                 : (c > 0 ? std::strong_ordering::greater : std::strong_ordering::equal);
  }

 private:
  // The mantissa is an integer of unbounded size, known only to decimal.cc so that
  // the big-integer arithmetic is compiled once rather than in every file that
  // handles money. It lives in place in storage_: a Decimal allocates nothing until
  // its mantissa outgrows a couple of machine words.
  struct Mantissa;
  static constexpr std::size_t kMantissaSize = 32;
  static constexpr std::size_t kMantissaAlignment = 16;

  Decimal(Mantissa mantissa, int scale);
  Mantissa& mantissa() noexcept;
  const Mantissa& mantissa() const noexcept;
  static int compare(const Decimal& a, const Decimal& b);

  alignas(kMantissaAlignment) std::byte storage_[kMantissaSize];
  int scale_ = 0;  // number of decimals, never negative
};

}  // namespace host
