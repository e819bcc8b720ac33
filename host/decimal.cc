#include "host/decimal.h"

#include <algorithm>
#include <boost/multiprecision/cpp_int.hpp>
#include <charconv>
#include <cmath>
#include <limits>
#include <new>
#include <stdexcept>
#include <type_traits>
#include <utility>

namespace host {

namespace {

using Int = boost::multiprecision::cpp_int;

Int pow10(int n) {
  Int result = 1;
  for (int i = 0; i < n; ++i) result *= 10;
  return result;
}

// Drops trailing zero decimals, so that equal numbers hold equal mantissas.
void normalize(Int& mantissa, int& scale) {
  if (mantissa.is_zero()) {
    scale = 0;
    return;
  }
  while (scale > 0 && mantissa % 10 == 0) {
    mantissa /= 10;
    --scale;
  }
}

}  // namespace

struct Decimal::Mantissa {
  Int value;
};

// Moves must not throw for the noexcept promises of Decimal's own moves.
static_assert(std::is_nothrow_move_constructible_v<Int> && std::is_nothrow_move_assignable_v<Int>);

Decimal::Mantissa& Decimal::mantissa() noexcept {
  return *std::launder(reinterpret_cast<Mantissa*>(storage_));
}

const Decimal::Mantissa& Decimal::mantissa() const noexcept {
  static_assert(sizeof(Mantissa) <= kMantissaSize, "storage_ too small for the mantissa");
  static_assert(alignof(Mantissa) <= kMantissaAlignment, "storage_ under-aligned for the mantissa");
  return *std::launder(reinterpret_cast<const Mantissa*>(storage_));
}

Decimal::Decimal() { new (storage_) Mantissa{}; }

Decimal::Decimal(long long units) { new (storage_) Mantissa{Int(units)}; }

// Normalised before it is placed, so that nothing can throw once the mantissa lives
// in storage_ (a constructor that throws does not run the destructor).
Decimal::Decimal(Mantissa mantissa, int scale) {
  normalize(mantissa.value, scale);
  new (storage_) Mantissa(std::move(mantissa));
  scale_ = scale;
}

Decimal::Decimal(const Decimal& other) : scale_(other.scale_) { new (storage_) Mantissa(other.mantissa()); }

Decimal::Decimal(Decimal&& other) noexcept : scale_(other.scale_) {
  new (storage_) Mantissa(std::move(other.mantissa()));
}

Decimal& Decimal::operator=(const Decimal& other) {
  mantissa() = other.mantissa();
  scale_ = other.scale_;
  return *this;
}

// A big mantissa moved onto itself would free its own digits.
Decimal& Decimal::operator=(Decimal&& other) noexcept {
  if (this != &other) {
    mantissa() = std::move(other.mantissa());
    scale_ = other.scale_;
  }
  return *this;
}

Decimal::~Decimal() { mantissa().~Mantissa(); }

bool Decimal::isZero() const { return mantissa().value.is_zero(); }

int Decimal::sign() const { return mantissa().value.sign(); }

std::optional<Decimal> Decimal::parse(std::string_view text) {
  while (!text.empty() && text.front() == ' ') text.remove_prefix(1);
  while (!text.empty() && text.back() == ' ') text.remove_suffix(1);
  if (text.empty()) return std::nullopt;
  bool negative = false;
  if (text.front() == '-' || text.front() == '+') {
    negative = text.front() == '-';
    text.remove_prefix(1);
  }
  Int mantissa = 0;
  int scale = 0;
  bool separator = false;
  bool digits = false;
  for (char c : text) {
    if (c >= '0' && c <= '9') {
      mantissa = mantissa * 10 + (c - '0');
      digits = true;
      if (separator) ++scale;
    } else if ((c == '.' || c == ',') && !separator) {
      separator = true;
    } else {
      return std::nullopt;
    }
  }
  if (!digits) return std::nullopt;
  return Decimal(Mantissa{negative ? Int(-mantissa) : std::move(mantissa)}, scale);
}

namespace {

// The shortest text of a binary number, in fixed notation: at most 309 integer
// digits, or 325 decimals for the smallest double. Infinities and NaN have none.
template <typename Binary>
std::optional<Decimal> shortestOf(Binary value) {
  char buffer[400];
  auto [end, ec] = std::to_chars(buffer, buffer + sizeof buffer, value, std::chars_format::fixed);
  if (ec != std::errc()) return std::nullopt;
  return Decimal::parse(std::string_view(buffer, static_cast<std::size_t>(end - buffer)));
}

}  // namespace

Decimal Decimal::fromDouble(double value) {
  auto decimal = shortestOf(value);
  if (!decimal) throw std::invalid_argument("nombre hors limites");
  return *decimal;
}

Decimal Decimal::fromFloat(float value) {
  auto decimal = shortestOf(value);
  if (!decimal) throw std::invalid_argument("nombre hors limites");
  return *decimal;
}

Decimal Decimal::rounded(int decimals) const {
  if (decimals < 0) decimals = 0;
  if (scale_ <= decimals) return *this;
  Int divisor = pow10(scale_ - decimals);
  Int magnitude = boost::multiprecision::abs(mantissa().value);
  Int quotient = magnitude / divisor;
  Int remainder = magnitude % divisor;
  if (remainder * 2 >= divisor) ++quotient;
  return Decimal(Mantissa{sign() < 0 ? Int(-quotient) : quotient}, decimals);
}

Decimal Decimal::truncated(int decimals) const {
  if (decimals < 0) decimals = 0;
  if (scale_ <= decimals) return *this;
  return Decimal(Mantissa{mantissa().value / pow10(scale_ - decimals)}, decimals);
}

std::string Decimal::toString(int min_decimals) const {
  int decimals = std::max(scale_, min_decimals);
  Int magnitude = boost::multiprecision::abs(mantissa().value);
  magnitude *= pow10(decimals - scale_);
  std::string digits = magnitude.str();
  if (static_cast<int>(digits.size()) <= decimals)
    digits.insert(0, decimals + 1 - digits.size(), '0');
  if (decimals > 0) digits.insert(digits.size() - decimals, 1, '.');
  if (sign() < 0) digits.insert(0, 1, '-');
  return digits;
}

std::string Decimal::toFixed(int decimals) const { return rounded(decimals).toString(decimals); }

double Decimal::toDouble() const {
  double value = 0;
  std::string text = toString(0);
  auto [end, ec] = std::from_chars(text.data(), text.data() + text.size(), value);
  // Beyond a double's range the text reads as nothing: too large is infinite, too
  // small is zero.
  if (ec == std::errc::result_out_of_range)
    return abs() >= Decimal(1) ? (sign() < 0 ? -HUGE_VAL : HUGE_VAL) : 0.0;
  return value;
}

long long Decimal::toInteger() const {
  Int whole = mantissa().value / pow10(scale_);
  if (whole > std::numeric_limits<long long>::max() || whole < std::numeric_limits<long long>::min())
    throw std::overflow_error("nombre trop grand pour un entier");
  return static_cast<long long>(whole);
}

Decimal Decimal::abs() const { return sign() < 0 ? -*this : *this; }

Decimal Decimal::operator-() const {
  Decimal result = *this;
  Int& value = result.mantissa().value;
  value = -value;
  return result;
}

Decimal& Decimal::operator+=(const Decimal& other) {
  int scale = std::max(scale_, other.scale_);
  Int& value = mantissa().value;
  value = value * pow10(scale - scale_) + other.mantissa().value * pow10(scale - other.scale_);
  scale_ = scale;
  normalize(value, scale_);
  return *this;
}

Decimal& Decimal::operator-=(const Decimal& other) { return *this += -other; }

Decimal& Decimal::operator*=(const Decimal& other) {
  mantissa().value *= other.mantissa().value;
  scale_ += other.scale_;
  normalize(mantissa().value, scale_);
  return *this;
}

Decimal& Decimal::operator/=(const Decimal& other) {
  if (other.isZero()) throw std::domain_error("division par zéro");
  // (a / 10^sa) / (b / 10^sb), computed with one extra digit for the rounding.
  const int target = kDivisionDecimals + 1;
  Int numerator = mantissa().value * pow10(target + other.scale_);
  Int denominator = other.mantissa().value * pow10(scale_);
  Decimal quotient(Mantissa{numerator / denominator}, target);
  *this = quotient.rounded(kDivisionDecimals);
  return *this;
}

int Decimal::compare(const Decimal& a, const Decimal& b) {
  int scale = std::max(a.scale_, b.scale_);
  Int left = a.mantissa().value * pow10(scale - a.scale_);
  Int right = b.mantissa().value * pow10(scale - b.scale_);
  return left < right ? -1 : (left > right ? 1 : 0);
}

}  // namespace host
