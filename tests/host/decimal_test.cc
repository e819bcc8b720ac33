#include "host/decimal.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>

namespace host {
namespace {

Decimal D(const char* text) { return *Decimal::parse(text); }

TEST(Decimal, RoundsToNearestTiesAwayFromZero) {
  struct Case {
    const char* value;
    int decimals;
    const char* expected;
  } cases[] = {
      {"0.115", 2, "0.12"},   {"-0.125", 2, "-0.13"}, {"0.125", 2, "0.13"}, {"0.124999", 2, "0.12"},
      {"19.6", 2, "19.60"},   {"2.5", 0, "3"},        {"-2.5", 0, "-3"},    {"1234.5678", 3, "1234.568"},
  };
  for (const auto& c : cases) EXPECT_EQ(D(c.value).toFixed(c.decimals), c.expected) << c.value;
}

TEST(Decimal, PercentagesOfMoney) {
  EXPECT_EQ((D("1.15") * D("10") / D("100")).rounded(2), D("0.12"));
  EXPECT_EQ((D("100.00") * Decimal::fromDouble(19.6) / D("100")).toFixed(2), "19.60");
  EXPECT_EQ((D("100.00") * Decimal::fromFloat(19.6f) / D("100")).toFixed(2), "19.60");
}

TEST(Decimal, ParsesOnlyNumbers) {
  for (const char* bad : {"", "abc", "1.2.3", "1e5", "--1", ".", "12a"}) EXPECT_FALSE(Decimal::parse(bad)) << bad;
  EXPECT_EQ(D("-0,5"), D("-0.5"));
  EXPECT_EQ(D(" +3 "), Decimal(3));
}

TEST(Decimal, DivisionKeepsTwentyDecimals) {
  EXPECT_EQ((D("119.60") / D("1.196")).toFixed(2), "100.00");
  EXPECT_EQ((D("1") / D("3")).toString(0), "0.33333333333333333333");
  EXPECT_THROW(D("1") / Decimal(), std::domain_error);
}

TEST(Decimal, CopiesAndMovesKeepTheValue) {
  // Small mantissas are held in place, a 41-digit one on the heap: every pairing of the
  // two goes through each copy and move, including onto itself and onto a moved-from one.
  const char* values[] = {"0", "-119.60", "1234567890123456789012345678901234567890.5"};
  for (const char* from : values) {
    for (const char* onto : values) {
      SCOPED_TRACE(std::string(from) + " onto " + onto);
      Decimal source = D(from);
      Decimal copy(source);
      copy += Decimal(1);
      EXPECT_EQ(source, D(from));
      Decimal assigned = D(onto);
      assigned = source;
      EXPECT_EQ(assigned, D(from));
      Decimal moved(std::move(assigned));
      EXPECT_EQ(moved, D(from));
      assigned = D(onto);
      EXPECT_EQ(assigned, D(onto));
      Decimal target = D(onto);
      target = std::move(moved);
      EXPECT_EQ(target, D(from));
      Decimal& self = target;
      target = self;
      EXPECT_EQ(target, D(from));
      target = std::move(self);
      EXPECT_EQ(target, D(from));
    }
  }
}

}  // namespace
}  // namespace host
