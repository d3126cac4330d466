// The input is a map file, read before the orders of the class's sample. Whatever columns it names, no line may get
// lost.
#include "order_run.h"

const std::string_view partnerkit::fuzz::kDefaultClass = "PartnerKit.clsMGB850csv";

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace partnerkit::fuzz;
  const std::string map(reinterpret_cast<const char*>(data), size);
  for (const bool checks : {true, false}) OrderRun(map, TheSubject().orders, checks, !checks).ProcessAll();
  return 0;
}
