// Orders with their lines, locations and location lines.
#include "partnerkit/records.h"

namespace partnerkit {

// clang-format off
// Members of the look-ups.
constexpr std::string_view kVendorIdAndPartnerIdAndPONo[]     = {"VendorId", "PartnerId", "PONo"};
constexpr std::string_view kVendorIdAndPartnerId[]            = {"VendorId", "PartnerId"};
constexpr std::string_view kVendorIdAndPartnerIdAndTypeCode[] = {"VendorId", "PartnerId", "TypeCode"};
constexpr std::string_view kOrderId[]                         = {"OrderId"};
constexpr std::string_view kOrderIdAndProductNo[]             = {"OrderId", "ProductNo"};
constexpr std::string_view kOrderIdAndBuyingLocn[]            = {"OrderId", "BuyingLocn"};
constexpr std::string_view kOrderIdAndLineId[]                = {"OrderId", "LineId"};
constexpr std::string_view kOrderIdAndLocnId[]                = {"OrderId", "LocnId"};

constexpr Member kOrderMembers[] = {
    Id<&Order::OrderId>             ("OrderId"),
    Field<&Order::VendorId>         ("VendorId"),
    Field<&Order::PartnerId>        ("PartnerId"),
    Field<&Order::PONo>             ("PONo"),
    Field<&Order::PurposeCode>      ("PurposeCode"),
    Field<&Order::TypeCode>         ("TypeCode"),
    Field<&Order::PODate>           ("PODate"),
    Field<&Order::ImportDate>       ("ImportDate"),
    Field<&Order::NotBefore>        ("NotBefore"),
    Field<&Order::CancelAfter>      ("CancelAfter"),
    Field<&Order::DeliveryFullDate> ("DeliveryFullDate"),
    Field<&Order::POADate>          ("POADate"),
    Field<&Order::DeptNo>           ("DeptNo"),
    Field<&Order::ReleaseNo>        ("ReleaseNo"),
    Field<&Order::Header1>          ("Header1"),
    Field<&Order::Header2>          ("Header2"),
    Field<&Order::Header3>          ("Header3"),
    Field<&Order::Header4>          ("Header4"),
    Field<&Order::SupplierNo>       ("SupplierNo"),
    Field<&Order::PartnerSupplierNo>("PartnerSupplierNo"),
    Field<&Order::SupplierRef>      ("SupplierRef"),
    Field<&Order::CompanyCode>      ("CompanyCode"),
    Field<&Order::VendorBuyId>      ("VendorBuyId"),
    Field<&Order::CustomerRef>      ("CustomerRef"),
    Field<&Order::CustCat>          ("CustCat"),
    Field<&Order::CustomerName>     ("CustomerName"),
    Field<&Order::CustomerAddress>  ("CustomerAddress"),
    Field<&Order::CustomerSuburb>   ("CustomerSuburb"),
    Field<&Order::InterchangeCtl>   ("InterchangeCtl"),
    Field<&Order::GroupCtl>         ("GroupCtl"),
    Field<&Order::TransactionCtl>   ("TransactionCtl"),
    Field<&Order::SourceFile>       ("SourceFile"),
    Field<&Order::FilePos>          ("FilePos"),
    Field<&Order::Note>             ("Note"),
    Field<&Order::DeliveryNote>     ("DeliveryNote"),
    Field<&Order::ChangeFlag>       ("ChangeFlag"),
    Field<&Order::ResponseStatus>   ("ResponseStatus"),
    Field<&Order::Status>           ("Status"),
};
constexpr Lookup Order::kByNumber           = {"ByNumber",           kVendorIdAndPartnerIdAndPONo, true};
constexpr Lookup Order::kByVendorAndPartner = {"ByVendorAndPartner", kVendorIdAndPartnerId};
constexpr Lookup Order::kByType             = {"ByType",             kVendorIdAndPartnerIdAndTypeCode};
constexpr Lookup kOrderLookups[] = {Order::kByNumber, Order::kByVendorAndPartner, Order::kByType};
constexpr RecordType Order::kType = {"Order", "tbOrder", kOrderMembers, kOrderLookups, "A purchase order."};

constexpr Member kOrderLineMembers[] = {
    Id<&OrderLine::LineId>             ("LineId"),
    Owner<&OrderLine::OrderId>         ("OrderId", "Order"),
    Field<&OrderLine::LineNo>          ("LineNo"),
    Field<&OrderLine::ProductNo>       ("ProductNo"),
    Field<&OrderLine::ProductQualifier>("ProductQualifier"),
    Field<&OrderLine::GTIN>            ("GTIN"),
    Field<&OrderLine::SKU>             ("SKU"),
    Field<&OrderLine::VendorItemNo>    ("VendorItemNo"),
    Field<&OrderLine::Description>     ("Description"),
    Field<&OrderLine::LineText>        ("LineText"),
    Field<&OrderLine::Quantity>        ("Quantity"),
    Field<&OrderLine::UOM>             ("UOM"),
    Field<&OrderLine::PriceCode>       ("PriceCode"),
    Field<&OrderLine::Cost>            ("Cost"),
    Field<&OrderLine::UnitExCost>      ("UnitExCost"),
    Field<&OrderLine::CostExGST>       ("CostExGST"),
    Field<&OrderLine::GSTRate>         ("GSTRate"),
    Field<&OrderLine::GSTAmount>       ("GSTAmount"),
    Field<&OrderLine::RetailPrice>     ("RetailPrice"),
    Field<&OrderLine::PackUOM>         ("PackUOM"),
    Field<&OrderLine::PackSize>        ("PackSize"),
    Field<&OrderLine::PackCount>       ("PackCount"),
    Field<&OrderLine::PalletCount>     ("PalletCount"),
    Field<&OrderLine::ASNQty>          ("ASNQty"),
    Field<&OrderLine::Filled>          ("Filled"),
    Field<&OrderLine::DeliveryDate>    ("DeliveryDate"),
    Field<&OrderLine::ChangeDate>      ("ChangeDate"),
};
constexpr Lookup OrderLine::kByOrder   = {"ByOrder",   kOrderId};
constexpr Lookup OrderLine::kByProduct = {"ByProduct", kOrderIdAndProductNo};
constexpr Lookup kOrderLineLookups[] = {OrderLine::kByOrder, OrderLine::kByProduct};
constexpr RecordType OrderLine::kType = {"OrderLine", "tbOrderLine", kOrderLineMembers, kOrderLineLookups,
    "A product on an order."};

constexpr Member kOrderLocnMembers[] = {
    Id<&OrderLocn::LocnId>             ("LocnId"),
    Owner<&OrderLocn::OrderId>         ("OrderId", "Order"),
    Field<&OrderLocn::VendorId>        ("VendorId"),
    Field<&OrderLocn::BuyingLocn>      ("BuyingLocn"),
    Field<&OrderLocn::ShipToLocn>      ("ShipToLocn"),
    Field<&OrderLocn::ShipToCode>      ("ShipToCode"),
    Field<&OrderLocn::DeliveryLocn>    ("DeliveryLocn"),
    Field<&OrderLocn::StoreNo>         ("StoreNo"),
    Field<&OrderLocn::UltimateLocn>    ("UltimateLocn"),
    Field<&OrderLocn::DeliveryName>    ("DeliveryName"),
    Field<&OrderLocn::DeliveryAddress1>("DeliveryAddress1"),
    Field<&OrderLocn::DeliveryAddress2>("DeliveryAddress2"),
    Field<&OrderLocn::DeliveryAddress3>("DeliveryAddress3"),
    Field<&OrderLocn::DeliveryAddress4>("DeliveryAddress4"),
    Field<&OrderLocn::DeliveryPhone>   ("DeliveryPhone"),
    Field<&OrderLocn::DeliveryEmail>   ("DeliveryEmail"),
    Field<&OrderLocn::DeliveryServices>("DeliveryServices"),
    Field<&OrderLocn::CustomerRef>     ("CustomerRef"),
    Field<&OrderLocn::CustomerNo>      ("CustomerNo"),
};
constexpr Lookup OrderLocn::kByOrder      = {"ByOrder",      kOrderId};
constexpr Lookup OrderLocn::kByBuyingLocn = {"ByBuyingLocn", kOrderIdAndBuyingLocn};
constexpr Lookup kOrderLocnLookups[] = {OrderLocn::kByOrder, OrderLocn::kByBuyingLocn};
constexpr RecordType OrderLocn::kType = {"OrderLocn", "tbOrderLocn", kOrderLocnMembers, kOrderLocnLookups,
    "A buying location on an order."};

constexpr Member kOrderLocnLineMembers[] = {
    Id<&OrderLocnLine::Id>             ("Id"),
    Owner<&OrderLocnLine::OrderId>     ("OrderId", "Order"),
    Link<&OrderLocnLine::LineId>       ("LineId",  "OrderLine"),
    Link<&OrderLocnLine::LocnId>       ("LocnId",  "OrderLocn"),
    Field<&OrderLocnLine::ProductNo>   ("ProductNo"),
    Field<&OrderLocnLine::BuyingLocn>  ("BuyingLocn"),
    Field<&OrderLocnLine::GTIN>        ("GTIN"),
    Field<&OrderLocnLine::LineRef>     ("LineRef"),
    Field<&OrderLocnLine::Quantity>    ("Quantity"),
    Field<&OrderLocnLine::OriginalQty> ("OriginalQty"),
    Field<&OrderLocnLine::AllocateQty> ("AllocateQty"),
    Field<&OrderLocnLine::BackorderQty>("BackorderQty"),
    Field<&OrderLocnLine::TicketQty>   ("TicketQty"),
    Field<&OrderLocnLine::PickedQty>   ("PickedQty"),
    Field<&OrderLocnLine::PackedQty>   ("PackedQty"),
    Field<&OrderLocnLine::ShippedQty>  ("ShippedQty"),
    Field<&OrderLocnLine::InvoicedQty> ("InvoicedQty"),
    Field<&OrderLocnLine::OtherQty>    ("OtherQty"),
};
constexpr Lookup OrderLocnLine::kByOrder = {"ByOrder", kOrderId};
constexpr Lookup OrderLocnLine::kByLine  = {"ByLine",  kOrderIdAndLineId};
constexpr Lookup OrderLocnLine::kByLocn  = {"ByLocn",  kOrderIdAndLocnId};
constexpr Lookup kOrderLocnLineLookups[] = {OrderLocnLine::kByOrder, OrderLocnLine::kByLine, OrderLocnLine::kByLocn};
constexpr RecordType OrderLocnLine::kType = {
    "OrderLocnLine", "tbOrderLocnLine", kOrderLocnLineMembers, kOrderLocnLineLookups,
    "The quantity of a product for one location of an order."};

constexpr Member kUnsettledOrderMembers[] = {
    Key<&UnsettledOrder::OrderId>   ("OrderId"),
    Field<&UnsettledOrder::EDIDocId>("EDIDocId"),
    Field<&UnsettledOrder::FileName>("FileName"),
    Field<&UnsettledOrder::BackedUp>("BackedUp"),
};
constexpr std::string_view kUnsettledFileName[] = {"EDIDocId", "FileName"};
constexpr Lookup UnsettledOrder::kByFileName = {"ByFileName", kUnsettledFileName};
constexpr Lookup kUnsettledOrderLookups[] = {UnsettledOrder::kByFileName};
constexpr RecordType UnsettledOrder::kType = {"UnsettledOrder", "tbUnsettledOrder", kUnsettledOrderMembers,
    kUnsettledOrderLookups, "A posted order whose file isn't settled yet, and still holds it."};

// clang-format on

}  // namespace partnerkit
