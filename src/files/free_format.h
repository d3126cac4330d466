// Reading comma-delimited records in free format: texts may stand in double quotes, and a comma inside them is text.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "files/line_reader.h"

namespace partnerkit {

class FreeFormatReader {
 public:
  // `path` is what errors call the file.
  FreeFormatReader(InputFile& file, std::string path, std::size_t columns)
      : lines_(file), path_(std::move(path)), columns_(columns) {}

  // Reads the next record, one a line, blanks round an item cut unless it is quoted; blank lines are passed over. False
  // at the end. A line that hasn't the number of columns raises RunTimeError: read on, its neighbours' columns would be
  // taken for its own.
  bool Read(std::vector<std::string>& items);

 private:
  LineReader lines_;
  std::string path_;
  std::size_t columns_;
  std::uint64_t lineNo_ = 0;
};

}  // namespace partnerkit
