// Holds docs/data.md, which users write their data files by, against the tables that a load goes by.
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <map>
#include <string>
#include <vector>

#include "partnerkit/records.h"

namespace partnerkit {
namespace {

struct Row {
  std::string type;
  std::string key;
  std::string byDefault;
  std::string meaning;
};

using Rows = std::vector<std::pair<std::string, Row>>;

std::string Trim(const std::string& text) {
  const auto from = text.find_first_not_of(' ');
  return from == std::string::npos ? "" : text.substr(from, text.find_last_not_of(' ') - from + 1);
}

// "| `PONo` | text | | `""` | Purchase order number. |" as its five cells; none for any other line.
std::vector<std::string> MemberCells(const std::string& line) {
  std::vector<std::string> cells;
  if (!line.starts_with("| `")) return cells;
  for (std::size_t from = 1, bar; (bar = line.find('|', from)) != std::string::npos; from = bar + 1) {
    cells.push_back(Trim(line.substr(from, bar - from)));
  }
  return cells;
}

// The member rows under each "### Kind" heading, in the order of the document.
std::vector<std::pair<std::string, Rows>> ReadDocument() {
  std::ifstream file(PARTNERKIT_SOURCE_DIR "/docs/data.md");
  std::vector<std::pair<std::string, Rows>> kinds;
  bool inKind = false;
  for (std::string line; std::getline(file, line);) {
    if (line.starts_with("## ")) inKind = false;
    if (line.starts_with("### ")) {
      inKind = true;
      kinds.push_back({line.substr(4), {}});
    }
    const auto cells = MemberCells(line);
    if (!inKind || cells.size() != 5) continue;
    kinds.back().second.push_back({cells[0].substr(1, cells[0].size() - 2), {cells[1], cells[2], cells[3], cells[4]}});
  }
  return kinds;
}

std::string TypeText(const Member& member) {
  switch (member.kind) {
    case MemberKind::kString:
      return "text";
    case MemberKind::kText:
      return "text or null";
    case MemberKind::kInt:
    case MemberKind::kLong:
      return "whole number";
    case MemberKind::kBool:
      return "true or false";
    case MemberKind::kDouble:
      return "number";
    case MemberKind::kNumber:
      return "number or null";
    case MemberKind::kDate:
      return "date or null";
  }
  return "";
}

std::string KeyText(const Member& member) {
  switch (member.role) {
    case MemberRole::kId:
      return "id";
    case MemberRole::kKey:
      return "key";
    case MemberRole::kOwner:
      return "owner " + std::string(member.owner);
    case MemberRole::kPlain:
      return member.owner.empty() ? "" : "names " + std::string(member.owner);
  }
  return "";
}

std::string DefaultText(const Member& member) {
  if (member.role == MemberRole::kId) return "given";
  if (member.role != MemberRole::kPlain) return "required";
  switch (member.kind) {
    case MemberKind::kString:
      return "`\"\"`";
    case MemberKind::kBool:
      return "false";
    case MemberKind::kText:
    case MemberKind::kNumber:
    case MemberKind::kDate:
      return "null";
    default:
      return "0";
  }
}

TEST(DataDocument, TellsEveryKind) {
  std::vector<std::string> told;
  for (const auto& [kind, rows] : ReadDocument()) told.push_back(kind);
  std::vector<std::string> known;
  for (const RecordType* type : AllRecordTypes()) known.emplace_back(type->kind);
  std::ranges::sort(told);
  std::ranges::sort(known);
  EXPECT_EQ(told, known);
}

TEST(DataDocument, TellsEveryMemberAsTheTablesHaveIt) {
  for (const auto& [kind, rows] : ReadDocument()) {
    const RecordType* type = FindRecordType(kind);
    if (type == nullptr) continue;
    std::vector<std::string> told;
    for (const auto& [name, row] : rows) told.push_back(name);
    std::vector<std::string> known;
    for (const Member& member : type->members) known.emplace_back(member.name);
    ASSERT_EQ(told, known) << kind;

    for (std::size_t i = 0; i < rows.size(); ++i) {
      SCOPED_TRACE(kind + "." + rows[i].first);
      const Member& member = type->members[i];
      const Row& row = rows[i].second;
      EXPECT_EQ(row.type, TypeText(member));
      EXPECT_EQ(row.key, KeyText(member));
      EXPECT_EQ(row.byDefault, DefaultText(member));
      EXPECT_TRUE(row.meaning.ends_with(".")) << row.meaning;
    }
  }
}

}  // namespace
}  // namespace partnerkit
