// Holds docs/data.md, which users write their data files by, against the tables that a load goes by.
#include <gtest/gtest.h>

#include <fstream>
#include <map>
#include <string>
#include <vector>

#include "partnerkit/records.h"
#include "values/delimited.h"

namespace partnerkit {
namespace {

// Rows as "PONo|text||`""`", by kind.
using Rows = std::map<std::string, std::vector<std::string>>;

// "| `PONo` | text | | `""` | Purchase order number. |" under its "### Kind" heading, without the meaning.
Rows Told() {
  std::ifstream file(PARTNERKIT_SOURCE_DIR "/docs/data.md");
  Rows told;
  std::string kind;
  for (std::string line; std::getline(file, line);) {
    if (line.starts_with("## ")) kind.clear();
    if (line.starts_with("### ")) told[kind = line.substr(4)];
    if (kind.empty() || !line.starts_with("| `")) continue;
    EXPECT_TRUE(line.ends_with(". |")) << line;
    std::string row;
    for (std::size_t from = 1, cell = 0; cell < 4; ++cell) {
      const std::size_t bar = line.find('|', from);
      row.append(cell == 0 ? "" : "|").append(TrimBlanks(std::string_view(line).substr(from, bar - from)));
      from = bar + 1;
    }
    told[kind].push_back(row);
  }
  return told;
}

std::string Key(const Member& member) {
  const std::string owner(member.owner);
  switch (member.role) {
    case MemberRole::kId:
      return "id|given";
    case MemberRole::kKey:
      return "key|required";
    case MemberRole::kOwner:
      return "owner " + owner + "|required";
    case MemberRole::kPlain:
      break;
  }
  static const std::map<MemberKind, std::string> defaults = {
      {MemberKind::kString, "`\"\"`"}, {MemberKind::kText, "null"},  {MemberKind::kInt, "0"},
      {MemberKind::kLong, "0"},        {MemberKind::kBool, "false"}, {MemberKind::kDouble, "0"},
      {MemberKind::kNumber, "null"},   {MemberKind::kDate, "null"}};
  return (owner.empty() ? "" : "names " + owner) + "|" + defaults.at(member.kind);
}

TEST(DataDocument, TellsEveryMemberAsTheTablesHaveIt) {
  const std::map<MemberKind, std::string> types = {
      {MemberKind::kString, "text"},           {MemberKind::kText, "text or null"},  {MemberKind::kInt, "whole number"},
      {MemberKind::kLong, "whole number"},     {MemberKind::kBool, "true or false"}, {MemberKind::kDouble, "number"},
      {MemberKind::kNumber, "number or null"}, {MemberKind::kDate, "date or null"}};
  Rows known;
  for (const RecordType* type : AllRecordTypes()) {
    for (const Member& member : type->members) {
      known[std::string(type->kind)].push_back("`" + std::string(member.name) + "`|" + types.at(member.kind) + "|" +
                                               Key(member));
    }
  }
  const Rows told = Told();
  EXPECT_EQ(told.size(), known.size());
  for (const auto& [kind, rows] : told) EXPECT_EQ(rows, known[kind]) << kind;
}

}  // namespace
}  // namespace partnerkit
