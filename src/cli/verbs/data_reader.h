// From the JSON of data files to records.
#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "cli/output/record_json.h"

namespace partnerkit::cli {

// A record of a file, with what stands inside it.
struct DataItem {
  const RecordType* type = nullptr;
  const std::string* file = nullptr;
  std::size_t index = 0;
  std::shared_ptr<void> record;
  std::vector<std::shared_ptr<void>> parts;

  // "Partner[3]"
  std::string Place() const;
};

// Who takes what the files hold, in the order in which it stands there. Both may raise what they like.
class DataTaker {
 public:
  virtual ~DataTaker() = default;
  virtual void TakeKind(const RecordType& type) = 0;
  virtual void TakeItem(const DataItem& item) = 0;
  virtual void TakeSetting(std::string_view name, const std::string& text) = 0;
};

[[noreturn]] void RefuseAt(const std::string& file, const std::string& place, const std::string& cause);

// Each record is handed on when it has been read, so that memory doesn't grow with the file. Raises Refusal for the
// first fault; what came before it has been handed on.
void ReadRecords(const std::string& file, const std::string& workspace, DataTaker& taker);

}  // namespace partnerkit::cli
