#include "labels/label_fields.h"

#include "values/delimited.h"
#include "values/format.h"
#include "values/numbers.h"
#include "values/windows_1252.h"

namespace partnerkit::labels {

namespace {

constexpr std::size_t kUserLine = 30;
constexpr std::size_t kPostcode = 4;
constexpr std::size_t kSSCC = 18;

// Cut as printers count, a byte for each character.
std::string Short(std::string_view text, std::size_t n) { return std::string(Cut(Windows1252(text), n)); }

std::string Upper(std::string_view text) { return Format(text, ">"); }
std::string LocationNo(std::string_view number) { return Format(number, "0000"); }

class Filling {
 public:
  Filling(HostedClass& label, const Pack& pack, const FieldCuts& cuts, LabelValues& values)
      : label_(label), pack_(pack), cuts_(cuts), values_(values) {}

  void Sender() {
    Partner vendor;
    vendor.PartnerId = pack_.VendorId;
    Read(vendor);
    values_.FromName = Short(Str(vendor.Name), 15);
    values_.FromSuburb = Short(Str(vendor.Suburb), cuts_.FromSuburb);
    values_.FromState = Short(Str(vendor.State), 3);
  }

  void Carrier() {
    delivery_ = Location(pack_.ShipToCode);
    PartnerAddress carrier;
    carrier.Id = pack_.PartnerLocnId == 0 ? delivery_.CarrierId : pack_.CarrierId;
    if (carrier.Id != 0) Read(carrier);
    values_.CarrierName = Short(Str(carrier.Name), cuts_.CarrierName);
    Shipment shipment;
    shipment.Id = pack_.ShipmentId;
    if (shipment.Id != 0) Read(shipment);
    values_.ConNoteNo = Short(Str(shipment.ConNoteNo), cuts_.ConNoteNo);
    values_.BillOfLadingNo = Short(Str(shipment.BillOfLadingNo), cuts_.BillOfLadingNo);
  }

  void DeliveryPoint() {
    const std::string_view through = Str(delivery_.DeliverToCode);
    const PartnerLocn to = Location(TrimBlanks(through).empty() ? std::string_view(pack_.ShipToCode) : through);
    values_.ToName = Short(TrimBlanks(Str(to.ShortName)), cuts_.ToName);
    if (Upper(TrimBlanks(Str(to.Name))) == "DC") values_.ToName = std::string(Cut(values_.ToName, 7)) + " DC";
    values_.ToAddress = Short(Str(to.Address1), 20);
    values_.ToSuburb = Short(Str(to.Suburb), 15);
    values_.ToPostcode = Short(Str(to.Postcode), kPostcode);
    values_.ToLocnNo = LocationNo(to.PartnerLocnNo);
  }

  void FinalStore() {
    const PartnerLocn store = Location(pack_.BuyStoreCode);
    values_.FinalLocnNo = store.PartnerLocnNo == "DC" ? values_.ToLocnNo : LocationNo(store.PartnerLocnNo);
    values_.CountryCode = Short(Str(store.CountryCode), 3);
    values_.ForName = Short(TrimBlanks(Str(store.ShortName)), cuts_.ForName);
    values_.ForLocnName = Short(Str(store.Name), cuts_.ForLocnName);
    values_.ForAddress = Short(Str(store.Address1), cuts_.ForAddress);
    values_.ForSuburb = Short(Str(store.Suburb), cuts_.ForSuburb);
    values_.ForPostcode = Short(Str(store.Postcode), kPostcode);
    values_.ForLocnNo = LocationNo(store.PartnerLocnNo);
    if (Str(Order().TypeCode) != "CO") return;
    // A customer's order shows the customer, and no store.
    values_.ForName = Short(TrimBlanks(Str(Order().Header3)), 30);
    for (std::string* text :
         {&values_.ForLocnName, &values_.ForAddress, &values_.ForSuburb, &values_.ForPostcode, &values_.ForLocnNo}) {
      text->clear();
    }
  }

  void Carton() {
    values_.User1 = Cut(values_.User1, kUserLine);
    values_.User2 = Cut(values_.User2, kUserLine);
    const std::string_view code = Str(pack_.SSCC);
    values_.SSCCText = code.substr(code.size() > kSSCC ? code.size() - kSSCC : 0);
    values_.PalletText = Upper(Str(pack_.PackTypeId)) == "PALLET" ? "PALLET" : "";
  }

  void OrderTexts() {
    // A release number never reaches the label.
    std::string_view number = Order().PONo;
    if (const std::size_t release = number.find(" REL# "); release != std::string_view::npos && release > 0) {
      number = number.substr(0, release);
    }
    values_.POText = "PO " + Short(number, 22);
    const std::string advertised = Windows1252(Str(Order().Header1));
    const bool dated = advertised.size() > 1;
    values_.ADDate = dated ? Cut(advertised, 4) : std::string_view();
    values_.ADFlag = dated && advertised.size() > 3 && DecimalOf(advertised) ? "AD" : "";
    values_.DeptText = Short(Str(Order().Header2), 15);
    if (values_.DeptText.empty()) values_.DeptText = Windows1252(Str(Order().DeptNo));
  }

  void Capitals() {
    values_.DeptCapitals = Windows1252Capitals(values_.DeptText);
    values_.StoreZoneCapitals = Windows1252Capitals(values_.StoreZoneDept);
  }

 private:
  template <class R>
  void Read(R& record) {
    label_.Try([&] { return Load(label_.Records(), record); });
  }

  PartnerLocn Location(std::string_view number) {
    PartnerLocn location;
    location.VendorId = pack_.VendorId;
    location.PartnerLocnNo = number;
    Read(location);
    return location;
  }

  const partnerkit::Order& Order() {
    if (order_.OrderId == 0 && pack_.OrderId != 0) {
      order_.OrderId = pack_.OrderId;
      Read(order_);
    }
    return order_;
  }

  HostedClass& label_;
  const Pack& pack_;
  const FieldCuts& cuts_;
  LabelValues& values_;
  PartnerLocn delivery_;
  partnerkit::Order order_;
};

}  // namespace

void FillValues(HostedClass& label, const Pack& pack, const FieldCuts& cuts, LabelValues& values) {
  LabelValues fresh;
  for (const auto given :
       {&LabelValues::User1, &LabelValues::User2, &LabelValues::StoreZoneDept, &LabelValues::ComponentItem,
        &LabelValues::ComponentCount, &LabelValues::ComponentStyle, &LabelValues::FormatNo, &LabelValues::Qty}) {
    fresh.*given = std::move(values.*given);
  }
  values = std::move(fresh);
  label.Procedure("Sub FillValues", false, [&](bool&) {
    Filling filling(label, pack, cuts, values);
    filling.Sender();
    filling.Carrier();
    filling.DeliveryPoint();
    filling.FinalStore();
    filling.Carton();
    filling.OrderTexts();
    filling.Capitals();
  });
}

}  // namespace partnerkit::labels
