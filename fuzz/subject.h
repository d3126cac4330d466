// The class that is fuzzed, named in PARTNERKIT_FUZZ_CLASS, with the map, the orders and the records of its sample.
#pragma once

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <memory>
#include <nlohmann/json.hpp>
#include <set>
#include <sstream>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "cli/output/record_json.h"
#include "cli/workspace/demo_files.h"
#include "partnerkit/records.h"

namespace partnerkit::fuzz {

inline void Check(bool holds, const char* what) {
  if (holds) return;
  std::fprintf(stderr, "does not hold: %s\n", what);
  std::abort();
}

// The words of tests/data/file_rules.txt that hold for the class.
using ClassRules = std::set<std::string, std::less<>>;

inline ClassRules ReadRules(std::string_view progId) {
  std::ifstream table(PARTNERKIT_FILE_RULES);
  Check(table.good(), "tests/data/file_rules.txt is there");
  for (std::string line; std::getline(table, line);) {
    std::istringstream words(line.substr(0, line.find('#')));
    std::string name;
    if (words >> name && "PartnerKit." + name == progId) return {std::istream_iterator<std::string>(words), {}};
  }
  return {};
}

// The program's own.
extern const std::string_view kDefaultClass;

struct Subject {
  std::string progId;
  ClassRules rules;
  bool Is(std::string_view word) const { return rules.contains(word); }
  std::string map;
  std::string orders;
  EDIDoc document;
  std::vector<std::pair<const RecordType*, std::shared_ptr<void>>> records;  // all others
};

inline std::string_view Sample(const std::string& path) {
  const auto files = cli::DemoFiles();
  const auto found = std::ranges::find(files, path, &cli::DemoFile::path);
  return found == files.end() ? std::string_view() : found->text;
}

inline void TakeRecords(const nlohmann::json& data, Subject& subject) {
  for (const auto& [kind, records] : data.items()) {
    const RecordType* const type = FindRecordType(kind);
    if (type == nullptr) continue;
    for (const nlohmann::json& given : records) {
      const std::shared_ptr<void> record = cli::NewRecord(*type);
      for (const auto& [name, value] : given.items()) {
        cli::SetMember(*cli::FindMember(*type, name), record.get(), value, ".");
      }
      if (type == &EDIDoc::kType) {
        subject.document = *static_cast<const EDIDoc*>(record.get());
      } else {
        subject.records.emplace_back(type, record);
      }
    }
  }
}

inline Subject ReadSubject() {
  Subject subject;
  const char* const named = std::getenv("PARTNERKIT_FUZZ_CLASS");
  subject.progId = named == nullptr ? kDefaultClass : named;
  subject.rules = ReadRules(subject.progId);
  for (const cli::DemoFile& file : cli::DemoFiles()) {
    if (!file.path.ends_with(".json")) continue;
    const auto data = nlohmann::json::parse(file.text);
    if (data["EDIDoc"][0]["ProgId"] == subject.progId) TakeRecords(data, subject);
  }
  Check(!subject.records.empty(), "there is a sample of the class");
  const std::string mapFile(Str(subject.document.MapFile));
  if (mapFile.empty()) return subject;
  const std::string name = mapFile.substr(0, mapFile.find('.'));
  subject.map = Sample("maps/" + mapFile);
  subject.orders = Sample("inbox/" + name + ".csv");
  if (subject.orders.empty()) subject.orders = Sample("inbox/orders.csv");
  return subject;
}

inline const Subject& TheSubject() {
  static const Subject kSubject = ReadSubject();
  return kSubject;
}

}  // namespace partnerkit::fuzz
