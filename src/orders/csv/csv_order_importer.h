// The CSV order importers: purchase orders as one line for each product at each location.
//
// The story of a run: `Init` binds the class and opens the backup; `Load` reads the map, holds the order file and lists
// its transactions; `Process` posts one of them; `Term` rewrites the file without those dealt with. The engine tells it
// in full; a partner's class gives its values and overrides the steps it does otherwise.
#pragma once

#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "frame/field_map.h"
#include "frame/translator_base.h"
#include "frame/work_queue.h"
#include "orders/csv/csv_order_line.h"
#include "orders/listed_order.h"
#include "orders/order_checks.h"
#include "orders/order_draft.h"
#include "orders/stored_order.h"

namespace partnerkit::orders {

// What a line of one transaction has in common, and what tells the transaction's first line when it comes again.
inline constexpr OrderField kTransactionKey[] = {OrderField::INTCONTROLNO, OrderField::GRPCONTROLNO,
                                                 OrderField::TRNCONTROLNO};
inline constexpr OrderField kLineKey[] = {OrderField::PONUMBER, OrderField::SEQUENTIALLINENO,
                                          OrderField::BUYINGLOCPARTNERNO, OrderField::INCOMINGPRODUCTNO};

// What a partner's importer does in its own way, in the order of the family's story.
struct CsvOrderValues {
  std::string_view className;                  // "clsMGB850csv"
  std::span<const OrderField> expectedFields;  // must be in the map file; the first missing one is reported
  std::span<const OrderField> lineKey = kLineKey;
  CheckWords checkWords = {};
  bool importsProducts = true;  // a product file of the vendor is read at the end of listing
  std::span<const StoredOrderRule> storedOrder;
  std::string_view cancelCodes = "01 1";   // purpose codes that cancel
  std::string_view directToStore = "DTS";  // a ship-to of this name is the buying location; empty: no such rule
};

class CsvOrderImporter : public TranslatorBase {
 public:
  bool Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) override;
  std::int32_t Load(const std::string& a_sFileName, RowTable& a_vtRows) override;
  std::int32_t Process(std::int32_t a_lRowNum, ErrorList& vtErrorLog) override;
  bool Delete(std::int32_t a_lRowNum, ErrorList& vtErrorLog) override;
  bool Term() override;
  void Cancel() override;

  // Splits a line as this class does; entries beyond the line's columns stay as they are.
  void SetFields(std::string_view aLine, std::vector<std::string>& aFields) const;

 protected:
  CsvOrderImporter(const CsvOrderValues& values, const Ports& ports);

  // One call of `Process`.
  struct Posting {
    Posting(CsvOrderImporter& importer, ListedOrder& listed, ErrorList& errorList);

    ListedOrder& entry;
    CallLog log;
    OrderDraft draft;
    OrderChecks checks;
    std::string firstLineKey;
    std::string lineSequence;  // of the line last read
    std::string shipTo;        // current ship-to and buying location
    std::string buyingLocn;
    std::string locationLookedAt;
  };

  enum class Next { kGoOn, kEnd };

  // The steps of a posting, each with the partners' norm. One that ends the call leaves 0 as its result.
  virtual Next SettleStoredOrder(Posting& posting);
  virtual Next RefuseCancellationOfNothing(Posting& posting);
  virtual void FillHeader(Posting& posting);
  virtual Next ReadLines(Posting& posting);
  virtual void CheckLineProduct(Posting& posting);
  virtual void FillLine(OrderLine& line);
  virtual void CheckLineLocations(Posting& posting);
  virtual void FillLocation(OrderLocn& location);
  virtual void FillLocationLine(OrderLocnLine& locnLine);

  // The field of the line in hand, blanks cut.
  std::string_view operator[](OrderField field) const { return line_[field]; }

  // Marks the entry as dealt with for good without being stored: its lines leave the file.
  Next TurnAway(Posting& posting);

 private:
  bool OpenMapFile(const std::string& path);
  bool TakeMapFile(const std::string& path);
  bool ExpectFields();
  bool SetOrderList(const std::string& path);
  bool HoldOrderFile(const std::string& path);
  void ListTransactions();
  bool IsOurs() const;
  void FillRows(RowTable& rows) const;
  bool ReadLine(Line& line);
  ListedOrder* EntryOfRow(std::int32_t row);

  bool SettleFile();
  void DealOut(WorkQueue::Rewrite& rewrite, std::vector<ByteRange>& posted);
  void DeleteWhenEmpty();
  void CopyAllBut(WorkQueue::Rewrite& rewrite, std::uint64_t begin, std::uint64_t end);

  Next StartPosting(Posting& posting);
  bool NextLine(Posting& posting);
  bool HasJobs(const Order& stored);
  Next TakeLine(Posting& posting);
  Next AddToLocation(Posting& posting, const std::string& productNo);
  std::int32_t Post(Posting& posting);

  const CsvOrderValues& values_;
  FieldMap fieldMap_;
  MapHeader mapHeader_;
  bool mapLoaded_ = false;
  CsvOrderLine line_;
  WorkQueue queue_;
  BackupFile backup_;
  std::string fileName_;
  std::vector<ListedOrder> listed_;
  ProcessedOrders processed_;
};

}  // namespace partnerkit::orders
