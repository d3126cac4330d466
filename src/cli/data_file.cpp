#include "cli/data_file.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <set>
#include <sstream>
#include <utility>
#include <vector>

#include "cli/command.h"
#include "cli/text.h"

namespace partnerkit::cli {

namespace {

using nlohmann::json;

std::string ReadWhole(const std::string& path) {
  std::error_code failure;
  if (std::filesystem::is_directory(path, failure)) throw Refusal(path + ": is a folder");
  std::ifstream file(path, std::ios::binary);
  std::ostringstream text;
  if (!file || (file.peek() != std::ifstream::traits_type::eof() && !(text << file.rdbuf()))) {
    throw Refusal(path + ": cannot be read: " + std::strerror(errno));
  }
  return std::move(text).str();
}

// "line 3, column 17" of the byte before `end`, the last one read.
std::string Place(std::string_view text, std::size_t end) {
  const std::string_view before = text.substr(0, end == 0 ? 0 : end - 1);
  const auto line = 1 + std::ranges::count(before, '\n');
  const std::size_t start = before.rfind('\n') + 1;  // npos + 1 is 0
  return "line " + std::to_string(line) + ", column " + std::to_string(Width(Utf8(before.substr(start))) + 1);
}

// The cause alone: the parser puts its own name and place before it.
std::string Cause(std::string_view message) {
  for (const std::string_view lead : {"[json.exception.", "parse error"}) {
    if (message.starts_with(lead))
      message.remove_prefix(std::min(message.size(), message.find(lead[0] == '[' ? ']' : ':') + 2));
  }
  return OneLine(message);
}

// Turns away an object that names a member twice; the parser would keep the last.
class NamesOnce {
 public:
  bool operator()(int, json::parse_event_t event, const json& value) {
    if (event == json::parse_event_t::object_start) names_.emplace_back();
    if (event == json::parse_event_t::object_end) names_.pop_back();
    if (event == json::parse_event_t::key && !names_.back().insert(value.get<std::string>()).second) {
      throw Refusal(value.dump() + " is given twice");
    }
    return true;
  }

 private:
  std::vector<std::set<std::string>> names_;
};

}  // namespace

json ReadDataFile(const std::string& path) {
  std::istringstream text(ReadWhole(path));
  const auto refuse = [&](const std::string& cause) {
    const auto read = text.rdbuf()->pubseekoff(0, std::ios::cur, std::ios::in);
    const std::string_view all = text.view();
    const std::size_t end = read < 0 ? all.size() : static_cast<std::size_t>(read);
    return Refusal(path + ": " + Place(all, end) + ": " + cause);
  };
  json data;
  try {
    data = json::parse(text, NamesOnce());
  } catch (const json::exception& error) {
    throw refuse(Cause(error.what()));
  } catch (const Refusal& refusal) {
    throw refuse(refusal.what());
  }
  if (!data.is_object()) throw Refusal(path + ": wants one JSON object with an array of records for each kind");
  return data;
}

}  // namespace partnerkit::cli
