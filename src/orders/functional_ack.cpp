#include "orders/functional_ack.h"

#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "files/file_name.h"
#include "values/format.h"

namespace partnerkit::orders {

namespace {

// A file that gets a whole acknowledgement or none, even from a program that dies over it: what it will hold is written
// beside it and takes its place. A mailbox never sees an empty one.
class AckFile {
 public:
  AckFile(Files& files, std::string path) : files_(files), path_(std::move(path)) {
    if (files_.Resolved(path_) != path_) {
      throw RunTimeError(run_time::kPathAccess, "The name is a link of somebody else's: " + path_);
    }
    if (files_.Exists(path_)) earlier_ = files_.OpenInput(path_, Share::kExclusive);
    draft_ = files_.OpenDraft(path_, draftName_);
  }
  ~AckFile() {
    if (whole_) return;
    try {
      files_.Delete(draftName_);
    } catch (const RunTimeError&) {
      // It stays until the next acknowledgement of that name.
    }
  }
  AckFile(const AckFile&) = delete;
  AckFile& operator=(const AckFile&) = delete;

  void Write(std::string_view text) {
    draft_->Truncate(0);
    if (earlier_) CopyEarlier();
    draft_->Write(text);
    draft_->Sync();
    if (earlier_) {
      files_.Rename(draftName_, path_);
    } else if (!files_.RenameNew(draftName_, path_)) {
      throw RunTimeError(run_time::kFileExists, "Another program has just made the file: " + path_);
    }
    whole_ = true;
    draft_->Close();
  }

 private:
  void CopyEarlier() {
    std::vector<char> block(64 * 1024);
    std::uint64_t offset = 0;
    for (std::size_t read; (read = earlier_->ReadAt(offset, block)) > 0; offset += read) {
      draft_->Write({block.data(), read});
    }
    draft_->TakeRights(earlier_->Rights(), Take::kAll);
  }

  Files& files_;
  std::string path_, draftName_;
  std::unique_ptr<InputFile> earlier_;  // what it holds already
  std::unique_ptr<OutputFile> draft_;
  bool whole_ = false;
};

std::string AckName(const TranslatorBase& translator, std::string_view prefix, std::string_view reference) {
  return std::string(Str(translator.Document().AckFolder))
      .append(prefix)
      .append(FileNamePart(reference))
      .append("_")
      .append(Format(translator.Now(), "yymmddhhmm"))
      .append(".TXT");
}

// The partner's next number. Without one the procedure is left even when the user says to go on: nobody could tell the
// interchange from another.
std::int32_t Draw(TranslatorBase& translator, Counter counter) {
  std::int32_t number = 0;
  const std::string& partnerId = translator.TradingPartner().PartnerId;
  if (!translator.Try([&] { number = translator.Host().NextNumber(partnerId, counter); })) {
    throw ErrorHandling::LeaveProcedure{};
  }
  return number;
}

// What acknowledgements of every syntax do alike; `compose(interchangeNo)` gives the text of one.
template <class F>
bool WriteAck(TranslatorBase& translator, std::string_view prefix, std::string_view reference, F compose) {
  return translator.Procedure("Function ProcessFA", false, [&](bool& done) {
    if (Str(translator.Document().AckFolder).empty()) {
      done = true;
      return;
    }
    const std::string name = AckName(translator, prefix, reference);
    std::optional<AckFile> file;
    {
      const HandlerOff off(translator.Errors());
      if (!translator.Try([&] { file.emplace(translator.FileSystem(), name); })) {
        translator.WriteLog(translator.ErrorNumber(), "Open FA File", "Cannot open FA file " + name);
        return;
      }
    }
    const std::string text = compose(Draw(translator, Counter::kInterchangeNo));
    done = translator.Try([&] { file->Write(text); });
  });
}

}  // namespace

bool WriteFunctionalAck(TranslatorBase& translator, const X12Envelope& row, std::string_view acknowledged,
                        std::string_view prefix, std::string_view reference, int transactions) {
  return WriteAck(translator, prefix, reference, [&](std::int32_t interchangeNo) {
    const EDIDoc& document = translator.Document();
    const std::string_view end = SegmentEnd(row, translator.TradingPartner());
    std::string text;
    const auto add = [&](std::string_view segment) { text.append(segment).append(end); };
    add(Isa(row, document, translator.WallClock(), interchangeNo));
    const std::int32_t groupNo = Draw(translator, Counter::kGroupNo);
    add(Gs(row, document, translator.WallClock(), groupNo));
    add(St(row, 1));
    add(std::string("AK1*").append(acknowledged).append("*").append(reference));
    const std::string count = "*" + std::to_string(transactions);
    add("AK9*A" + count + count + count);
    add(Se(4, 1));
    add(Ge(1, groupNo));
    add(Iea(interchangeNo));
    return text;
  });
}

}  // namespace partnerkit::orders
