// The trading records: a plain struct for each kind, with the members that the store, the command line and the classes
// share. docs/data.md tells what each member means.
//
// A record's relations are found through the ids and codes that it holds: the lines of an order by
// Select(store, OrderLine::kByOrder, probe), the slip of a pack by Load with the pack's PSlipId. An id of 0 names
// nothing.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "partnerkit/record_type.h"
#include "partnerkit/values.h"

namespace partnerkit {

// A retail partner: address, EDI translator and the counters of what is sent to it.
struct Partner {
  static const RecordType kType;

  std::string PartnerId;
  Text Name;
  Text Address1;
  Text Suburb;
  Text City;
  Text State;
  Text Postcode;
  Text PartnerCode;
  Text SupplierNo;
  Text ABN;
  Text Translator;
  bool ASNNoFromInvoice = false;
  Text NextControlNo;
  std::int32_t LastASNNo = 0;
  std::int32_t LastInterchangeNo = 0;
  std::int32_t LastGroupNo = 0;
  Text ASNExtension;
  Text InventoryFile;
};

// The company that trades: this supplier, or one of its trading names.
struct Vendor {
  static const RecordType kType;

  std::string VendorId;
  Text Name;
  Text TargetVendorNo;
  Text LabelClass;
  Text ProductImportFile;
  Text POBackupFile;
};

// A document definition: which class runs one document of one partner, and how.
struct EDIDoc {
  static const RecordType kType;

  std::int32_t EDIDocId = 0;
  std::string ProgId;
  std::string DocumentCode;
  std::string PartnerId;
  std::string VendorId;
  std::string CompanyEDIAddr;
  std::string PartnerEDIAddr;
  Text MapFolder;
  Text MapFile;
  bool ValidateProduct = false;
  bool ValidateCost = false;
  bool ValidateRetail = false;
  Text ReadOptions;
  Text Options;
  Text AckFolder;
  bool TestMode = false;
};

// A carrier, or another address that locations, packs and shipments name.
struct PartnerAddress {
  static const RecordType kType;

  std::int32_t Id = 0;
  Text Name;
  Text ProcessProgID;
};

// A store, distribution centre or other place that the partner has goods sent to.
struct PartnerLocn {
  static const RecordType kType;
  static const Lookup kByVendor;

  std::string VendorId;
  std::string PartnerLocnNo;
  Text Name;
  Text ShortName;
  Text Address1;
  Text Address2;
  Text Suburb;
  Text State;
  Text Postcode;
  Text CountryCode;
  Text LocnPrefix;
  Text ContactNo;
  Text DeliverToCode;
  std::int32_t CarrierId = 0;
};

// A product, by the number on its barcode.
struct Product {
  static const RecordType kType;
  static const Lookup kByStyle;

  std::string ProductNo;
  std::string PartnerId;
  Text InHouseProdNo;
  std::string Colour;
  std::string Size;
  Text Description;
  Text ProductSize;
  Text ItemCode;
  Text UOM;
  Text Symbology;
  Text ProductClass;
  Text Bin;
  double Weight = 0;
  double Volume = 0;
  Text CartonAPN;
  bool Hazardous = false;
};

// Cost, retail price and item code of a product for one company.
struct ProductPrice {
  static const RecordType kType;
  static const Lookup kByVendor;
  static const Lookup kByProduct;

  std::string VendorId;
  std::string ProductNo;
  Text SKU;
  double Cost = 0;
  double ExCost = 0;
  double GSTAmount = 0;
  Text TaxRate;
  std::optional<double> Retail;
  Text DeptNo;
  Text TicketType;
  Text ImportValue1;
  Text ImportValue2;
  Text ImportValue3;
};

// An inner or outer pack of a product, by its own barcode.
struct ProductInner {
  static const RecordType kType;
  static const Lookup kByEAN;
  static const Lookup kByProduct;
  static const Lookup kByQuantity;

  std::string ProductNo;
  std::string InnerEAN;
  double InnerQty = 0;
};

// A made-up pack of a product that an order may ask for in place of an inner.
struct Prepack {
  static const RecordType kType;
  static const Lookup kByProduct;

  std::string ProductNo;
  double PrepackQty = 0;
  Text PrepackNo;
};

// A kind of carton or pallet.
struct PackType {
  static const RecordType kType;
  static const Lookup kByShipPackCode;

  std::string PackTypeId;
  std::string ShipPackCode;
  Text PackageTypeCode;
  Text PalletFlag;
  double Height = 0;
  double Width = 0;
  double Length = 0;
};

// Where the jobs of a printer go.
struct Printer {
  static const RecordType kType;

  std::string Name;
  std::string Kind;
  Text Target;
};

// A prepack job: what packs of one number hold.
struct LabelJob {
  static const RecordType kType;

  std::string PackNo;
};

// An item of a prepack job.
struct LabelJobItem {
  static const RecordType kType;
  static const Lookup kByLabelJob;

  std::int32_t Id = 0;
  std::string PackNo;
  Text StyleText;
  double PackQty = 0;
  Text ProductNo;
};

// A purchase order.
struct Order {
  static const RecordType kType;
  static const Lookup kByNumber;
  static const Lookup kByVendorAndPartner;
  static const Lookup kByType;

  std::int32_t OrderId = 0;  // 0 while not posted, and again once turned away
  std::string VendorId;
  std::string PartnerId;
  std::string PONo;
  Text PurposeCode;
  Text TypeCode;
  std::optional<DateTime> PODate;
  std::optional<DateTime> ImportDate;
  std::optional<DateTime> NotBefore;
  std::optional<DateTime> CancelAfter;
  std::optional<DateTime> DeliveryFullDate;
  std::optional<DateTime> POADate;
  Text DeptNo;
  Text ReleaseNo;
  Text Header1;
  Text Header2;
  Text Header3;
  Text Header4;
  Text SupplierNo;
  Text PartnerSupplierNo;
  Text SupplierRef;
  Text CompanyCode;
  Text VendorBuyId;
  Text CustomerRef;
  Text CustCat;
  Text CustomerName;
  Text CustomerAddress;
  Text CustomerSuburb;
  Text InterchangeCtl;
  Text GroupCtl;
  Text TransactionCtl;
  Text SourceFile;
  std::int64_t FilePos = 0;  // byte position from 1
  Text Note;
  Text DeliveryNote;
  Text ChangeFlag;
  std::int32_t ResponseStatus = 0;
  std::int32_t Status = 0;  // 9 while being stored, 0 when complete
};

// A product on an order.
struct OrderLine {
  static const RecordType kType;
  static const Lookup kByOrder;
  static const Lookup kByProduct;

  std::int32_t LineId = 0;
  std::int32_t OrderId = 0;
  Text LineNo;
  std::string ProductNo;
  Text ProductQualifier;
  Text GTIN;
  Text SKU;
  Text VendorItemNo;
  Text Description;
  Text LineText;
  double Quantity = 0;
  Text UOM;
  Text PriceCode;
  double Cost = 0;
  double UnitExCost = 0;
  std::optional<double> CostExGST;
  std::optional<double> GSTRate;
  std::optional<double> GSTAmount;
  double RetailPrice = 0;
  Text PackUOM;
  std::optional<double> PackSize;
  std::optional<double> PackCount;
  Text PalletCount;
  double ASNQty = 0;
  std::int32_t Filled = 0;
  std::optional<DateTime> DeliveryDate;
  std::optional<DateTime> ChangeDate;
};

// A buying location on an order.
struct OrderLocn {
  static const RecordType kType;
  static const Lookup kByOrder;
  static const Lookup kByBuyingLocn;

  std::int32_t LocnId = 0;
  std::int32_t OrderId = 0;
  std::string VendorId;
  std::string BuyingLocn;
  std::string ShipToLocn;
  Text ShipToCode;
  Text DeliveryLocn;
  Text StoreNo;
  Text UltimateLocn;
  Text DeliveryName;
  Text DeliveryAddress1;
  Text DeliveryAddress2;
  Text DeliveryAddress3;
  Text DeliveryAddress4;
  Text DeliveryPhone;
  Text DeliveryEmail;
  Text DeliveryServices;
  Text CustomerRef;
  Text CustomerNo;
};

// The quantity of a product for one location of an order.
struct OrderLocnLine {
  static const RecordType kType;
  static const Lookup kByOrder;
  static const Lookup kByLine;
  static const Lookup kByLocn;

  std::int32_t Id = 0;
  std::int32_t OrderId = 0;
  std::int32_t LineId = 0;
  std::int32_t LocnId = 0;
  std::string ProductNo;
  std::string BuyingLocn;
  Text GTIN;
  Text LineRef;
  double Quantity = 0;
  double OriginalQty = 0;
  double AllocateQty = 0;
  double BackorderQty = 0;
  double TicketQty = 0;
  double PickedQty = 0;
  double PackedQty = 0;
  double ShippedQty = 0;
  double InvoicedQty = 0;
  double OtherQty = 0;

  // The order line under the name that documents know it by.
  std::int32_t OrderLineId() const { return LineId; }
};

// An order that was posted from a file which still holds it: there is one from the commit of a posting until `Term` has
// settled the file. It stays behind a run that was stopped, cancelled or could not rewrite the file, so that the next
// one knows the order for its own work, and goes at the next listing of that file by the same document definition once
// the order is stored no longer or in the file no longer. A host neither writes these records nor has to remove them.
struct UnsettledOrder {
  static const RecordType kType;
  static const Lookup kByFileName;  // of a document definition

  std::int32_t OrderId = 0;
  std::int32_t EDIDocId = 0;
  std::string FileName;
  bool BackedUp = false;
};

// A packing job for an order.
struct Job {
  static const RecordType kType;
  static const Lookup kByOrder;

  std::int32_t JobId = 0;
  std::int32_t OrderId = 0;
  Text PackerId;
};

// A packing slip: the part of a job for one location.
struct PSlip {
  static const RecordType kType;
  static const Lookup kByJob;
  static const Lookup kByOrderLocn;

  std::int32_t Id = 0;
  std::int32_t JobId = 0;
  std::int32_t OrderLocnId = 0;
  std::string StoreCode;
  Text SlipRef1;
  Text SlipRef2;
};

// A product on a packing slip.
struct PSlipLine {
  static const RecordType kType;
  static const Lookup kByPSlip;
  static const Lookup kByOrderLocnLine;

  std::int32_t LineId = 0;
  std::int32_t PSlipId = 0;
  std::int32_t OrderLocnLineId = 0;
  std::string APN;
  Text ScanCode;
  Text StyleText;
  Text LineRef;
  double OrderQty = 0;
  double PackedQty = 0;
  double PackedCount = 0;
};

// A consignment of packs.
struct Shipment {
  static const RecordType kType;

  std::int32_t Id = 0;
  std::int32_t Status = 0;
  Text ConNoteNo;
  Text BookingNo;
  Text BillOfLadingNo;
  std::int32_t CarrierId = 0;
  Text CarrierCode;
  Text DeliveryLocnCode;
  std::optional<DateTime> ScheduleDate;
  std::optional<DateTime> DeliveryDate;
  std::optional<double> Weight;
  std::optional<double> Volume;
  bool Complete = false;
};

// A ship notice: one shipment of one order, as told to the partner.
struct ASN {
  static const RecordType kType;
  static const Lookup kByNumber;
  static const Lookup kByVendorAndPartner;
  static const Lookup kByShipment;
  static const Lookup kByInterchangeNo;
  static const Lookup kByGroupNo;

  std::int32_t Id = 0;
  Text ASNNo;
  std::string VendorId;
  std::string PartnerId;
  std::int32_t ShipmentId = 0;
  std::int32_t OrderId = 0;
  Text OrderNo;
  Text PartnerName;
  std::int32_t PartnerLocnId = 0;  // carried over from the packs; no PartnerLocn is found by it
  Text ShipToCode;
  Text DeliveryLocn;
  Text ConNoteNo;
  Text InterchangeNo;
  Text GroupNo;
  Text TransactionNo;
  std::optional<DateTime> CompileDate;
  std::optional<DateTime> TransmitDate;
  std::optional<DateTime> AcknowledgedDate;
};

// A file that grows by a notice which isn't stored yet: what to take out of it, should the program stop before that.
struct PendingNotice {
  static const RecordType kType;
  static const Lookup kByVendorAndPartner;
  static const Lookup kByFileName;

  std::int32_t Id = 0;
  std::string VendorId;
  std::string PartnerId;
  std::string ASNNo;
  std::string FileName;
  bool NewFile = false;
  std::int64_t LengthBefore = 0;
  std::int64_t LengthAdded = 0;
};

// A carton or pallet.
struct Pack {
  static const RecordType kType;
  static const Lookup kByShipment;
  static const Lookup kByOrder;
  static const Lookup kByASN;
  static const Lookup kByLeadPack;
  static const Lookup kByPSlip;
  static const Lookup kByVendorAndStatus;

  std::int32_t Id = 0;
  std::string PackNo;
  std::int32_t PSlipId = 0;
  std::int32_t OrderId = 0;
  std::int32_t ShipmentId = 0;
  std::int32_t ASNId = 0;
  std::int32_t LeadPackId = 0;
  std::int32_t CarrierId = 0;
  Text PackTypeId;
  std::int32_t Status = 0;  // waits to be compiled while below 8
  std::string VendorId;
  std::string ShipToCode;
  std::string BuyStoreCode;
  std::int32_t PartnerLocnId = 0;  // 0 for none: the carrier is then the delivery location's
  Text InvoiceNo;
  Text PalletNo;
  Text SSCC;
  double CartonCount = 0;
  std::optional<double> Weight;
};

// A product in a pack.
struct PackLine {
  static const RecordType kType;
  static const Lookup kByPack;
  static const Lookup kByPSlipLine;

  std::int32_t Id = 0;
  std::int32_t PackId = 0;
  std::int32_t PSlipLineId = 0;
  std::string APN;
  Text GTIN;
  double Quantity = 0;
  Text BatchNo;
  std::optional<DateTime> UseByDate;
  std::optional<DateTime> BestBeforeDate;
  std::optional<DateTime> ExpiryDate;
};

// Product activity reports between two EDI addresses: how far they were read.
struct PADRecord {
  static const RecordType kType;

  std::string CompanyEDIAddr;
  std::string PartnerEDIAddr;
  Text SupplierNo;
  std::optional<DateTime> ToDate;
};

// Current stock of a product at a location, as the partner reports it.
struct PADItem {
  static const RecordType kType;

  std::string VendorId;
  std::string LocationNo;
  std::string ProductNo;
  std::optional<DateTime> ActivityDate;
  double StockOnHand = 0;
  double OnOrderQty = 0;
};

// One period's activity of a product at a location.
struct PADStore {
  static const RecordType kType;

  std::string VendorId;
  std::string LocationNo;
  std::string ProductNo;
  std::optional<DateTime> FromDate;
  std::optional<DateTime> ToDate;
  Text CommodityGroup;
  double StockOnHand = 0;
  double SalesQty = 0;
  double OnOrderQty = 0;
};

// What a class had to say, in the order written.
struct Log {
  static const RecordType kType;

  std::int32_t LogId = 0;
  std::optional<DateTime> LogDate;
  Text UserId;
  Text ComputerName;
  Text Source;
  Text Procedure;
  std::int32_t ErrorNumber = 0;
  std::int32_t NativeError = 0;
  Text Message;
};

// Every kind, masters first and owners before what they own: the order in which a store is made and a load is stored.
std::span<const RecordType* const> AllRecordTypes();

// The kind of that name, capitals as given; null when there is none.
const RecordType* FindRecordType(std::string_view kind);

}  // namespace partnerkit
