// The input is an X12 order file. No order may be stored twice; what is not dealt with must still be there after a run,
// to be listed again as it was; and what is another's must not change.
#include <numeric>
#include <set>
#include <utility>

#include "import_run.h"
#include "x12_segments.h"

const std::string_view partnerkit::fuzz::kDefaultClass = "PartnerKit.clsMGB850ansix12";

namespace partnerkit::fuzz {

class X12Run : private ImportRun {
 public:
  X12Run(std::string_view orders, bool checks, bool answers, bool backwards)
      : ImportRun("inbox/orders.x12", orders, checks, answers), backwards_(backwards) {}

  // A whole run over every row. False when there are no rows.
  bool ProcessAll() {
    const std::string before = Content();
    RowTable rows;
    const std::unique_ptr<Translator> importer = Listed(rows);
    if (!importer) return false;
    std::vector<Outcome> outcomes(rows.Rows());
    for (std::size_t step = 0; step < rows.Rows(); ++step) {
      const std::size_t row = backwards_ ? rows.Rows() - 1 - step : step;
      ErrorList log;
      const std::int32_t id = importer->Process(static_cast<std::int32_t>(row), log);
      outcomes[row] = Follow(std::get<std::string>(rows.At(row, 0)), id, Told(log));
    }
    Check(importer->Term(), "Term gives True");
    CheckStore();
    CheckFile(before, rows, outcomes);
    return true;
  }

  void DeleteRow(bool last) {
    const std::string before = Content();
    RowTable rows;
    const std::unique_ptr<Translator> importer = Listed(rows);
    if (!importer) return;
    const std::size_t row = last ? rows.Rows() - 1 : 0;
    ErrorList log;
    Check(importer->Delete(static_cast<std::int32_t>(row), log), "Delete gives True");
    std::vector<Outcome> outcomes(rows.Rows(), Outcome::kStays);
    outcomes[row] = Outcome::kLeaves;
    importer->Cancel();
    CheckFile(before, rows, outcomes);
  }

 private:
  static constexpr const char* kCopy = "maps/archive/orders.x12";

  enum class Outcome { kStays, kLeaves, kEither };

  std::string Content() { return files_.Exists(path_) ? files_.Bytes(path_) : std::string(); }

  std::unique_ptr<Translator> Listed(RowTable& rows) {
    const std::string before = Content();
    auto importer = before.empty() ? nullptr : Loaded(rows);
    Check(before.empty() || !files_.Exists(kCopy) || files_.Bytes(kCopy) == before,
          "the archive has the file as it came");
    return importer;
  }

  // What has to become of the row in the file.
  Outcome Follow(const std::string& number, std::int32_t id, const std::vector<LogRecord>& told) {
    if (told.empty()) {
      Check(id == 0, "what was posted is told of");
      return Outcome::kStays;
    }
    const LogRecord& last = told.back();
    const std::string_view message = Str(last.Message);
    const bool faulty = message == "PO " + number + " import completed with errors. Data maintenance or POA required.";
    if (faulty) faulty_.insert(number);
    if (faulty || message == "PO " + number + " import completed.") {
      Check(faulty == (id == 0), "a posted order has an id");
      return Outcome::kLeaves;
    }
    const bool turnedAway =
        Says(last, kRejected, "Cannot process") || Says(last, kRejected, "... Cannot process Purchase Order Cancel") ||
        Says(last, kWarned, "... Cannot process Purchase Order ") || Says(last, kWarned, "... Warning Purchase Order ");
    return turnedAway ? Outcome::kEither : Outcome::kStays;
  }

  void CheckStore() {
    std::set<std::string> found;
    for (const auto& order : Select(host_.Records(), kEveryRecord, Order())) {
      Check(found.insert(order->PONo).second, "an order is stored once");
      Check(order->Status == 0 || faulty_.contains(order->PONo), "a stored order is complete, or told to have errors");
    }
  }

  void CheckFile(const std::string& before, const RowTable& rows, const std::vector<Outcome>& outcomes) {
    CheckTidy();
    const X12Segments old(before);
    CheckForeign(old.Foreign(before));
    const std::string after = Content();
    if (!old.IsOrderly()) return;
    CheckNothingNew(old, X12Segments(after));
    RowTable left;
    if (const auto importer = Listed(left)) importer->Cancel();
    CheckTidy();
    CheckRows(rows, outcomes, left);
    CheckKept(old.Transactions(), X12Segments(after).Transactions(), left);
  }

  void CheckForeign(const std::vector<std::string_view>& foreign) {
    const std::string after = Content();
    std::size_t at = 0;
    for (const std::string_view range : foreign) {
      at = after.find(range, at);
      Check(at != std::string::npos, "an interchange of others stays as it is");
      at += range.size();
    }
  }

  static void CheckNothingNew(const X12Segments& old, const X12Segments& left) {
    auto from = old.All().begin();
    for (const PlainSegment& segment : left.All()) {
      const std::string text = X12Segments::WithoutMark(segment.text);
      from = std::find_if(from, old.All().end(),
                          [&](const PlainSegment& each) { return X12Segments::WithoutMark(each.text) == text; });
      Check(from != old.All().end(), "the file holds no segment that it didn't hold before");
      ++from;
    }
  }

  // The rows left are those of before, in their order, without some that may leave. `reached` has how many of the rows
  // left may have been met so far.
  static void CheckRows(const RowTable& rows, const std::vector<Outcome>& outcomes, const RowTable& left) {
    std::set<std::size_t> reached = {0};
    for (std::size_t row = 0; row < rows.Rows(); ++row) {
      std::set<std::size_t> next;
      for (const std::size_t met : reached) {
        if (outcomes[row] != Outcome::kStays) next.insert(met);
        if (outcomes[row] != Outcome::kLeaves && met < left.Rows() && SameRow(rows, row, left, met)) {
          next.insert(met + 1);
        }
      }
      reached = std::move(next);
    }
    Check(reached.contains(left.Rows()), "the rows not dealt with, and no others, are listed again");
  }

  static bool SameRow(const RowTable& rows, std::size_t row, const RowTable& left, std::size_t other) {
    for (std::size_t column = 0; column < rows.Columns(); ++column) {
      if (!(rows.At(row, column) == left.At(other, column))) return false;
    }
    return true;
  }

  using Transactions = std::map<std::string, std::vector<std::string>>;
  static void CheckKept(const Transactions& old, const Transactions& left, const RowTable& rows) {
    for (std::size_t row = 0; row < rows.Rows(); ++row) {
      const auto was = old.find(std::get<std::string>(rows.At(row, 2)));
      const auto is = left.find(std::get<std::string>(rows.At(row, 2)));
      if (was == old.end() || is == left.end()) continue;
      Check(was->second == is->second, "a transaction that stays is whole");
    }
  }

  void CheckTidy() {
    Check(!files_.AnyHeld(), "no file stays held");
    Check(files_.AllNames([](const std::string& name) {
      return name == "inbox/orders.x12" || name == "inbox/orders.tmp" || name.starts_with(kCopy) ||
             (name.starts_with("ack/FA_PO_") && name.ends_with("_0603081015.TXT"));
    }),
          "no file is left over");
  }

  const bool backwards_;
  std::set<std::string> faulty_;  // numbers of orders told to have errors
};

}  // namespace partnerkit::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace partnerkit::fuzz;
  const std::string orders(reinterpret_cast<const char*>(data), size);
  // One way of three for each input, told by its bytes: all three would take thrice the time of a mutation.
  const unsigned sum = std::accumulate(data, data + size, 0U), way = sum % 3;
  X12Run run(orders, way != 1, sum / 3 % 2 == 1, sum / 6 % 2 == 1);
  if (way == 2) {
    run.DeleteRow(true);
    run.DeleteRow(false);
  } else if (run.ProcessAll()) {
    // What stays is listed again, and may be dealt with by now.
    run.ProcessAll();
  }
  return 0;
}
