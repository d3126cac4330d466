// The labels of many packs as one print job.
#include <array>
#include <memory>
#include <vector>

#include "labels/carton_label.h"
#include "labels/other_languages.h"
#include "values/format.h"
#include "values/windows_1252.h"

namespace partnerkit::labels {

namespace {

constexpr std::string_view kLineEnd = "\r\n";

enum class UserLine { kStyle, kNumber, kPacker, kJob, kDescription, kReference };

// What the words of the setting for the second free line stand for; any other text is the line itself.
constexpr std::pair<std::string_view, UserLine> kUserLines[] = {
    {"STYLE", UserLine::kStyle},
    {"ITEM_STYLE/STOCKID", UserLine::kStyle},
    {"APN", UserLine::kNumber},
    {"EAN", UserLine::kNumber},
    {"UPC", UserLine::kNumber},
    {"EAN/UPC", UserLine::kNumber},
    {"ITEM_EAN/UPC", UserLine::kNumber},
    {"USER", UserLine::kPacker},
    {"PACKERID", UserLine::kPacker},
    {"JOB", UserLine::kJob},
    {"JOBID", UserLine::kJob},
    {"BIG TICKET JOB ID", UserLine::kJob},
    {"DESCRIPTION", UserLine::kDescription},
    {"DESC", UserLine::kDescription},
    {"DESCR", UserLine::kDescription},
    {"ITEM_DESCRIPTION", UserLine::kDescription},
    {"DELIVERYREF", UserLine::kReference},
};

const UserLine* UserLineOf(std::string_view setting) {
  const std::string word = Format(setting, ">");
  for (const auto& [name, line] : kUserLines) {
    if (name == word) return &line;
  }
  return nullptr;
}

}  // namespace

class CartonLabel::Run {
 public:
  Run(CartonLabel& label, std::span<const Pack> packs, bool separators)
      : label_(label), packs_(packs), separators_(separators), language_(label.Language()) {}

  // Separators lead the labels of their store.
  void ByStore() {
    std::string_view lastStore;
    for (const Pack& pack : packs_) {
      SetFreeLines(pack);
      if (pack.BuyStoreCode != lastStore) {
        lastStore = pack.BuyStoreCode;
        AddSeparator(pack.BuyStoreCode);
      }
      AddLabel(pack);
    }
  }

  // From the last pack to the first, which is how a printer's pile comes to lie in order; separators stand behind the
  // labels of their prepack.
  void ByStyle() {
    std::string lastPackNo, style;
    for (std::size_t left = packs_.size(); left > 0; --left) {
      const Pack& pack = packs_[left - 1];
      SetFreeLines(pack);
      if (left == packs_.size()) {
        lastPackNo = pack.PackNo;
        style = StyleOfJob(pack.PackNo);
      } else if (pack.PackNo != lastPackNo) {
        if (separators_) AddSeparator(style + StyleOfOnlyLine(pack));
        lastPackNo = pack.PackNo;
        style = StyleOfJob(pack.PackNo);
      }
      AddLabel(pack);
    }
    if (!packs_.empty()) AddSeparator(style);
  }

  std::string TakeOutput() { return std::move(output_); }
  bool Drawn() const { return language_ == "WinPCL"; }

 private:
  template <class R>
  bool Read(R& record) {
    return label_.Try([&] { return Load(label_.Records(), record); });
  }
  template <class R>
  std::vector<std::shared_ptr<R>> List(const Lookup& lookup, const R& probe) {
    return label_.Try([&] { return Select(label_.Records(), lookup, probe); });
  }

  // From the first label's free lines on a failure costs one label at most, and the run goes on.
  void SetFreeLines(const Pack& pack) {
    label_.SetUser1("PACK ID " + pack.PackNo);
    std::string setting = label_.Try([&] { return label_.Host().LabelUserField(); });
    if (setting.empty()) setting = label_.Try([&] { return label_.Host().LabelUserFieldAlt(); });
    if (!setting.empty()) label_.SetUser2(UserText(pack, setting));
    if (!errorsPassed_) errorsPassed_.emplace(label_.Errors());
  }

  std::string UserText(const Pack& pack, const std::string& setting) {
    const UserLine* const line = UserLineOf(setting);
    if (line == nullptr) return setting;
    switch (*line) {
      case UserLine::kStyle:
        return "ITEM ID " + std::string(Str(ProductOf(pack).InHouseProdNo));
      case UserLine::kNumber:
        return "ITEM ID " + ProductOf(pack).ProductNo;
      case UserLine::kDescription:
        return "ITEM ID " + std::string(Str(ProductOf(pack).Description));
      case UserLine::kPacker:
        return "USER ID " + std::string(Str(JobOf(pack).PackerId));
      case UserLine::kJob:
        return "JOB ID " + JobIdOf(pack);
      case UserLine::kReference:
        return "REFER " + std::string(Str(pack.InvoiceNo));
    }
    return {};
  }

  std::vector<std::shared_ptr<PackLine>> LinesOf(const Pack& pack) {
    PackLine probe;
    probe.PackId = pack.Id;
    return List(PackLine::kByPack, probe);
  }

  // The first line's; an empty one for a pack without lines.
  Product ProductOf(const Pack& pack) {
    Product product;
    if (const auto lines = LinesOf(pack); !lines.empty()) {
      product.ProductNo = lines.front()->APN;
      Read(product);
    }
    return product;
  }

  Job JobOf(const Pack& pack) {
    PSlip slip;
    slip.Id = pack.PSlipId;
    Job job;
    if (Read(slip)) job.JobId = slip.JobId;
    Read(job);
    return job;
  }

  std::string JobIdOf(const Pack& pack) {
    const Job job = JobOf(pack);
    return job.JobId == 0 ? std::string() : std::to_string(job.JobId);
  }

  // Of the first item; empty without one.
  std::string StyleOfJob(const std::string& packNo) {
    LabelJobItem probe;
    probe.PackNo = packNo;
    const auto items = List(LabelJobItem::kByLabelJob, probe);
    return items.empty() ? std::string() : std::string(Str(items.front()->StyleText));
  }

  // A second line for the separator, where the pack at hand, the first of the next group, holds one product only.
  std::string StyleOfOnlyLine(const Pack& pack) {
    const auto lines = LinesOf(pack);
    if (lines.size() != 1) return {};
    PSlipLine line;
    line.LineId = lines.front()->PSlipLineId;
    Read(line);
    return std::string(kLineEnd).append(Str(line.StyleText));
  }

  void AddSeparator(const std::string& message) {
    if (!separators_) return;
    output_.append(label_.RatioSeparator(message)).append(kLineEnd);
    label_.Yield();
  }

  void AddLabel(const Pack& pack) {
    label_.FillValues(pack);
    if (Drawn()) {
      if (!label_.Draw(label_.PrintLBXII(), label_.LBXIIBatchCommand())) {
        label_.WriteLog(kWarning, "PrintAllLabels", "Label of pack " + pack.PackNo + " not printed.");
      }
    } else {
      output_.append(language_ == "ZPL" ? ZplLabel(label_.values_) : label_.LBXIIBatchCommand()).append(kLineEnd);
    }
    label_.Yield();
  }

  CartonLabel& label_;
  std::span<const Pack> packs_;
  bool separators_;
  std::string language_;
  std::string output_;
  std::optional<HandlerOff> errorsPassed_;
};

bool CartonLabel::PrintAllLabels(std::span<const Pack> aPackList, bool bSeperator, bool bStyleSort) {
  return Printing("Function PrintAllLabels", [&](bool& printed) {
    if (!job_.Open(printer_, Language() == "WinPCL")) return;
    values_.Qty = "1";
    std::string output;
    bool drawn = false;
    {
      Run run(*this, aPackList, bSeperator);
      bStyleSort ? run.ByStyle() : run.ByStore();
      output = run.TakeOutput();
      drawn = run.Drawn();
    }
    if (!drawn) Send(output, DirectPort());
    printed = job_.Close();
  });
}

}  // namespace partnerkit::labels
