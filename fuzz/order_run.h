// A CSV order import under fuzzing: whole runs over an order file, and what must hold of them for every input.
#pragma once

#include <algorithm>
#include <map>
#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "import_run.h"
#include "order_lines.h"

namespace partnerkit::fuzz {

inline constexpr const char* kOrders = "inbox/orders.csv";
inline constexpr const char* kMap = "maps/orders.map";

class OrderRun : private ImportRun {
 public:
  OrderRun(std::string_view map, std::string_view orders, bool checks, bool answers)
      : ImportRun(kOrders, orders, checks, answers), lines_(map) {
    files_.Put(kMap, std::string(map));
    files_.Put(kBackup, "an order of last week\r\n");
  }

  // A whole run over every row. False when there are no rows.
  bool ProcessAll() {
    const std::string before = files_.Bytes(kOrders);
    const std::string backup = files_.Bytes(kBackup);
    RowTable rows;
    const std::unique_ptr<Translator> importer = Loaded(rows);
    if (!importer) return CheckTidy(), false;
    Settled settled;
    for (std::size_t row = 0; row < rows.Rows(); ++row) {
      ErrorList log;
      const std::int32_t id = importer->Process(static_cast<std::int32_t>(row), log);
      const std::string number = std::get<std::string>(rows.At(row, 0));
      Follow(number, lines_.Key(number, std::get<std::string>(rows.At(row, 2))), id, Told(log), settled);
    }
    Check(importer->Term(), "Term gives True");
    CheckFile(before, backup, settled);
    CheckStore();
    CheckTidy();
    return true;
  }

  // Takes one row's transaction out. What goes is one run of the company's lines, with nobody else's among them.
  void DeleteRow(bool last) {
    const std::string before = files_.Bytes(kOrders);
    RowTable rows;
    const std::unique_ptr<Translator> importer = Loaded(rows);
    if (!importer) return;
    ErrorList log;
    Check(importer->Delete(last ? static_cast<std::int32_t>(rows.Rows()) - 1 : 0, log), "Delete gives True");
    importer->Cancel();
    const std::string& after = files_.Bytes(kOrders);
    // Envelope segments stay, some of them as the whole transaction.
    if (!TheSubject().Is("deletes-envelopes") && HasEnvelope(before)) return;
    const std::vector<std::string_view> old = LinesOf(before), left = LinesOf(after);
    Check(old.size() > left.size(), "Delete takes something out");
    const std::vector<std::string_view> oldOwn = Own(old, true), own = Own(left, true);
    const auto front = std::ranges::mismatch(own, oldOwn).in1 - own.begin();
    const auto back = std::mismatch(own.rbegin(), own.rend(), oldOwn.rbegin(), oldOwn.rend()).first - own.rbegin();
    Check(static_cast<std::size_t>(front + back) >= own.size(), "Delete takes one run of own lines out");
    Check(Own(old, false) == Own(left, false), "Delete keeps every line of others");
    CheckTidy();
  }

 private:
  // The keys of the orders dealt with in a run: of those posted, and of all.
  struct Settled {
    std::set<std::string> posted, done;
  };
  struct Stored {
    std::int32_t id;
    std::string key;
    bool faulty;
  };

  // The lines that are the company's or nobody's, or all others.
  std::vector<std::string_view> Own(std::vector<std::string_view> lines, bool own) const {
    std::erase_if(lines, [&](std::string_view line) { return (lines_.IsOfOthers(line) && !HasEnvelope(line)) == own; });
    return lines;
  }

  static bool AnyWarns(const std::vector<LogRecord>& told, std::initializer_list<std::string_view> openings) {
    return std::any_of(told.begin(), told.end(), [&](const LogRecord& log) {
      return std::any_of(openings.begin(), openings.end(),
                         [&](std::string_view words) { return Says(log, kWarned, words); });
    });
  }

  // Whether an order with this last message leaves the file unposted. A failed check is a rejection too, but begins
  // with "...".
  static bool TurnsAway(const LogRecord& last) {
    const Subject& subject = TheSubject();
    if (Says(last, kRejected, "Cannot process") || Says(last, kRejected, "... Warning Purchase Order Change ") ||
        Says(last, kWarned, "... Warning Purchase Order Response. ")) {
      return !subject.Is("keeps-turned-away");
    }
    return Says(last, kWarned, "... Warning Purchase Order CANCEL Request ") ||
           Says(last, kWarned, "... Warning Purchase Order Change Request Cancel Balance Of ") ||
           (Says(last, kWarned, "... Warning Purchase Order Cancel Request ") && !subject.Is("cancels-in-file"));
  }

  static bool TakesBack(const LogRecord& last) {
    const std::string_view message = Str(last.Message);
    return message.ends_with(". Order cancelled.") ||
           message.starts_with("Cannot process CANCELLATION. Original PO ") ||
           message.starts_with("... Warning Purchase Order Change Request Cancel Balance Of ");
  }

  // What became of one order.
  void Follow(const std::string& number, const std::string& key, std::int32_t id, const std::vector<LogRecord>& told,
              Settled& settled) {
    const bool faulty = id == 0 && !told.empty() && told.back().ErrorNumber == 0 &&
                        Str(told.back().Message).find(" import completed with errors.") != std::string_view::npos;
    const bool posted = id > 0 || faulty;
    if (const auto stored = stored_.find(number); stored != stored_.end()) {
      const bool replaced = AnyWarns(told, {"... Warning Duplicate PO ", "... Warning Purchase Order Change ",
                                            "... Warning incomplete/scrapped PO "});
      // A stored order goes when the new one is posted, or says that it is taken back.
      const bool goes = replaced && (posted || TakesBack(told.back()));
      // The order is stored no longer: its lines stay, unless the new one is posted.
      if (goes) {
        settled.posted.erase(stored->second.key);
        settled.done.erase(stored->second.key);
      }
      if (goes ||
          AnyWarns(told, {"... Warning Purchase Order Cancel Request ", "... Warning Purchase Order CANCEL Request ",
                          "... Warning Purchase Order Response. "})) {
        stored_.erase(stored);
      }
    }
    if (posted) {
      stored_[number] = {faulty ? IdOf(number) : id, key, faulty};
      settled.posted.insert(key);
    }
    if (posted || (!told.empty() && TurnsAway(told.back()))) settled.done.insert(key);
  }

  // All transactions of one number leave together: one that failed goes with another of its number that was dealt with.
  void CheckFile(const std::string& before, const std::string& backup, const Settled& settled) {
    const Subject& subject = TheSubject();
    std::string_view text = before;
    const std::string_view mark = text.starts_with("\xEF\xBB\xBF") ? text.substr(0, 3) : std::string_view();
    text.remove_prefix(mark.size());
    const std::vector<std::string_view> lines = LinesOf(text);
    if (subject.Is("by-controls") && lines_.AnyAmbiguous(lines)) return;
    std::string kept, moved = backup;
    for (const std::string_view line : lines) {
      if (subject.Is("drops-blank-lines") && IsBlank(line)) continue;
      const std::string key = lines_.Key(line);
      const bool stays = !lines_.IsOurs(line);
      if (settled.posted.contains(key) && !stays) {
        moved += line;
        if (!line.ends_with('\n') && !line.ends_with('\r')) moved += "\r\n";
      } else if (!settled.done.contains(key) || stays) {
        kept += line;
      }
    }
    if (!kept.empty()) kept.insert(0, mark);
    Check(files_.Bytes(kOrders) == kept, "the file keeps every line not dealt with, and no other");
    Check(files_.Bytes(kBackup) == moved, "the backup holds every posted line, and no other");
  }

  void CheckStore() {
    std::set<std::string> found;
    for (const auto& order : Select(host_.Records(), kEveryRecord, Order())) {
      Check(found.insert(order->PONo).second, "an order is stored once");
      const auto wanted = stored_.find(order->PONo);
      Check(wanted != stored_.end() && wanted->second.id == order->OrderId, "the store holds what was posted only");
      Check(order->Status == (wanted->second.faulty ? 9 : 0), "a stored order is complete, or told to have errors");
      OrderLocnLine probe;
      probe.OrderId = order->OrderId;
      Check(TheSubject().Is("lines-may-not-count") ||
                partnerkit::Count(host_.Records(), OrderLocnLine::kByOrder, probe) > 0,
            "a stored order has lines");
    }
    Check(found.size() == stored_.size(), "the store holds all that was posted");
  }

  void CheckTidy() {
    Check(!files_.AnyHeld(), "no file stays held");
    Check(files_.Count() == 3, "no file is left over or lost");
  }

  OrderLines lines_;
  std::map<std::string, Stored> stored_;  // by number
};

}  // namespace partnerkit::fuzz
