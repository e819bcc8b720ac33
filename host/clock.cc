#include "host/clock.h"

#include <cstdio>
#include <ctime>

namespace host::clock {
namespace {
std::optional<std::chrono::year_month_day> fixed_day;
std::optional<std::string> fixed_time;
}  // namespace

std::chrono::year_month_day today() {
  if (fixed_day) return *fixed_day;
  return std::chrono::year_month_day(std::chrono::floor<std::chrono::days>(std::chrono::system_clock::now()));
}

std::string timeOfDay() {
  if (fixed_time) return *fixed_time;
  std::time_t now = std::time(nullptr);
  std::tm local{};
  localtime_r(&now, &local);
  char buffer[16];
  std::snprintf(buffer, sizeof buffer, "%02d:%02d:%02d", local.tm_hour, local.tm_min, local.tm_sec);
  return buffer;
}

void setToday(std::optional<std::chrono::year_month_day> day) { fixed_day = day; }
void setTimeOfDay(std::optional<std::string> time) { fixed_time = std::move(time); }

}  // namespace host::clock
