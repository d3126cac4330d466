#include "partnerkit/database_host.h"

#include "host/sql_host.h"

namespace partnerkit {

std::unique_ptr<DatabaseHost> DatabaseHost::Open(std::string_view url, const DatabaseOptions& options) {
  return host::SqlHost::Open(url,
                             {.lockTimeout = options.lockTimeout, .create = options.create, .relativePaths = true});
}

}  // namespace partnerkit
