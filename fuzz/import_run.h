// An order importer under fuzzing: a supplier in memory, and what every run of an importer over an order file does.
#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "memory_files.h"
#include "partnerkit/catalogue.h"
#include "partnerkit/memory_host.h"
#include "partnerkit/platform.h"
#include "platform/clocks.h"
#include "subject.h"

namespace partnerkit::fuzz {

class ImportRun {
 protected:
  // `checks`: products, prices and locations are checked, and a fault leaves its procedure; without, it is passed over.
  // `answers`: orders are acknowledged. `path` is the order file's.
  ImportRun(std::string path, std::string_view orders, bool checks, bool answers) : path_(std::move(path)) {
    files_.Put(path_, std::string(orders));
    ports_ = platform::DefaultPorts();
    ports_.files = &files_;
    ports_.clock = &clock_;
    ports_.errorOutlets.dialog = [checks](const ErrorReport&, const std::string&) {
      return checks ? Button::kAbort : Button::kIgnore;
    };
    Stock(checks, answers);
  }
  ~ImportRun() = default;

  static constexpr const char* kBackup = "backup/po.csv";
  static constexpr std::int32_t kWarned = static_cast<std::int32_t>(0x80040001);
  static constexpr std::int32_t kRejected = static_cast<std::int32_t>(0x80040002);

  // An importer that has listed the file; nothing when there was nothing to list, and the file is then as it was.
  std::unique_ptr<Translator> Loaded(RowTable& rows) {
    const std::string before = files_.Bytes(path_);
    std::unique_ptr<Translator> importer = CreateTranslator(TheSubject().progId, ports_);
    Check(importer != nullptr, "the class is known");
    ColumnTable columns;
    Check(importer->Init(host_, 1, columns), "Init gives True");
    const std::int32_t count = importer->Load(path_, rows);
    if (count > 0) {
      Check(rows.Rows() == static_cast<std::size_t>(count), "Load gives the number of rows");
      return importer;
    }
    importer->Cancel();
    Check(files_.Bytes(path_) == before, "a file without rows stays as it was");
    Check(!files_.AnyHeld(), "no file stays held");
    return nullptr;
  }

  std::vector<LogRecord> Told(const ErrorList& list) {
    std::vector<LogRecord> told;
    for (const std::int32_t id : list.value_or(std::vector<std::int32_t>())) {
      told.emplace_back().LogId = id;
      Check(Load(host_.Records(), told.back()), "the log has what the error list names");
    }
    return told;
  }

  static bool Says(const LogRecord& log, std::int32_t kind, std::string_view words) {
    return log.ErrorNumber == kind && Str(log.Message).starts_with(words);
  }
  std::int32_t IdOf(const std::string& number) {
    std::int32_t id = 0;
    for (const auto& order : Select(host_.Records(), kEveryRecord, Order())) {
      if (order->PONo == number) id = order->OrderId;
    }
    return id;
  }

  MemoryFiles files_;
  MemoryHost host_;
  platform::FixedClock clock_{*DateTime::FromYmdHms(2006, 3, 8, 10, 15, 0)};
  Ports ports_;
  const std::string path_;

 private:
  void Stock(bool checks, bool answers) {
    for (const auto& [type, record] : TheSubject().records) {
      if (type == &Vendor::kType) static_cast<Vendor*>(record.get())->POBackupFile = kBackup;
      Check(host_.Records().Add(*type, record.get()), "the supplier's records are stored");
    }
    EDIDoc document = TheSubject().document;
    document.EDIDocId = 1;
    document.MapFolder = "maps/";
    document.MapFile = "orders.map";
    document.AckFolder = "ack/";
    document.ValidateProduct = document.ValidateCost = document.ValidateRetail = checks;
    Check(Add(host_.Records(), document), "the document is stored");
    if (!answers) return;
    document.EDIDocId = 2;
    document.DocumentCode = "855";
    Check(Add(host_.Records(), document), "the acknowledgement is stored");
  }
};

}  // namespace partnerkit::fuzz
