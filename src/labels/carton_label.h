// What every carton label class does: the one procedure, told from `Init` to the look-ups. A class is a table of
// values.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "frame/hosted_class.h"
#include "labels/label_fields.h"
#include "labels/label_layout.h"
#include "labels/label_values.h"
#include "labels/print_job.h"
#include "labels/text_template.h"
#include "partnerkit/label.h"
#include "render/label_drawing.h"

namespace partnerkit::labels {

// A class's differences, in the order in which a label comes about. What isn't named is the norm.
struct CartonClass {
  std::string_view name;  // "clsCMLSCM"
  std::string_view formatNo = "10";
  PacketLayout layout;
  FieldCuts cuts = {};
  render::LabelStyle drawing = {};  // on an ordinary printer
};

class CartonLabel : public LabelClass, public HostedClass {
 public:
  // `of` must outlive the object.
  CartonLabel(const CartonClass& of, const Ports& ports);

  std::string_view ClassName() const override { return OwnProgId(); }

  void SetUser1(std::string_view text) override;
  void SetUser2(std::string_view text) override;
  void SetStoreZoneDept(std::string_view text) override;
  void SetComponentPrint(bool component) override { component_ = component; }
  void SetComponentItem(std::int16_t item) override { values_.ComponentItem = std::to_string(item); }
  void SetComponentCount(std::int16_t count) override { values_.ComponentCount = std::to_string(count); }
  void SetComponentStyle(std::string_view style) override;
  std::string_view PDTFieldLength() const override;

  bool Init(System& system, const std::string& aPrinter) override;
  bool PrintLabel(const Pack& aPack, std::optional<std::int16_t> Qty, bool ComDirect) override;
  bool PrintAllLabels(std::span<const Pack> aPackList, bool bSeperator, bool bStyleSort) override;
  bool PrintFile(const std::string& aFormat, const std::string& aBatch) override;
  bool Separator(const std::string& aPrinterId, const std::string& aMessage) override;
  std::string RatioSeparator(const std::string& aMessage) override;

  std::string PrintLBXII() override;
  std::string LBXIIBatchCommand() override;
  void PrintWinPCL(std::optional<std::string_view> aFormat, std::optional<std::string_view> aBatch) override;
  std::int32_t SpooledJobCount(const std::string& aPrinter) override { return job_.SpooledJobCount(aPrinter); }

  std::string PDTLookupLine(const Job& aJob, const PSlipLine& aPSlipLine) override;
  LineFound PackLineValid(PSlipArgument aPSlip, PackArgument aPack, std::string_view aAPN, double aQty,
                          std::int32_t* aError, std::int32_t aLineId) override;

 private:
  class Run;

  // A job that a fault left open is given up: half a label is worse than none.
  template <class F>
  bool Printing(std::string_view procedure, F body) {
    const bool done = Procedure(procedure, false, std::move(body));
    job_.Abandon();
    return done;
  }
  std::string Language();
  // Labels go to a port, which may have been left without a name; they do, to one with a name.
  bool DirectPort();
  bool HasPort();
  void Send(std::string_view text, bool toPort);
  bool WriteLabel();
  void TellUnknown(const std::string& language);
  // A page with the label on it. False when the packets are no label, and nothing was drawn.
  bool Draw(const std::string& format, const std::string& batch);
  void FillValues(const Pack& pack);

  const CartonClass& of_;
  PrintJob job_;
  render::Drawing drawing_;
  std::string printer_;
  LabelValues values_;
  bool component_ = false;
  std::string batchSources_[2];
  TextTemplate batches_[2];  // of a carton, of a component
};

}  // namespace partnerkit::labels
