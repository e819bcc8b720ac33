// The host clock: today and the current time. A session script may set them so that
// every date rule can be tested; unset, they follow the system clock.
#pragma once

#include <chrono>
#include <optional>
#include <string>

namespace host::clock {

std::chrono::year_month_day today();
// "HH:MM:SS"
std::string timeOfDay();

void setToday(std::optional<std::chrono::year_month_day> day);
void setTimeOfDay(std::optional<std::string> time);

}  // namespace host::clock
