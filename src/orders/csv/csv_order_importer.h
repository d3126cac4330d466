// The CSV order importers: purchase orders as one line for each product at each location.
//
// The story of a run: `Init` binds the class and opens the backup; `Load` reads the map, holds the order file and lists
// its transactions; `Process` posts one of them; `Term` rewrites the file without those dealt with. The engine tells it
// in full; a partner's class gives its values and overrides the steps it does otherwise.
#pragma once

#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "files/field_map.h"
#include "files/line_reader.h"
#include "orders/csv/csv_order_line.h"
#include "orders/csv/csv_order_values.h"
#include "orders/order_importer.h"

namespace partnerkit::orders {

class CsvOrderImporter : public OrderImporter {
 public:
  // The values must outlive the object.
  CsvOrderImporter(const CsvOrderValues& values, const Ports& ports);
  bool Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) override;
  std::int32_t Load(const std::string& a_sFileName, RowTable& a_vtRows) override;
  std::int32_t Process(std::int32_t a_lRowNum, ErrorList& vtErrorLog) override;
  bool Delete(std::int32_t a_lRowNum, ErrorList& vtErrorLog) override;
  bool Term() override;
  void Cancel() override;

  // Splits a line as this class does; an entry whose column is left out, or beyond the line's, stays as it is.
  void SetFields(std::string_view aLine, std::vector<std::string>& aFields) const;

 protected:
  struct Posting : OrderPosting {
    Posting(CsvOrderImporter& importer, ListedOrder& listed, const PostingValues& postingValues, ErrorList& errorList);

    const PostingValues& values;
    std::string firstLineKey;
    std::string lineSequence;  // of the line last read
    std::int64_t lineNo = 0;   // its number in the file
    std::size_t fields = 0;    // that it has
    bool ended = true;         // it has its end
    bool listed = true;        // it was there, whole, when the file was listed
  };

  // The line's product: the number it is ordered by, and the product that stands for.
  struct LineProduct {
    std::string ordered;
    std::string productNo;
    Text GTIN = {};
  };

  // --- Steps of the listing
  // The number that the line's order is listed, posted and settled under; `number` may hold it on return.
  virtual std::string_view OrderNumber(std::string& number) const;

  // --- Steps of a posting, in their order
  // How the order whose first line is in hand is posted.
  virtual const PostingValues& ValuesOf() const { return values_.posting; }
  // Before anything else; False, with the reason noted, ends the call there.
  virtual bool BeginPosting(Posting&) { return true; }
  virtual void FillHeader(Posting& posting);
  virtual bool LineCounts() { return true; }
  // Ends the call when the line in hand does away with the order.
  virtual Next LookAtLine(Posting&) { return Next::kGoOn; }
  // Checks the line's product and says which it is.
  virtual LineProduct CheckLineProduct(Posting& posting);
  // A further check of the product that passed the usual ones.
  virtual void CheckFoundProduct(Posting&, const Product&) {}
  virtual double LineQuantity(const Posting& posting);
  virtual void FillLine(Posting& posting, OrderLine& line);
  virtual void CheckLineLocations(Posting& posting);
  virtual void FillLocationLine(const Posting& posting, OrderLocnLine& locnLine);

  // Posts the row by these values, or by those of its first line when there are none.
  std::int32_t PostRow(std::int32_t row, const PostingValues* values, ErrorList& errorList);

  // The field of the line in hand, blanks cut.
  std::string_view operator[](OrderField field) const { return line_[field]; }
  // The number at the field's start, see ReadNumber.
  double NumberOf(OrderField field);
  // An advertised date as some partners want it back: the last four characters of a long one.
  static std::string AdvertisedText(std::string_view date);
  std::string_view BuyingLocn() const;
  bool AsksForPrices() const { return Document().ValidateCost || Document().ValidateRetail; }
  // The line's claims about its product, which goes by this number.
  LineClaims Claims(std::string_view productNo) const;
  void FitProductMaster();
  void CheckBuyingLocn(Posting& posting);
  void MarkTurnedAway(ListedOrder& entry) override;

  const CsvOrderValues& values_;

 private:
  bool OpenMapFile(const std::string& path);
  bool TakeMapFile(const std::string& path);
  bool ExpectFields();
  bool SetOrderList(const std::string& path);
  bool ListTransactions();
  void ListLines(std::int64_t& lineNo);
  std::size_t FieldsAt(std::uint64_t position);
  void WarnOfCutLine(const Line& line, std::int64_t lineNo);
  bool IsOurs() const;
  void JoinLineKey(std::string& key) const;
  bool ReadLine(Line& line);

  bool SettleFile();
  void DealOut(WorkQueue::Rewrite& rewrite, std::vector<ByteRange>& posted);
  bool WasListed(const Line& line) const { return line.End() <= listedTo_; }
  void SettledKey(std::string& key, std::string& number) const;
  std::string SettledKey(const ListedOrder& entry) const;
  std::string SettledKey(const Order& stored) const;
  void MarkPosted(ListedOrder& entry) override;
  void Forget(const Order& stored) override { processed_.Forget(SettledKey(stored)); }
  // Raises RunTimeError when the order file isn't open.
  LineReader& Lines();
  void CloseOrderFile();
  bool StillStandsAt(std::uint64_t position, const ListedOrder& entry);
  void CopyAllBut(WorkQueue::Rewrite& rewrite, std::uint64_t begin, std::uint64_t end);

  Next StartPosting(Posting& posting);
  bool SeekTo(const ListedOrder& entry);
  bool NextLine(Posting& posting);
  void NeedListedOrder(const Posting& posting) const;
  void NeedWholeLine(const Posting& posting) const;
  void NeedControls(const Posting& posting) const;
  void NeedOwnNumber(const Posting& posting) const;
  void NeedOneText(const ListedOrder& entry);
  std::string DigestOf(const ListedOrder& entry);
  bool NextOwnLine(Posting& posting, std::string& key);
  Next PostLines(Posting& posting);
  OrderFacts Facts(const Posting& posting) const;
  Next ReadLines(Posting& posting);
  bool EndsTransaction(const Posting& posting, std::string& key) const;
  Next TakeLine(Posting& posting);
  void TakeLocation(Posting& posting);
  Next AddToLocation(Posting& posting, const LineProduct& product);
  double Sum(const Posting& posting, double before, double quantity);

  FieldMap fieldMap_;
  MapHeader mapHeader_;
  bool mapLoaded_ = false;
  CsvOrderLine line_;
  std::optional<LineReader> lines_;
  std::uint64_t listedTo_ = 1;     // where the file ended when it was listed, from 1
  std::size_t lastLineNeeds_ = 0;  // fields that a last line without an end has to have
  // Of transactions that stand in the file more than once: where one has other lines than the one before it, or null.
  std::unordered_map<std::string, const ListedOrder*> twins_;
  Posting* posting_ = nullptr;  // the call in hand
  BackupFile backup_;
  ProcessedOrders processed_;
};

}  // namespace partnerkit::orders
