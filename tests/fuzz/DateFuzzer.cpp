#include <agent/discovery/dmi/DmiValues.h>
#include <cimom/broker/DateTimeText.h>

#include <cstdio>
#include <string>

#include "Fuzzer.h"
#include "Linux/ReleaseDate.h"

namespace inventory = Oru::SoftwareInventoryProfileProvider;

void fuzz::tryOne(std::string_view input) {
  if (const auto date = agent::discovery::parseBiosDate(input)) {
    promise(date->size() == 10, "a date of SMBIOS that is not MM/DD/YYYY");
  }
  if (const auto date = agent::discovery::parseFirmwareDate(input)) {
    promise(date->size() == 10, "a date of declared firmware that is not MM/DD/YYYY");
  }
  static_cast<void>(agent::discovery::isUnset(input));
  static_cast<void>(agent::discovery::parseBiosRelease(input));
  static_cast<void>(agent::discovery::parseMajorMinor(input));
  if (cimom::isDateTimeText(input)) {
    promise(input.size() == 25, "a datetime that has not 25 characters");
    static_cast<void>(cimom::microsecondsOf(input));
  }

  const std::string text(input);
  unsigned int month = 0;
  unsigned int day = 0;
  unsigned int year = 0;
  // The very function whose reading is the rule, its silence about overflow included.
  // NOLINTNEXTLINE(cert-err34-c)
  static_cast<void>(std::sscanf(text.c_str(), "%02u/%02u/%04u", &month, &day, &year));
  const inventory::MonthDayYear scanned = inventory::scanDate(text);
  promise(scanned.month == month && scanned.day == day && scanned.year == year,
          "a release date is scanned otherwise than by the C library");
}
