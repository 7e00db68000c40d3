#include "cli/times.h"

#include <array>
#include <ctime>

std::string time_of(const Port::FileStatus& file) {
  constexpr __int64 SECOND = 1'000'000'000;
  // Rounded down, also before 1970.
  const time_t seconds = (file.time < 0 ? file.time - SECOND + 1 : file.time) / SECOND;
  std::tm local = {};
  ::localtime_r(&seconds, &local);
  std::array<char, 80> text;
  std::strftime(text.data(), text.size(), "%Y-%m-%d %H:%M:%S", &local);
  std::string fraction = std::to_string((file.time - seconds * SECOND) / 1'000'000);
  return std::string(text.data()) + "." + fraction.insert(0, 3 - fraction.size(), '0');
}

std::string lead_of(const Port::FileStatus& newer, const Port::FileStatus& older) {
  struct unit {
    const char* name;
    unsigned long long length;
  };
  constexpr unit UNITS[] = {{" d", 86'400'000'000'000},
                            {" h", 3'600'000'000'000},
                            {" min", 60'000'000'000},
                            {" s", 1'000'000'000},
                            {" ms", 1'000'000},
                            {" µs", 1'000},
                            {" ns", 1}};
  auto rest =
      static_cast<unsigned long long>(newer.time) - static_cast<unsigned long long>(older.time);
  std::string text;
  for (const unit& u : UNITS) {
    const unsigned long long number = rest / u.length;
    rest %= u.length;
    if (number == 0 && text.empty()) continue;
    if (!text.empty()) return number > 0 ? text + " " + std::to_string(number) + u.name : text;
    text = std::to_string(number) + u.name;
  }
  return text;
}
