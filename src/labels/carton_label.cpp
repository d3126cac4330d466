#include "labels/carton_label.h"

#include "labels/other_languages.h"
#include "labels/scanning.h"
#include "render/label_packets.h"
#include "values/windows_1252.h"

namespace partnerkit::labels {

namespace {

constexpr std::string_view kLBXII = "LBXII", kZPL = "ZPL", kWinPCL = "WinPCL";
constexpr std::size_t kFreeLine = 30;

std::string FreeLine(std::string_view text) { return std::string(Cut(Windows1252(text), kFreeLine)); }

}  // namespace

CartonLabel::CartonLabel(const CartonClass& of, const Ports& ports)
    : HostedClass(of.name, ports),
      of_(of),
      job_(*this),
      drawing_(ports),
      batchSources_{BatchTemplate(of.layout, false), BatchTemplate(of.layout, true)},
      batches_{TextTemplate(batchSources_[0]), TextTemplate(batchSources_[1])} {
  values_.FormatNo = of.formatNo;
  values_.Qty = "1";
  values_.ComponentItem = values_.ComponentCount = "0";
}

void CartonLabel::SetUser1(std::string_view text) { values_.User1 = FreeLine(text); }
void CartonLabel::SetUser2(std::string_view text) { values_.User2 = FreeLine(text); }
void CartonLabel::SetStoreZoneDept(std::string_view text) { values_.StoreZoneDept = FreeLine(text); }
void CartonLabel::SetComponentStyle(std::string_view style) { values_.ComponentStyle = Windows1252(style); }

bool CartonLabel::Init(System& system, const std::string& aPrinter) {
  SetHost(system);
  return Printing("Function Init", [&](bool& ready) {
    PrintSCMatOpen = true;
    PrintSCMatClose = OLESubPackComponent = Prepack = ValidateClose = false;
    printer_ = aPrinter;
    const std::string language = printer_.empty() ? std::string() : Language();
    if (printer_.empty() || language == kWinPCL || language == kZPL) {
      ready = true;
    } else if (HasPort()) {
      Try([&] { Host().ComSend(PrintLBXII()); });
      ready = true;
    } else if (job_.Open(printer_, false)) {
      Try([&] { job_.Write(PrintLBXII()); });
      ready = job_.Close();
    }
  });
}

bool CartonLabel::PrintLabel(const Pack& aPack, std::optional<std::int16_t> Qty, bool ComDirect) {
  return Printing("Function PrintLabel", [&](bool& printed) {
    values_.Qty = std::to_string(Qty.value_or(1));
    // A port can't be drawn on.
    const bool drawn = Language() == kWinPCL;
    const bool inHand = ComDirect || (HasPort() && !drawn);
    if (!inHand && !job_.Open(printer_, drawn)) return;
    FillValues(aPack);
    printed = WriteLabel();
  });
}

bool CartonLabel::WriteLabel() {
  return Procedure("Function WriteLabel", false, [&](bool& written) {
    const std::string language = Language();
    bool sent = true;
    if (language == kWinPCL) {
      sent = Draw(PrintLBXII(), LBXIIBatchCommand());
    } else if (language == kZPL) {
      Send(ZplLabel(values_), HasPort());
    } else if (language == kLBXII) {
      Send(LBXIIBatchCommand(), DirectPort());
    } else {
      TellUnknown(language);
    }
    // Nothing drawn is no label, and no job to deliver.
    written = sent && job_.Close();
  });
}

bool CartonLabel::PrintFile(const std::string& aFormat, const std::string& aBatch) {
  return Printing("Function PrintFile", [&](bool& printed) {
    values_.Qty = "1";
    const std::string language = Language();
    if (!job_.Open(printer_, language == kWinPCL)) return;
    bool sent = true;
    if (language == kWinPCL) {
      sent = Draw(aFormat, LBXIIBatchCommand());
    } else {
      Send(aFormat, false);
      if (language == kLBXII) {
        Send(aBatch, false);
      } else {
        TellUnknown(language);
      }
    }
    printed = sent && job_.Close();
  });
}

bool CartonLabel::Separator(const std::string& aPrinterId, const std::string& aMessage) {
  return Printing("Function Separator", [&](bool& printed) {
    printer_ = aPrinterId;
    if (!job_.Open(printer_, Language() == kWinPCL)) return;
    if (const std::string text = RatioSeparator(aMessage); !text.empty()) Send(text, false);
    printed = job_.Close();
  });
}

std::string CartonLabel::RatioSeparator(const std::string& aMessage) {
  return Procedure("Function RatioSeparator", std::string(), [&](std::string& text) {
    if (Language() != kLBXII) return;
    text = SeparatorPackets(Windows1252(aMessage), Try([&] { return Host().BatchControl(); }));
  });
}

std::string CartonLabel::PrintLBXII() { return FormatPacket(of_.layout, of_.formatNo, component_); }

std::string CartonLabel::LBXIIBatchCommand() {
  values_.BatchControl = Try([&] { return Host().BatchControl(); });
  return batches_[component_ ? 1 : 0].With(values_);
}

void CartonLabel::PrintWinPCL(std::optional<std::string_view> aFormat, std::optional<std::string_view> aBatch) {
  Draw(aFormat ? std::string(*aFormat) : PrintLBXII(), aBatch ? std::string(*aBatch) : LBXIIBatchCommand());
}

bool CartonLabel::Draw(const std::string& format, const std::string& batch) {
  return Procedure("Sub PrintWinPCL", false, [&](bool& drawn) {
    const render::LabelPackets packets = Try([&] { return render::ReadPackets(format, batch); });
    Try([&] { job_.NewPage(packets.width, packets.length); });
    DrawLabel(packets, of_.drawing, drawing_, job_.Page());
    drawn = true;
  });
}

std::string_view CartonLabel::PDTFieldLength() const { return kPDTFieldLength; }

std::string CartonLabel::PDTLookupLine(const Job& aJob, const PSlipLine& aPSlipLine) {
  return Procedure("Function PDTLookupLine", std::string(), [&](std::string& record) {
    const std::string model = Try([&] { return Host().PDTType(); });
    record = LookupLine(*this, model, aJob, aPSlipLine);
  });
}

LabelClass::LineFound CartonLabel::PackLineValid(PSlipArgument aPSlip, PackArgument aPack, std::string_view aAPN,
                                                 double aQty, std::int32_t* aError, std::int32_t aLineId) {
  const LineFound none = std::holds_alternative<std::int32_t>(aPSlip) ? LineFound(std::int32_t{0}) : LineFound();
  Host().ErrorCode = scan::kNotGot;
  LineFound found = Procedure("Function PackLineValid", none, [&](LineFound& result) {
    result = CheckScan(*this, aPSlip, aPack, aAPN, aQty, aLineId);
  });
  if (aError != nullptr) *aError = Host().ErrorCode;
  return found;
}

void CartonLabel::FillValues(const Pack& pack) { labels::FillValues(*this, pack, of_.cuts, values_); }

std::string CartonLabel::Language() {
  return Try([&] { return Host().PrinterLanguage(); });
}

bool CartonLabel::DirectPort() {
  return Try([&] { return Host().ComDirect(); });
}

bool CartonLabel::HasPort() {
  return DirectPort() && !Try([&] { return Host().ComPort(); }).empty();
}

void CartonLabel::Send(std::string_view text, bool toPort) {
  Try([&] { toPort ? Host().ComSend(text) : job_.Write(text); });
}

void CartonLabel::TellUnknown(const std::string& language) {
  WriteLog(ErrorNumber(), "WriteLabel", language + " unknown.");
}

}  // namespace partnerkit::labels
