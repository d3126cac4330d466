#include "orders/functional_ack.h"

#include <optional>
#include <string>

#include "frame/file_name.h"
#include "frame/format.h"

namespace partnerkit::orders {

namespace {

// A file that gets a whole acknowledgement or none, even from a program that dies over it: what it will hold is written
// beside it and takes its place. One that then holds nothing goes: a mailbox would send it.
class AckFile {
 public:
  AckFile(Files& files, std::string path)
      : files_(files),
        path_(std::move(path)),
        held_(files.OpenOutput(path_, OutputMode::kAppend)),
        holdsOthers_(held_->Length() > 0) {}
  ~AckFile() {
    if (whole_) return;
    Discard(draft_);
    if (!holdsOthers_) Discard(path_);
  }
  AckFile(const AckFile&) = delete;
  AckFile& operator=(const AckFile&) = delete;

  void Write(std::string_view text) {
    if (holdsOthers_) files_.Copy(path_, draft_);
    const auto draft = files_.OpenOutput(draft_, holdsOthers_ ? OutputMode::kAppend : OutputMode::kReplace);
    draft->Write(text);
    draft->Sync();
    draft->Close();
    files_.Rename(draft_, path_);
    whole_ = true;
  }

 private:
  void Discard(const std::string& path) {
    try {
      files_.Delete(path);
    } catch (const RunTimeError&) {
      // It stays; a later acknowledgement of that name takes its place.
    }
  }

  Files& files_;
  std::string path_;
  std::string draft_ = path_ + ".tmp";
  std::unique_ptr<OutputFile> held_;
  bool holdsOthers_;
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
