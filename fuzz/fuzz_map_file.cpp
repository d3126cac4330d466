// The input is a map file, read before a fixed order file. Whatever columns it names, no line may get lost.
#include <algorithm>

#include "order_run.h"

namespace {

using namespace partnerkit::fuzz;

constexpr std::string_view kOrderFile =
    "000000481,481,0001,MGBEDI,ACMEEDI,00,SA,4500012345,20060306,104455,REG,310,20060320,20060403,20060410,Z1,0052,"
    "0900,1,EN,9312345678907,EA,WE,10.50,6,2004510,19.95,6,,,,,,,,,,1\r\n"
    "000000481,481,0001,MGBEDI,ACMEEDI,00,SA,4500012345,20060306,104455,REG,310,20060320,20060403,20060410,Z1,0117,"
    "0900,1,EN,9312345678907,EA,WE,10.50,12,2004510,19.95,12,,,,,,,,,,2\r\n"
    "000000481,481,0002,MGBEDI,ACMEEDI,00,SA,4500012346,20060306,104455,REG,310,20060320,20060403,,Z1,0999,"
    "0900,1,EN,9312345679010,EA,WE,10.50,8,2004510,19.95,8,,,,,,,,,,1\r\n"
    "000000481,481,0003,OTHEREDI,ACMEEDI,00,SA,4500012347,20060306,104455,REG,310,20060320,20060403,,Z1,0117,"
    "DTS,1,EN,9312345679010,EA,WE,10.50,8,2004510,19.95,8,,,,,,,,,,1";

// The first line of the map that names the order numbers; none of the columns when none does.
std::size_t NumberColumn(std::string_view map) {
  const std::vector<std::string_view> lines = LinesOf(map);
  const auto found = std::find_if(lines.begin(), lines.end(), [](std::string_view line) {
    return Trimmed(line.substr(0, line.find_first_of("\r\n"))) == "PONUMBER";
  });
  return static_cast<std::size_t>(found - lines.begin());
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string map(reinterpret_cast<const char*>(data), size);
  for (const bool checks : {true, false}) {
    OrderRun run(map, kOrderFile, checks);
    run.ProcessAll(NumberColumn(map));
  }
  return 0;
}
