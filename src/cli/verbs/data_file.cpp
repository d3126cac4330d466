#include "cli/verbs/data_file.h"

#include <algorithm>
#include <cerrno>
#include <cstddef>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string_view>
#include <vector>

#include "cli/output/command.h"
#include "cli/output/text.h"

namespace partnerkit::cli {

namespace {

using nlohmann::json;

// A file's bytes one by one, and where the last of them stands.
class Bytes {
 public:
  explicit Bytes(const std::string& path) : path_(path), block_(kBlock) {
    std::error_code failure;
    if (std::filesystem::is_directory(path, failure)) throw Refusal(path + ": is a folder");
    errno = 0;
    file_.open(path, std::ios::binary);
    if (!file_) Refuse();
    Fill();
  }

  bool AtEnd() const { return at_ == end_; }
  char Current() const { return block_[at_]; }
  void Next() {
    const char c = block_[at_];
    if (newLine_) {
      ++line_;
      column_ = 0;
    }
    newLine_ = c == '\n';
    if ((static_cast<unsigned char>(c) & 0xC0) != 0x80) ++column_;
    if (++at_ == end_) Fill();
  }

  // "line 3, column 17"
  std::string Place() const {
    return "line " + std::to_string(line_) + ", column " + std::to_string(std::max<std::size_t>(column_, 1));
  }

 private:
  static constexpr std::size_t kBlock = 1 << 18;

  void Fill() {
    file_.read(block_.data(), static_cast<std::streamsize>(block_.size()));
    if (file_.bad()) Refuse();
    at_ = 0;
    end_ = static_cast<std::size_t>(file_.gcount());
  }
  [[noreturn]] void Refuse() const { throw Refusal(path_ + ": cannot be read: " + std::strerror(errno)); }

  const std::string& path_;
  std::ifstream file_;
  std::vector<char> block_;
  std::size_t at_ = 0, end_ = 0;
  std::size_t line_ = 1, column_ = 0;
  bool newLine_ = false;  // the last byte ended a line
};

// What the parser walks with. Copies walk together.
class Walk {
 public:
  using iterator_category = std::input_iterator_tag;
  using value_type = char;
  using difference_type = std::ptrdiff_t;
  using pointer = const char*;
  using reference = char;

  explicit Walk(Bytes* bytes) : bytes_(bytes) {}
  char operator*() const { return bytes_->Current(); }
  Walk& operator++() {
    bytes_->Next();
    return *this;
  }
  // It is only asked whether the end has come.
  bool operator==(const Walk&) const { return bytes_->AtEnd(); }

 private:
  Bytes* bytes_;
};

}  // namespace

void ReadDataFile(const std::string& path, JsonEvents& events) {
  Bytes bytes(path);
  try {
    json::sax_parse(Walk(&bytes), Walk(&bytes), &events);
  } catch (const SyntaxFault& fault) {
    throw Refusal(path + ": " + bytes.Place() + ": " + OneLine(fault.what()));
  }
}

}  // namespace partnerkit::cli
