// The X12 order importers: purchase orders (850) and changes to them (860).
//
// The story of a run: `Load` archives the file, holds it, lists its transactions and acknowledges each group of them
// with a 997; `Process` posts a transaction; `Term` rewrites the file without those dealt with, and marks the groups in
// it as acknowledged. The engine tells it in full; a partner's class gives its values and reads what only it is sent.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "edi/segment_reader.h"
#include "orders/order_importer.h"
#include "orders/x12/x12_order_values.h"
#include "orders/x12/x12_segment.h"
#include "orders/x12/x12_walk.h"

namespace partnerkit::orders {

class X12OrderImporter : public OrderImporter {
 public:
  // The values must outlive the object.
  X12OrderImporter(const X12OrderValues& values, const Ports& ports);
  bool Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) override;
  std::int32_t Load(const std::string& a_sFileName, RowTable& a_vtRows) override;
  std::int32_t Process(std::int32_t a_lRowNum, ErrorList& vtErrorLog) override;
  bool Delete(std::int32_t a_lRowNum, ErrorList& vtErrorLog) override;
  bool Term() override;
  void Cancel() override;

 protected:
  // One call of `Process`.
  struct Posting : OrderPosting {
    using OrderPosting::OrderPosting;

    bool begun = false;       // the beginning segment was read
    bool distributed = true;  // the line in hand has its locations
    std::string n1;           // location of the N1
    std::shared_ptr<OrderLine> line;
    std::optional<ProductPrice> price;  // of the line in hand, when costs are checked
    int lines = 0;
    std::string cutBy;  // what ended the transaction before its CTT
  };

  // --- Steps that partners do otherwise
  // The number that the order is listed and stored under, from its beginning segment in hand.
  virtual std::string OrderNumber() { return Element(3); }
  virtual void BeginPosting(Posting&) {}
  virtual void FillHeader(Posting& posting);
  // A DTM, of the order in work or of a stored one that it changes.
  virtual void TakeDate(Order& order);
  // Reads a segment that the engine passes over.
  virtual void ReadOther(Posting&) {}

  Next ChangeStored(OrderPosting& posting, Order& stored) override;

  // The segment in hand, and its elements. Raises Unreadable for one that is missing.
  const X12Segment& InHand() const { return segment_; }
  std::string Element(int n, ElementForm form = {}) const;
  // The same of an element that may be left out: as it stands, or in the other form where it ends the segment.
  std::string ElementOrEnd(int n, ElementForm atEnd) const;
  // The number that element n begins with, see ReadNumber.
  double NumberOf(Posting& posting, int n, std::string_view text, bool isQuantity = false);
  // Takes the next segment in hand. False at the end of the file. A segment that cannot be read leaves the procedure
  // even when the user says to go on: taken for the end of the file, it would cut an order short.
  bool NextSegment();

  const X12OrderValues& values_;

 private:
  // An orders group in hand while listing.
  struct Group {
    std::string header;
    std::string control;
    std::string fault;  // why the header cannot be read; empty when it can
    int transactions = 0;
  };

  bool SetOrderList(const std::string& path);
  void Archive(const std::string& path);
  void KeepArchived(const std::string& path, const std::string& archived);
  bool WalkFile();
  void BeginInterchange();
  Group BeginGroup();
  ListedOrder BeginEntry(const Group& group);
  void CompleteEntry(ListedOrder& entry);
  bool ProcessFA(const Group& group);
  std::string SegmentText() const;
  Unreadable Fault(const RunTimeError& error) const;
  // Takes the file's next segment in hand. False at its end. Raises RunTimeError.
  bool ReadSegment();
  bool EndsInterchange(std::string_view text) const;
  SegmentReader& Segments();
  void CloseOrderFile();
  X12Walk Walk() const;

  bool SameTransaction(const Order& stored, const ListedOrder& entry) const override;
  void MarkTurnedAway(ListedOrder& entry) override { entry.done = true; }
  void MarkPosted(ListedOrder& entry) override;
  void Export(OrderPosting& posting) override;
  bool EarlierStays(const ListedOrder& entry) override;

  Next PostTransaction(Posting& posting);
  void NeedListedOrder(const Posting& posting);
  Next CutShort(Posting& posting);
  void TellCutShort(Posting& posting);
  Next ReadTransaction(Posting& posting);
  Next TakeBeginning(Posting& posting);
  void TakeN1(Posting& posting);
  Next TakeLine(Posting& posting, const LineElements& elements);
  void CheckLine(Posting& posting, const LineElements& elements, const std::string& number);
  void FillLine(Posting& posting, const LineElements& elements, OrderLine& line);
  Text Sku();
  // Raises Unreadable when the segment in hand stands before any line.
  void NeedLine(const Posting& posting) const;
  void TakeRetail(Posting& posting);
  void TakePack(Posting& posting);
  Next TakeStores(Posting& posting);
  Next Distribute(Posting& posting);
  Next AddToLocation(Posting& posting, double quantity);

  class Sweep;
  bool SettleFile();
  void CopyAllBut(WorkQueue::Rewrite& rewrite, std::uint64_t position);

  X12Segment segment_;
  std::optional<SegmentReader> segments_;
  std::string interchangeCtl_;    // of the envelope in hand while listing
  std::string interchangeFault_;  // why its header cannot be read; empty when it can
  bool listedWhole_ = false;
  std::uint64_t listedTo_ = 1;  // the file's end when it was listed, from 1
};

}  // namespace partnerkit::orders
