#include "cli/verbs/run_document.h"

#include <algorithm>
#include <charconv>
#include <limits>
#include <memory>
#include <optional>
#include <utility>

#include "cli/output/progress.h"
#include "cli/output/run_report.h"
#include "cli/output/table.h"
#include "cli/output/text.h"
#include "cli/workspace/watched_host.h"
#include "cli/workspace/workspace.h"
#include "frame/translator_base.h"
#include "partnerkit/catalogue.h"
#include "partnerkit/run_time_error.h"

namespace partnerkit::cli {

namespace {

std::int16_t DocumentId(const std::string& text) {
  std::int16_t id = 0;
  const char* end = text.data() + text.size();
  const auto read = std::from_chars(text.data(), end, id);
  if (read.ec != std::errc() || read.ptr != end)
    throw Refusal("document " + (text.empty() ? "\"\"" : text) + ": not the id of a document definition");
  return id;
}

// One run, from `Init` to the release of the class.
class Run {
 public:
  Run(const Command& command, const std::string& document, std::string file)
      : command_(command),
        workspace_(command),
        host_(workspace_.Host()),
        file_(std::move(file)),
        files_(*workspace_.ClassPorts().files, progress_) {
    documentId_ = DocumentId(document);
    EDIDoc definition;
    definition.EDIDocId = documentId_;
    if (!workspace_.Host().Records().Load(EDIDoc::kType, &definition)) {
      throw Refusal("document " + document + ": no such document definition in " + workspace_.Folder().string());
    }
    Ports ports = workspace_.ClassPorts();
    ports.files = &files_;
    ports.errorOutlets.dialog = [this, ask = ports.errorOutlets.dialog](const ErrorReport& report,
                                                                        const std::string& title) {
      progress_.Clear();
      return ask(report, title);
    };
    translator_ = CreateTranslator(definition.ProgId, ports);
    const PublicClass* const row = FindClass(definition.ProgId);
    report_.outbound = row != nullptr && row->direction == "out";
    if (!translator_) throw Refusal("document " + document + ": class \"" + definition.ProgId + "\" is not known");
  }

  // Says at once, before anything is done, that the store cannot be written to.
  void NeedWritableStore() { workspace_.Host().CheckWritable(); }

  // False when the class turned the file away; it is then abandoned, and its reason said.
  bool Open() {
    const bool bound = translator_->Init(host_, documentId_, report_.columns);
    files_.SetPurpose("listing");
    const std::int32_t rows = bound ? translator_->Load(file_, report_.rows) : 0;
    if (rows > 0) {
      // Ship notices hand out room for as many rows as packs wait.
      report_.rows.KeepRows(static_cast<std::size_t>(rows));
      files_.SetPurpose("");
      return true;
    }
    // What a failed call may have put there is no row.
    report_.rows = RowTable();
    translator_->Cancel();
    SayReason(bound);
    status_ = kTurnedAway;
    return false;
  }

  void CheckRows(const std::vector<std::int64_t>& rows) {
    const std::size_t count = report_.rows.Rows();
    for (const std::int64_t row : rows) {
      if (row >= 0 && std::cmp_less(row, count)) continue;
      translator_->Cancel();
      CommitHost();
      throw Refusal("--row " + std::to_string(row) + ": " + file_ + " has " +
                    (count == 1 ? "row 0 only" : "rows 0 to " + std::to_string(count - 1)));
    }
  }

  void Process(std::vector<std::int64_t> rows) {
    if (rows.empty()) {
      for (std::size_t row = 0; row < report_.rows.Rows(); ++row) rows.push_back(static_cast<std::int64_t>(row));
    }
    for (const std::int64_t row : rows) {
      if (StoreFailed()) break;
      ProcessRow(static_cast<std::int32_t>(row));
      progress_.Show("processing", report_.results.size(), rows.size());
    }
    report_.untried = rows.size() - report_.results.size();
    if (StoreFailed()) GiveUp();
  }

  // The lines of finished rows leave the file only once the store holds for good what became of them.
  void Settle() {
    if (!CommitHost()) return translator_->Cancel();
    files_.SetPurpose("settling");
    if (!translator_->Term()) status_ = kTurnedAway;
  }

  void Delete(std::int64_t row) {
    RowResult result = {row, false, {}};
    const bool deleted = translator_->Delete(static_cast<std::int32_t>(row), result.errorLog);
    result.result = deleted;
    result.outcome = deleted ? Outcome::kDeleted : Outcome::kTurnedAway;
    report_.results.push_back(std::move(result));
    if (deleted) return;
    translator_->Cancel();
    status_ = kTurnedAway;
  }

  void Cancel() { translator_->Cancel(); }

  int Finish(bool withResults) {
    translator_.reset();
    progress_.Clear();
    CommitHost();
    report_.withResults = withResults;
    report_.logIds = host_.LogIds();
    PrintRun(command_, report_, host_.Records());
    const bool stored = workspace_.CloseStore();
    return workspace_.HadFault() || !stored ? kTurnedAway : status_;
  }

 private:
  void ProcessRow(std::int32_t row) {
    RowResult result = {row, std::int32_t{0}, {}};
    const std::int32_t deletedBefore = host_.OrdersDeleted(), unsettledBefore = host_.OrdersFoundUnsettled();
    const std::int32_t id = translator_->Process(row, result.errorLog);
    result.result = id;
    // What a row leaves uncommitted must not be lost behind a later row that was settled by it.
    if (!StoreFailed() && workspace_.Host().HasChanges()) CommitHost();
    // A failing store may have taken the deletion back.
    const bool orderGone = host_.OrdersDeleted() > deletedBefore && !StoreFailed();
    result.outcome = OutcomeOf(id, orderGone, SaysOnlyWarnings(result.errorLog));
    if (id == 0 && host_.OrdersFoundUnsettled() > unsettledBefore) result.outcome = Outcome::kStoredEarlier;
    if (result.outcome == Outcome::kTurnedAway || result.outcome == Outcome::kStoredEarlier) status_ = kTurnedAway;
    report_.results.push_back(std::move(result));
  }

  bool StoreFailed() { return workspace_.Host().Faults() > 0; }

  // Behind a failing store nothing more is tried. What is done was durable before it counted as done, so it may be
  // settled whatever the store has lost.
  void GiveUp() {
    progress_.Clear();
    workspace_.Host().Recover();
    status_ = kTurnedAway;
    command_.Say(file_ + ": the store failed: " + workspace_.Host().LastFault() +
                 (report_.untried > 0 ? "; " + Counted(report_.untried, "row", "rows") + " not tried" : ""));
  }

  // A posting leaves information. Warnings alone tell of a stored order that was cancelled or changed in place, and its
  // id may be the result.
  static Outcome OutcomeOf(std::int32_t id, bool orderGone, bool onlyWarnings) {
    if (onlyWarnings && orderGone) return Outcome::kCancelled;
    if (id == 0) return Outcome::kTurnedAway;
    return onlyWarnings ? Outcome::kChanged : Outcome::kPosted;
  }

  bool SaysOnlyWarnings(const ErrorList& errorLog) {
    return errorLog && !errorLog->empty() && std::ranges::all_of(*errorLog, [&](std::int32_t id) {
             Log log;
             log.LogId = id;
             return host_.Records().Load(Log::kType, &log) && log.ErrorNumber == kWarning;
           });
  }

  // The newest log record tells why.
  void SayReason(bool bound) {
    progress_.Clear();
    Log log = translator_->Log();
    const bool told = log.LogId != 0 && workspace_.Host().Records().Load(Log::kType, &log);
    const std::string what = bound ? "nothing to list" : "the run cannot start";
    command_.Say(file_ + ": " + what + (told ? ": " + std::string(Str(log.Message)) : ""));
  }

  bool CommitHost() {
    try {
      workspace_.Host().Commit(0);
      return true;
    } catch (const RunTimeError& error) {
      progress_.Clear();
      command_.Say(error.Description());
      status_ = kTurnedAway;
      return false;
    }
  }

  const Command& command_;
  Workspace workspace_;
  WatchedHost host_;
  std::string file_;
  Progress progress_;
  ProgressFiles files_;
  std::int16_t documentId_ = 0;
  std::unique_ptr<Translator> translator_;
  RunReport report_;
  int status_ = kDone;
};

}  // namespace

int ShowRows(const Command& command, const std::string& document, const std::string& file) {
  Run run(command, document, file);
  if (run.Open()) run.Cancel();
  return run.Finish(false);
}

int ProcessRows(const Command& command, const std::string& document, const std::string& file,
                const std::vector<std::int64_t>& rows) {
  Run run(command, document, file);
  run.NeedWritableStore();
  if (run.Open()) {
    run.CheckRows(rows);
    run.Process(rows);
    run.Settle();
  }
  return run.Finish(true);
}

int DeleteRow(const Command& command, const std::string& document, const std::string& file, std::int64_t row) {
  Run run(command, document, file);
  run.NeedWritableStore();
  if (run.Open()) {
    run.CheckRows({row});
    run.Delete(row);
  }
  return run.Finish(true);
}

}  // namespace partnerkit::cli
