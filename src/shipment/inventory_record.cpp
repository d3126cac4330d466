#include "shipment/inventory_record.h"

#include "values/format.h"
#include "values/numbers.h"
#include "values/outbound_value.h"

namespace partnerkit::shipment {

namespace {

class Fields {
 public:
  explicit Fields(std::string& text) : text_(text) {}

  Fields& Quoted(std::string_view value) {
    Next() += '"';
    AppendValue(value, text_);
    text_ += '"';
    return *this;
  }
  Fields& Bare(std::string_view value) {
    Next().append(value);
    return *this;
  }
  // A number of the date's digits, without zeros in front; 0 for none.
  Fields& Digits(const std::optional<DateTime>& date, std::string_view pattern) {
    return Bare(NumberText(NumberAtStart(Format(date, pattern))));
  }

 private:
  std::string& Next() {
    if (!first_) text_ += ',';
    first_ = false;
    return text_;
  }

  std::string& text_;
  bool first_ = true;
};

}  // namespace

void AppendInventoryRecord(NoticeRecords& records, std::string_view orderNo, std::string& text) {
  const ASN& asn = records.Asn();
  const Shipment& shipment = records.Shipment();
  const PackLine& line = records.Line();
  const Product* const product = records.LineProduct();
  const std::string quantity = NumberText(line.Quantity);
  Fields(text)
      .Quoted(records.Document().PartnerEDIAddr)
      .Quoted(Format(asn.ASNNo, "000000000"))
      .Digits(asn.CompileDate, "yyyymmdd")
      .Digits(asn.CompileDate, "hhmm")
      .Quoted(Str(shipment.ConNoteNo))
      .Digits(shipment.DeliveryDate, "yyyymmdd")
      .Digits(shipment.DeliveryDate, "yyyymmdd")
      .Quoted(records.Pack().BuyStoreCode)
      .Quoted(orderNo)
      .Quoted(Str(records.Pack().InvoiceNo))
      .Quoted(product != nullptr ? Str(product->InHouseProdNo) : std::string_view())
      .Quoted(line.APN)
      .Bare(NumberText(records.SlipLine().OrderQty))
      .Bare(quantity)
      .Bare(quantity)
      .Quoted(shipment.Complete ? "C" : "S")
      .Quoted(Str(records.SlipLocn().CustomerRef))
      .Quoted(product != nullptr ? Str(product->ProductSize) : std::string_view())
      .Quoted(Str(records.PackJob().PackerId))
      .Quoted(Str(records.OrderedLine().LineNo))
      .Quoted(Str(records.LocnLine().LineRef))
      .Quoted(Str(shipment.CarrierCode));
  text += "\r\n";
}

}  // namespace partnerkit::shipment
