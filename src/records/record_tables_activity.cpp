// Product activity reports and the run log.
#include "partnerkit/records.h"

namespace partnerkit {

// clang-format off
constexpr Member kPADRecordMembers[] = {
    Key<&PADRecord::CompanyEDIAddr>("CompanyEDIAddr"),
    Key<&PADRecord::PartnerEDIAddr>("PartnerEDIAddr"),
    Field<&PADRecord::SupplierNo>  ("SupplierNo"),
    Field<&PADRecord::ToDate>      ("ToDate"),
};
constexpr RecordType PADRecord::kType = {"PADRecord", "tbPADRecord", kPADRecordMembers, {},
    "Product activity reports between two EDI addresses: how far they were read."};

constexpr Member kPADItemMembers[] = {
    Key<&PADItem::VendorId>      ("VendorId"),
    Key<&PADItem::LocationNo>    ("LocationNo"),
    Key<&PADItem::ProductNo>     ("ProductNo"),
    Field<&PADItem::ActivityDate>("ActivityDate"),
    Field<&PADItem::StockOnHand> ("StockOnHand"),
    Field<&PADItem::OnOrderQty>  ("OnOrderQty"),
};
constexpr RecordType PADItem::kType = {"PADItem", "tbPADItem", kPADItemMembers, {},
    "Current stock of a product at a location, as the partner reports it."};

constexpr Member kPADStoreMembers[] = {
    Key<&PADStore::VendorId>        ("VendorId"),
    Key<&PADStore::LocationNo>      ("LocationNo"),
    Key<&PADStore::ProductNo>       ("ProductNo"),
    Key<&PADStore::FromDate>        ("FromDate"),
    Key<&PADStore::ToDate>          ("ToDate"),
    Field<&PADStore::CommodityGroup>("CommodityGroup"),
    Field<&PADStore::StockOnHand>   ("StockOnHand"),
    Field<&PADStore::SalesQty>      ("SalesQty"),
    Field<&PADStore::OnOrderQty>    ("OnOrderQty"),
};
constexpr RecordType PADStore::kType = {"PADStore", "tbPADStore", kPADStoreMembers, {},
    "One period's activity of a product at a location."};

constexpr Member kLogMembers[] = {
    Id<&Log::LogId>          ("LogId"),
    Field<&Log::LogDate>     ("LogDate"),
    Field<&Log::UserId>      ("UserId"),
    Field<&Log::ComputerName>("ComputerName"),
    Field<&Log::Source>      ("Source"),
    Field<&Log::Procedure>   ("Procedure"),
    Field<&Log::ErrorNumber> ("ErrorNumber"),
    Field<&Log::NativeError> ("NativeError"),
    Field<&Log::Message>     ("Message"),
};
constexpr RecordType Log::kType = {"Log", "tbLog", kLogMembers, {}, "What a class had to say, in the order written."};

// clang-format on

}  // namespace partnerkit
