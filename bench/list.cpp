// How long `Load` takes to list an order file, apart from the start of the program and from what follows on it.
//   list CLASS WORKSPACE DOCUMENT FILE
#include <sys/resource.h>

#include <cstdio>
#include <cstdlib>

#include "host/sql_host.h"
#include "partnerkit/catalogue.h"
#include "partnerkit/platform.h"
#include "stopwatch.h"

int main(int count, char** arguments) {
  using namespace partnerkit;
  if (count != 5) {
    std::fputs("usage: list CLASS WORKSPACE DOCUMENT FILE\n", stderr);
    return 2;
  }
  const auto host = host::SqlHost::Open(std::string(arguments[2]) + "/partnerkit.db", {.relativePaths = true});
  const auto importer = CreateTranslator(arguments[1], platform::DefaultPorts());
  ColumnTable columns;
  RowTable rows;
  if (!importer || !importer->Init(*host, static_cast<std::int16_t>(std::atoi(arguments[3])), columns)) return 1;
  const Stopwatch watch;
  const std::int32_t listed = importer->Load(arguments[4], rows);
  const double seconds = watch.Elapsed(), busy = watch.Busy();
  rusage usage{};
  getrusage(RUSAGE_SELF, &usage);
  std::printf("{\"rows\": %d, \"seconds\": %.6f, \"busy\": %.6f, \"memory\": %ld}\n", listed, seconds, busy,
              usage.ru_maxrss * 1024);
  return listed > 0 ? 0 : 1;
}
