// The input is an order file. Every line of it that is not dealt with must still be there after a run, byte for byte,
// and no order may be stored twice.
#include <numeric>

#include "order_run.h"

const std::string_view partnerkit::fuzz::kDefaultClass = "PartnerKit.clsMGB850csv";

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace partnerkit::fuzz;
  const std::string orders(reinterpret_cast<const char*>(data), size);
  // One way of three for each input, told by its bytes: all three would take thrice the time of a mutation.
  const unsigned sum = std::accumulate(data, data + size, 0U), way = sum % 3;
  OrderRun run(TheSubject().map, orders, way != 1, sum / 3 % 2 == 1);
  if (way == 2) {
    run.DeleteRow(true);
    run.DeleteRow(false);
  } else if (run.ProcessAll()) {
    // What stays is listed again, and may be dealt with by now.
    run.ProcessAll();
  }
  return 0;
}
