#include "metadata/present_time.h"

#include <ctime>

namespace zelta {

MXFTimestamp presentTimestamp() {
  const std::time_t now = std::time(nullptr);
  std::tm utc{};
  gmtime_r(&now, &utc);
  MXFTimestamp timestamp;
  timestamp.year = static_cast<std::uint16_t>(utc.tm_year + 1900);
  timestamp.month = static_cast<std::uint8_t>(utc.tm_mon + 1);
  timestamp.day = static_cast<std::uint8_t>(utc.tm_mday);
  timestamp.hour = static_cast<std::uint8_t>(utc.tm_hour);
  timestamp.minute = static_cast<std::uint8_t>(utc.tm_min);
  timestamp.second = static_cast<std::uint8_t>(utc.tm_sec);
  return timestamp;
}

}  // namespace zelta
