// The contract of the label classes. A label class turns one pack into one printed label for one retail partner.
//
//   created --Init--> ready --PrintLabel, PrintAllLabels, PrintFile, Separator, look-ups, in any order--> release
//
// The printer's language (`System::PrinterLanguage`) decides the way: "LBXII" printers get the label's layout once, at
// `Init`, and then only its values; "ZPL" printers get layout and values with every label; under "WinPCL" the label is
// drawn on an ordinary printer. Under any other language nothing is printed, which is logged.
//
// A class runs on the caller's thread, one call at a time. It changes no record. It raises nothing to its host, as
// `Translator` tells. What cannot be opened or delivered is a log record and a False.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <variant>

#include "partnerkit/records.h"
#include "partnerkit/store.h"

namespace partnerkit {

// Codes that a check of a scan leaves in `System::ErrorCode`.
namespace scan {
inline constexpr std::int32_t kFits = 0;
inline constexpr std::int32_t kNotGot = 8101;         // the slip or the pack could not be got
inline constexpr std::int32_t kUnknownNumber = 8102;  // the number is on no line of the slip
inline constexpr std::int32_t kQuantity = 8103;       // the line is there, the quantity doesn't fit
inline constexpr std::int32_t kOtherStore = 8106;     // the carton is for another store than the slip
}  // namespace scan

class LabelClass {
 public:
  // A slip or a pack at hand, or its id. A null pack is no pack.
  using PSlipArgument = std::variant<const PSlip*, std::int32_t>;
  using PackArgument = std::variant<const Pack*, std::int32_t>;
  // The line found, null for none; its LineId, 0 for none, to one who gave the slip's id.
  using LineFound = std::variant<std::shared_ptr<PSlipLine>, std::int32_t>;

  virtual ~LabelClass() = default;
  LabelClass(const LabelClass&) = delete;
  LabelClass& operator=(const LabelClass&) = delete;

  // The class's ProgID, "PartnerKit.clsCMLSCM".
  virtual std::string_view ClassName() const = 0;

  // For the host to decide by when it calls the class; `Init` sets all but the two PrePack ones. The class reads none.
  bool PrintSCMatOpen = false;       // the label is printed when a carton is opened
  bool PrintSCMatClose = false;      // the label is printed when a carton is closed
  bool OLESubPackComponent = false;  // the class prints component labels of a sub pack
  bool Prepack = false;              // packing by prepack
  bool PrePackComplete = false;
  std::string PrePackStyle;
  bool ValidateClose = false;  // the host validates a carton on closing

  // What the label says beyond the pack's own records. The free lines and the zone keep their first 30 characters.
  virtual void SetUser1(std::string_view text) = 0;
  virtual void SetUser2(std::string_view text) = 0;
  virtual void SetStoreZoneDept(std::string_view text) = 0;
  // A component's label, "2 OF 5" and a style, in place of the carton's.
  virtual void SetComponentPrint(bool component) = 0;
  virtual void SetComponentItem(std::int16_t item) = 0;
  virtual void SetComponentCount(std::int16_t count) = 0;
  virtual void SetComponentStyle(std::string_view style) = 0;
  // Widths of the fields of a look-up record, for terminals with fixed ones: "7,6,10,...".
  virtual std::string_view PDTFieldLength() const = 0;

  // Binds the class to the host and, unless the name is empty, to a printer, which gets the label's format. Without a
  // printer only look-ups and `Separator` work.
  virtual bool Init(System& system, const std::string& aPrinter = {}) = 0;
  // Prints the pack's label `Qty` times, once when it is missing; ZPL and drawn labels once whatever it is. `ComDirect`
  // says that the caller has the printer in hand, so that none is opened.
  virtual bool PrintLabel(const Pack& aPack, std::optional<std::int16_t> Qty = {}, bool ComDirect = false) = 0;
  // The labels of all packs as one print job, in their order, with separator labels ahead of each store's if these are
  // asked for; `bStyleSort` takes them from the last to the first, a separator behind each prepack. Fills the free
  // lines.
  virtual bool PrintAllLabels(std::span<const Pack> aPackList, bool bSeperator = false, bool bStyleSort = false) = 0;
  // Prints a format and a batch that the caller holds.
  virtual bool PrintFile(const std::string& aFormat, const std::string& aBatch) = 0;
  // Prints a separator label, up to five lines joined by CR LF, on that printer, which stays the class's printer. Under
  // another language than LBXII there is none.
  virtual bool Separator(const std::string& aPrinterId, const std::string& aMessage) = 0;
  // The separator's text, for one who collects output.
  virtual std::string RatioSeparator(const std::string& aMessage) = 0;

  // The label's format, and its values for the pack at hand, in the format language.
  virtual std::string PrintLBXII() = 0;
  virtual std::string LBXIIBatchCommand() = 0;
  // Draws one label on the printer that is open; packets left out are the class's own.
  virtual void PrintWinPCL(std::optional<std::string_view> aFormat = {},
                           std::optional<std::string_view> aBatch = {}) = 0;
  // Jobs that wait at the printer, at most 999; 0 for an empty name.
  virtual std::int32_t SpooledJobCount(const std::string& aPrinter) = 0;

  // The look-up record of a slip line for the packers' terminals, by `System::PDTType`: "Denso" (fixed widths) or
  // "Fenwick6030" (commas). Empty for any other.
  virtual std::string PDTLookupLine(const Job& aJob, const PSlipLine& aPSlipLine) = 0;
  // Whether a scanned number and quantity fit a line of the slip. The code is in `System::ErrorCode` and, unless it is
  // null, in `aError`. A negative quantity takes goods back. `aLineId` asks for one line; 0 means any.
  virtual LineFound PackLineValid(PSlipArgument aPSlip, PackArgument aPack, std::string_view aAPN, double aQty = 1,
                                  std::int32_t* aError = nullptr, std::int32_t aLineId = 0) = 0;

 protected:
  LabelClass() = default;
};

}  // namespace partnerkit
