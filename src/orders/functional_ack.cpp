#include "orders/functional_ack.h"

#include <optional>
#include <string>

#include "frame/file_name.h"
#include "frame/format.h"

namespace partnerkit::orders {

namespace {

// A file that gets a whole acknowledgement or none. One that then holds nothing goes: a mailbox would send it.
class AckFile {
 public:
  AckFile(Files& files, std::string path)
      : files_(files),
        path_(std::move(path)),
        file_(files.OpenOutput(path_, OutputMode::kAppend)),
        before_(file_->Length()) {}
  ~AckFile() {
    if (whole_ || before_ > 0) return;
    try {
      files_.Delete(path_);
    } catch (const RunTimeError&) {
      // It stays, empty; a later acknowledgement of that name goes into it.
    }
  }
  AckFile(const AckFile&) = delete;
  AckFile& operator=(const AckFile&) = delete;

  void Write(std::string_view text) {
    try {
      file_->Write(text);
      file_->Sync();
    } catch (const RunTimeError&) {
      file_->Truncate(before_);
      throw;
    }
    whole_ = true;
  }

 private:
  Files& files_;
  std::string path_;
  std::unique_ptr<OutputFile> file_;
  std::uint64_t before_;
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
