// Master data: who trades, where, what, and how it is packed and printed.
#include "partnerkit/records.h"

namespace partnerkit {

// clang-format off
// Members of the look-ups.
constexpr std::string_view kVendorId[]                      = {"VendorId"};
constexpr std::string_view kInHouseProdNoAndColourAndSize[] = {"InHouseProdNo", "Colour", "Size"};
constexpr std::string_view kProductNo[]                     = {"ProductNo"};
constexpr std::string_view kInnerEAN[]                      = {"InnerEAN"};
constexpr std::string_view kProductNoAndInnerQty[]          = {"ProductNo", "InnerQty"};
constexpr std::string_view kShipPackCode[]                  = {"ShipPackCode"};
constexpr std::string_view kPackNo[]                        = {"PackNo"};

constexpr Member kPartnerMembers[] = {
    Key<&Partner::PartnerId>          ("PartnerId"),
    Field<&Partner::Name>             ("Name"),
    Field<&Partner::Address1>         ("Address1"),
    Field<&Partner::Suburb>           ("Suburb"),
    Field<&Partner::City>             ("City"),
    Field<&Partner::State>            ("State"),
    Field<&Partner::Postcode>         ("Postcode"),
    Field<&Partner::PartnerCode>      ("PartnerCode"),
    Field<&Partner::SupplierNo>       ("SupplierNo"),
    Field<&Partner::ABN>              ("ABN"),
    Field<&Partner::Translator>       ("Translator"),
    Field<&Partner::ASNNoFromInvoice> ("ASNNoFromInvoice"),
    Field<&Partner::NextControlNo>    ("NextControlNo"),
    Field<&Partner::LastASNNo>        ("LastASNNo"),
    Field<&Partner::LastInterchangeNo>("LastInterchangeNo"),
    Field<&Partner::LastGroupNo>      ("LastGroupNo"),
    Field<&Partner::ASNExtension>     ("ASNExtension"),
    Field<&Partner::InventoryFile>    ("InventoryFile"),
};
constexpr RecordType Partner::kType = {"Partner", "tbPartner", kPartnerMembers, {},
    "A retail partner: address, EDI translator and the counters of what is sent to it."};

constexpr Member kVendorMembers[] = {
    Key<&Vendor::VendorId>           ("VendorId"),
    Field<&Vendor::Name>             ("Name"),
    Field<&Vendor::TargetVendorNo>   ("TargetVendorNo"),
    Field<&Vendor::LabelClass>       ("LabelClass"),
    Field<&Vendor::ProductImportFile>("ProductImportFile"),
    Field<&Vendor::POBackupFile>     ("POBackupFile"),
};
constexpr RecordType Vendor::kType = {"Vendor", "tbVendor", kVendorMembers, {},
    "The company that trades: this supplier, or one of its trading names."};

constexpr Member kEDIDocMembers[] = {
    Key<&EDIDoc::EDIDocId>         ("EDIDocId"),
    Field<&EDIDoc::ProgId>         ("ProgId"),
    Field<&EDIDoc::DocumentCode>   ("DocumentCode"),
    Field<&EDIDoc::PartnerId>      ("PartnerId"),
    Field<&EDIDoc::VendorId>       ("VendorId"),
    Field<&EDIDoc::CompanyEDIAddr> ("CompanyEDIAddr"),
    Field<&EDIDoc::PartnerEDIAddr> ("PartnerEDIAddr"),
    Field<&EDIDoc::MapFolder>      ("MapFolder"),
    Field<&EDIDoc::MapFile>        ("MapFile"),
    Field<&EDIDoc::ValidateProduct>("ValidateProduct"),
    Field<&EDIDoc::ValidateCost>   ("ValidateCost"),
    Field<&EDIDoc::ValidateRetail> ("ValidateRetail"),
    Field<&EDIDoc::ReadOptions>    ("ReadOptions"),
    Field<&EDIDoc::Options>        ("Options"),
    Field<&EDIDoc::AckFolder>      ("AckFolder"),
    Field<&EDIDoc::TestMode>       ("TestMode"),
};
constexpr RecordType EDIDoc::kType = {"EDIDoc", "tbEDIDoc", kEDIDocMembers, {},
    "A document definition: which class runs one document of one partner, and how."};

constexpr Member kPartnerAddressMembers[] = {
    Id<&PartnerAddress::Id>              ("Id"),
    Field<&PartnerAddress::Name>         ("Name"),
    Field<&PartnerAddress::ProcessProgID>("ProcessProgID"),
};
constexpr RecordType PartnerAddress::kType = {"PartnerAddress", "tbPartnerAddress", kPartnerAddressMembers, {},
    "A carrier, or another address that locations, packs and shipments name."};

constexpr Member kPartnerLocnMembers[] = {
    Key<&PartnerLocn::VendorId>       ("VendorId"),
    Key<&PartnerLocn::PartnerLocnNo>  ("PartnerLocnNo"),
    Field<&PartnerLocn::Name>         ("Name"),
    Field<&PartnerLocn::ShortName>    ("ShortName"),
    Field<&PartnerLocn::Address1>     ("Address1"),
    Field<&PartnerLocn::Address2>     ("Address2"),
    Field<&PartnerLocn::Suburb>       ("Suburb"),
    Field<&PartnerLocn::State>        ("State"),
    Field<&PartnerLocn::Postcode>     ("Postcode"),
    Field<&PartnerLocn::CountryCode>  ("CountryCode"),
    Field<&PartnerLocn::LocnPrefix>   ("LocnPrefix"),
    Field<&PartnerLocn::ContactNo>    ("ContactNo"),
    Field<&PartnerLocn::DeliverToCode>("DeliverToCode"),
    Link<&PartnerLocn::CarrierId>     ("CarrierId", "PartnerAddress"),
};
constexpr Lookup PartnerLocn::kByVendor = {"ByVendor", kVendorId};
constexpr Lookup kPartnerLocnLookups[] = {PartnerLocn::kByVendor};
constexpr RecordType PartnerLocn::kType = {"PartnerLocn", "tbPartnerLocn", kPartnerLocnMembers, kPartnerLocnLookups,
    "A store, distribution centre or other place that the partner has goods sent to."};

constexpr Member kProductMembers[] = {
    Key<&Product::ProductNo>      ("ProductNo"),
    Field<&Product::PartnerId>    ("PartnerId"),
    Field<&Product::InHouseProdNo>("InHouseProdNo"),
    Field<&Product::Colour>       ("Colour"),
    Field<&Product::Size>         ("Size"),
    Field<&Product::Description>  ("Description"),
    Field<&Product::ProductSize>  ("ProductSize"),
    Field<&Product::ItemCode>     ("ItemCode"),
    Field<&Product::UOM>          ("UOM"),
    Field<&Product::Symbology>    ("Symbology"),
    Field<&Product::ProductClass> ("ProductClass"),
    Field<&Product::Bin>          ("Bin"),
    Field<&Product::Weight>       ("Weight"),
    Field<&Product::Volume>       ("Volume"),
    Field<&Product::CartonAPN>    ("CartonAPN"),
    Field<&Product::Hazardous>    ("Hazardous"),
};
constexpr Lookup Product::kByStyle = {"ByStyle", kInHouseProdNoAndColourAndSize};
constexpr Lookup kProductLookups[] = {Product::kByStyle};
constexpr RecordType Product::kType = {"Product", "tbProduct", kProductMembers, kProductLookups,
    "A product, by the number on its barcode."};

constexpr Member kProductPriceMembers[] = {
    Key<&ProductPrice::VendorId>      ("VendorId"),
    Key<&ProductPrice::ProductNo>     ("ProductNo"),
    Field<&ProductPrice::SKU>         ("SKU"),
    Field<&ProductPrice::Cost>        ("Cost"),
    Field<&ProductPrice::ExCost>      ("ExCost"),
    Field<&ProductPrice::GSTAmount>   ("GSTAmount"),
    Field<&ProductPrice::TaxRate>     ("TaxRate"),
    Field<&ProductPrice::Retail>      ("Retail"),
    Field<&ProductPrice::DeptNo>      ("DeptNo"),
    Field<&ProductPrice::TicketType>  ("TicketType"),
    Field<&ProductPrice::ImportValue1>("ImportValue1"),
    Field<&ProductPrice::ImportValue2>("ImportValue2"),
    Field<&ProductPrice::ImportValue3>("ImportValue3"),
};
constexpr Lookup ProductPrice::kByVendor  = {"ByVendor",  kVendorId};
constexpr Lookup ProductPrice::kByProduct = {"ByProduct", kProductNo};
constexpr Lookup kProductPriceLookups[] = {ProductPrice::kByVendor, ProductPrice::kByProduct};
constexpr RecordType ProductPrice::kType = {
    "ProductPrice", "tbProductPrice", kProductPriceMembers, kProductPriceLookups,
    "Cost, retail price and item code of a product for one company."};

constexpr Member kProductInnerMembers[] = {
    Key<&ProductInner::ProductNo>("ProductNo"),
    Key<&ProductInner::InnerEAN> ("InnerEAN"),
    Key<&ProductInner::InnerQty> ("InnerQty"),
};
constexpr Lookup ProductInner::kByEAN      = {"ByEAN",      kInnerEAN};
constexpr Lookup ProductInner::kByProduct  = {"ByProduct",  kProductNo};
constexpr Lookup ProductInner::kByQuantity = {"ByQuantity", kProductNoAndInnerQty};
constexpr Lookup kProductInnerLookups[] = {ProductInner::kByEAN, ProductInner::kByProduct, ProductInner::kByQuantity};
constexpr RecordType ProductInner::kType = {
    "ProductInner", "tbProductInner", kProductInnerMembers, kProductInnerLookups,
    "An inner or outer pack of a product, by its own barcode."};

constexpr Member kPrepackMembers[] = {
    Key<&Prepack::ProductNo>  ("ProductNo"),
    Key<&Prepack::PrepackQty> ("PrepackQty"),
    Field<&Prepack::PrepackNo>("PrepackNo"),
};
constexpr Lookup Prepack::kByProduct = {"ByProduct", kProductNo};
constexpr Lookup kPrepackLookups[] = {Prepack::kByProduct};
constexpr RecordType Prepack::kType = {"Prepack", "tbPrepack", kPrepackMembers, kPrepackLookups,
    "A made-up pack of a product that an order may ask for in place of an inner."};

constexpr Member kPackTypeMembers[] = {
    Key<&PackType::PackTypeId>       ("PackTypeId"),
    Field<&PackType::ShipPackCode>   ("ShipPackCode"),
    Field<&PackType::PackageTypeCode>("PackageTypeCode"),
    Field<&PackType::PalletFlag>     ("PalletFlag"),
    Field<&PackType::Height>         ("Height"),
    Field<&PackType::Width>          ("Width"),
    Field<&PackType::Length>         ("Length"),
};
constexpr Lookup PackType::kByShipPackCode = {"ByShipPackCode", kShipPackCode};
constexpr Lookup kPackTypeLookups[] = {PackType::kByShipPackCode};
constexpr RecordType PackType::kType = {"PackType", "tbPackType", kPackTypeMembers, kPackTypeLookups,
    "A kind of carton or pallet."};

constexpr Member kPrinterMembers[] = {
    Key<&Printer::Name>    ("Name"),
    Field<&Printer::Kind>  ("Kind"),
    Field<&Printer::Target>("Target"),
};
constexpr RecordType Printer::kType = {"Printer", "tbPrinter", kPrinterMembers, {}, "Where the jobs of a printer go."};

constexpr Member kLabelJobMembers[] = {
    Key<&LabelJob::PackNo>("PackNo"),
};
constexpr RecordType LabelJob::kType = {"LabelJob", "tbLabelJob", kLabelJobMembers, {},
    "A prepack job: what packs of one number hold."};

constexpr Member kLabelJobItemMembers[] = {
    Id<&LabelJobItem::Id>          ("Id"),
    Owner<&LabelJobItem::PackNo>   ("PackNo", "LabelJob"),
    Field<&LabelJobItem::StyleText>("StyleText"),
    Field<&LabelJobItem::PackQty>  ("PackQty"),
    Field<&LabelJobItem::ProductNo>("ProductNo"),
};
constexpr Lookup LabelJobItem::kByLabelJob = {"ByLabelJob", kPackNo};
constexpr Lookup kLabelJobItemLookups[] = {LabelJobItem::kByLabelJob};
constexpr RecordType LabelJobItem::kType = {
    "LabelJobItem", "tbLabelJobItem", kLabelJobItemMembers, kLabelJobItemLookups,
    "An item of a prepack job."};

// clang-format on

}  // namespace partnerkit
