// Dates as partners write them in order fields. A date that can't be read stays unset; nothing is raised or reported.
#pragma once

#include <optional>
#include <string_view>

#include "partnerkit/values.h"

namespace partnerkit {

// An order field: year/month/day, yymmdd or yyyymmdd. A two-digit year below 30 lies in the 2000s, any other in the
// 1900s.
std::optional<DateTime> OrderDate(std::string_view text);

// The date of three fields or columns, by the same rule for two-digit years. Blanks around the digits are allowed.
std::optional<DateTime> DateFromParts(std::string_view yearText, std::string_view monthText, std::string_view dayText);

// A date as this system shows it, 31/07/2004, or in ISO form: how a text shows that it is a date.
std::optional<DateTime> ShownDate(std::string_view text);

}  // namespace partnerkit
