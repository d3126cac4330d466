// A workspace with the sample supplier in it.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "support/program.h"
#include "support/trading_fixture.h"

namespace partnerkit::testing {

inline std::string Sample(const std::string& name, const std::string& of = "mgb850") {
  std::ostringstream bytes;
  bytes << std::ifstream(PARTNERKIT_SOURCE_DIR "/samples/" + of + "/" + name, std::ios::binary).rdbuf();
  return bytes.str();
}

class Supplier : public ::testing::Test {
 protected:
  void SetUp() override {
    EXPECT_EQ(Run({"new", "."}).status, 0);
    folder.Write("records.json", Sample("records.json"));
    folder.Write("maps/mgb850.map", Sample("mgb850.map"));
    folder.Write("inbox/orders.csv", Sample("orders.csv"));
    EXPECT_EQ(Run({"data", "load", "records.json"}).status, 0);
  }

  Ran Run(const std::vector<std::string>& arguments) { return RunPartnerkit(folder / "", arguments); }
  // The JSON document of the command, which has to be the whole output.
  nlohmann::json Json(std::vector<std::string> arguments, int status = 0) {
    arguments.insert(arguments.begin(), "--json");
    const Ran ran = Run(arguments);
    EXPECT_EQ(ran.status, status) << ran.err;
    return nlohmann::json::parse(ran.out, nullptr, false);
  }
  // Loads records given as JSON text.
  Ran Load(const std::string& json) {
    folder.Write("more.json", json);
    return Run({"data", "load", "more.json"});
  }

  // What is loaded has to pass.
  void Put(const std::string& json) { EXPECT_EQ(Load(json).status, 0); }
  // Refused: status 2, one line on standard error that holds `says`, no output, the store and the file as they were.
  void ExpectRefused(const std::vector<std::string>& arguments, const std::string& says) {
    SCOPED_TRACE(::testing::PrintToString(arguments) + " " + says);
    const std::string before = Run({"data", "dump"}).out;
    const Ran ran = Run(arguments);
    EXPECT_EQ(ran.status, 2);
    EXPECT_EQ(ran.out, "");
    EXPECT_THAT(ran.err, ::testing::AllOf(::testing::StartsWith("partnerkit: "), ::testing::HasSubstr(says)));
    EXPECT_EQ(ran.err.find('\n'), ran.err.size() - 1) << ran.err;
    EXPECT_EQ(Run({"data", "dump"}).out, before);
    EXPECT_EQ(folder.Read("inbox/orders.csv"), Sample("orders.csv"));
  }

  TempFolder folder;
};

}  // namespace partnerkit::testing
