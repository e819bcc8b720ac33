#include "host/decimal.h"

#include <charconv>
#include <cmath>
#include <stdexcept>

namespace host {

Decimal::Decimal(long long units) : mantissa_(units), scale_(0) {}

Decimal::Int Decimal::pow10(int n) {
  Int result = 1;
  for (int i = 0; i < n; ++i) result *= 10;
  return result;
}

void Decimal::normalize() {
  if (mantissa_ == 0) {
    scale_ = 0;
    return;
  }
  while (scale_ > 0 && mantissa_ % 10 == 0) {
    mantissa_ /= 10;
    --scale_;
  }
}

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
  return Decimal(negative ? Int(-mantissa) : mantissa, scale);
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
  Int magnitude = mantissa_ < 0 ? Int(-mantissa_) : mantissa_;
  Int quotient = magnitude / divisor;
  Int remainder = magnitude % divisor;
  if (remainder * 2 >= divisor) ++quotient;
  return Decimal(mantissa_ < 0 ? Int(-quotient) : quotient, decimals);
}

Decimal Decimal::truncated(int decimals) const {
  if (decimals < 0) decimals = 0;
  if (scale_ <= decimals) return *this;
  return Decimal(Int(mantissa_ / pow10(scale_ - decimals)), decimals);
}

std::string Decimal::toString(int min_decimals) const {
  int decimals = std::max(scale_, min_decimals);
  Int magnitude = mantissa_ < 0 ? Int(-mantissa_) : mantissa_;
  magnitude *= pow10(decimals - scale_);
  std::string digits = magnitude.str();
  if (static_cast<int>(digits.size()) <= decimals)
    digits.insert(0, decimals + 1 - digits.size(), '0');
  if (decimals > 0) digits.insert(digits.size() - decimals, 1, '.');
  if (mantissa_ < 0) digits.insert(0, 1, '-');
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
  Int whole = mantissa_ / pow10(scale_);
  if (whole > std::numeric_limits<long long>::max() || whole < std::numeric_limits<long long>::min())
    throw std::overflow_error("nombre trop grand pour un entier");
  return static_cast<long long>(whole);
}

Decimal Decimal::abs() const { return mantissa_ < 0 ? -*this : *this; }

Decimal Decimal::operator-() const {
  Decimal result = *this;
  result.mantissa_ = -result.mantissa_;
  return result;
}

Decimal& Decimal::operator+=(const Decimal& other) {
  int scale = std::max(scale_, other.scale_);
  mantissa_ = mantissa_ * pow10(scale - scale_) + other.mantissa_ * pow10(scale - other.scale_);
  scale_ = scale;
  normalize();
  return *this;
}

Decimal& Decimal::operator-=(const Decimal& other) { return *this += -other; }

Decimal& Decimal::operator*=(const Decimal& other) {
  mantissa_ *= other.mantissa_;
  scale_ += other.scale_;
  normalize();
  return *this;
}

Decimal& Decimal::operator/=(const Decimal& other) {
  if (other.mantissa_ == 0) throw std::domain_error("division par zéro");
  // (a / 10^sa) / (b / 10^sb), computed with one extra digit for the rounding.
  const int target = kDivisionDecimals + 1;
  Int numerator = mantissa_ * pow10(target + other.scale_);
  Int denominator = other.mantissa_ * pow10(scale_);
  Decimal quotient(numerator / denominator, target);
  *this = quotient.rounded(kDivisionDecimals);
  return *this;
}

int Decimal::compare(const Decimal& a, const Decimal& b) {
  int scale = std::max(a.scale_, b.scale_);
  Int left = a.mantissa_ * pow10(scale - a.scale_);
  Int right = b.mantissa_ * pow10(scale - b.scale_);
  return left < right ? -1 : (left > right ? 1 : 0);
}

}  // namespace host
