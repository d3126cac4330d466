// What happens to an order after import: packing, shipping and the notice of it.
#include "partnerkit/records.h"

namespace partnerkit {

// clang-format off
// Members of the look-ups.
constexpr std::string_view kOrderId[]              = {"OrderId"};
constexpr std::string_view kJobId[]                = {"JobId"};
constexpr std::string_view kOrderLocnId[]          = {"OrderLocnId"};
constexpr std::string_view kPSlipId[]              = {"PSlipId"};
constexpr std::string_view kOrderLocnLineId[]      = {"OrderLocnLineId"};
constexpr std::string_view kPartnerIdAndASNNo[]    = {"PartnerId", "ASNNo"};
constexpr std::string_view kVendorIdAndPartnerId[] = {"VendorId", "PartnerId"};
constexpr std::string_view kFileName[]             = {"FileName"};
constexpr std::string_view kShipmentId[]           = {"ShipmentId"};
constexpr std::string_view kInterchangeNo[]        = {"InterchangeNo"};
constexpr std::string_view kGroupNo[]              = {"GroupNo"};
constexpr std::string_view kASNId[]                = {"ASNId"};
constexpr std::string_view kLeadPackId[]           = {"LeadPackId"};
constexpr std::string_view kVendorIdAndStatus[]    = {"VendorId", "Status"};
constexpr std::string_view kPackId[]               = {"PackId"};
constexpr std::string_view kPSlipLineId[]          = {"PSlipLineId"};

constexpr Member kJobMembers[] = {
    Id<&Job::JobId>      ("JobId"),
    Owner<&Job::OrderId> ("OrderId", "Order"),
    Field<&Job::PackerId>("PackerId"),
};
constexpr Lookup Job::kByOrder = {"ByOrder", kOrderId};
constexpr Lookup kJobLookups[] = {Job::kByOrder};
constexpr RecordType Job::kType = {"Job", "tbJob", kJobMembers, kJobLookups, "A packing job for an order."};

constexpr Member kPSlipMembers[] = {
    Id<&PSlip::Id>           ("Id"),
    Owner<&PSlip::JobId>     ("JobId",       "Job"),
    Link<&PSlip::OrderLocnId>("OrderLocnId", "OrderLocn"),
    Field<&PSlip::StoreCode> ("StoreCode"),
    Field<&PSlip::SlipRef1>  ("SlipRef1"),
    Field<&PSlip::SlipRef2>  ("SlipRef2"),
};
constexpr Lookup PSlip::kByJob       = {"ByJob",       kJobId};
constexpr Lookup PSlip::kByOrderLocn = {"ByOrderLocn", kOrderLocnId};
constexpr Lookup kPSlipLookups[] = {PSlip::kByJob, PSlip::kByOrderLocn};
constexpr RecordType PSlip::kType = {"PSlip", "tbPSlip", kPSlipMembers, kPSlipLookups,
    "A packing slip: the part of a job for one location."};

constexpr Member kPSlipLineMembers[] = {
    Id<&PSlipLine::LineId>           ("LineId"),
    Owner<&PSlipLine::PSlipId>       ("PSlipId",         "PSlip"),
    Link<&PSlipLine::OrderLocnLineId>("OrderLocnLineId", "OrderLocnLine"),
    Field<&PSlipLine::APN>           ("APN"),
    Field<&PSlipLine::ScanCode>      ("ScanCode"),
    Field<&PSlipLine::StyleText>     ("StyleText"),
    Field<&PSlipLine::LineRef>       ("LineRef"),
    Field<&PSlipLine::OrderQty>      ("OrderQty"),
    Field<&PSlipLine::PackedQty>     ("PackedQty"),
    Field<&PSlipLine::PackedCount>   ("PackedCount"),
};
constexpr Lookup PSlipLine::kByPSlip         = {"ByPSlip",         kPSlipId};
constexpr Lookup PSlipLine::kByOrderLocnLine = {"ByOrderLocnLine", kOrderLocnLineId};
constexpr Lookup kPSlipLineLookups[] = {PSlipLine::kByPSlip, PSlipLine::kByOrderLocnLine};
constexpr RecordType PSlipLine::kType = {"PSlipLine", "tbPSlipLine", kPSlipLineMembers, kPSlipLineLookups,
    "A product on a packing slip."};

constexpr Member kShipmentMembers[] = {
    Id<&Shipment::Id>                 ("Id"),
    Field<&Shipment::Status>          ("Status"),
    Field<&Shipment::ConNoteNo>       ("ConNoteNo"),
    Field<&Shipment::BookingNo>       ("BookingNo"),
    Field<&Shipment::BillOfLadingNo>  ("BillOfLadingNo"),
    Link<&Shipment::CarrierId>        ("CarrierId", "PartnerAddress"),
    Field<&Shipment::CarrierCode>     ("CarrierCode"),
    Field<&Shipment::DeliveryLocnCode>("DeliveryLocnCode"),
    Field<&Shipment::ScheduleDate>    ("ScheduleDate"),
    Field<&Shipment::DeliveryDate>    ("DeliveryDate"),
    Field<&Shipment::Weight>          ("Weight"),
    Field<&Shipment::Volume>          ("Volume"),
    Field<&Shipment::Complete>        ("Complete"),
};
constexpr RecordType Shipment::kType = {"Shipment", "tbShipment", kShipmentMembers, {}, "A consignment of packs."};

constexpr Member kASNMembers[] = {
    Id<&ASN::Id>                 ("Id"),
    Field<&ASN::ASNNo>           ("ASNNo"),
    Field<&ASN::VendorId>        ("VendorId"),
    Field<&ASN::PartnerId>       ("PartnerId"),
    Link<&ASN::ShipmentId>       ("ShipmentId", "Shipment"),
    Link<&ASN::OrderId>          ("OrderId",    "Order"),
    Field<&ASN::OrderNo>         ("OrderNo"),
    Field<&ASN::PartnerName>     ("PartnerName"),
    Field<&ASN::PartnerLocnId>   ("PartnerLocnId"),
    Field<&ASN::ShipToCode>      ("ShipToCode"),
    Field<&ASN::DeliveryLocn>    ("DeliveryLocn"),
    Field<&ASN::ConNoteNo>       ("ConNoteNo"),
    Field<&ASN::InterchangeNo>   ("InterchangeNo"),
    Field<&ASN::GroupNo>         ("GroupNo"),
    Field<&ASN::TransactionNo>   ("TransactionNo"),
    Field<&ASN::CompileDate>     ("CompileDate"),
    Field<&ASN::TransmitDate>    ("TransmitDate"),
    Field<&ASN::AcknowledgedDate>("AcknowledgedDate"),
};
constexpr Lookup ASN::kByNumber           = {"ByNumber",           kPartnerIdAndASNNo};
constexpr Lookup ASN::kByVendorAndPartner = {"ByVendorAndPartner", kVendorIdAndPartnerId};
constexpr Lookup ASN::kByShipment         = {"ByShipment",         kShipmentId};
constexpr Lookup ASN::kByInterchangeNo    = {"ByInterchangeNo",    kInterchangeNo};
constexpr Lookup ASN::kByGroupNo          = {"ByGroupNo",          kGroupNo};
constexpr Lookup kASNLookups[] = {
    ASN::kByNumber, ASN::kByVendorAndPartner, ASN::kByShipment,
    ASN::kByInterchangeNo, ASN::kByGroupNo,
};
constexpr RecordType ASN::kType = {"ASN", "tbASN", kASNMembers, kASNLookups,
    "A ship notice: one shipment of one order, as told to the partner."};

constexpr Member kPendingNoticeMembers[] = {
    Id<&PendingNotice::Id>             ("Id"),
    Field<&PendingNotice::VendorId>    ("VendorId"),
    Field<&PendingNotice::PartnerId>   ("PartnerId"),
    Field<&PendingNotice::ASNNo>       ("ASNNo"),
    Field<&PendingNotice::FileName>    ("FileName"),
    Field<&PendingNotice::NewFile>     ("NewFile"),
    Field<&PendingNotice::LengthBefore>("LengthBefore"),
    Field<&PendingNotice::LengthAdded> ("LengthAdded"),
};
constexpr Lookup PendingNotice::kByVendorAndPartner = {"ByVendorAndPartner", kVendorIdAndPartnerId};
constexpr Lookup PendingNotice::kByFileName         = {"ByFileName",         kFileName};
constexpr Lookup kPendingNoticeLookups[] = {PendingNotice::kByVendorAndPartner, PendingNotice::kByFileName};
constexpr RecordType PendingNotice::kType = {"PendingNotice", "tbPendingNotice", kPendingNoticeMembers,
    kPendingNoticeLookups, "A file that a notice is being written to, until the notice is stored."};

constexpr Member kPackMembers[] = {
    Id<&Pack::Id>              ("Id"),
    Field<&Pack::PackNo>       ("PackNo"),
    Link<&Pack::PSlipId>       ("PSlipId",    "PSlip"),
    Link<&Pack::OrderId>       ("OrderId",    "Order"),
    Link<&Pack::ShipmentId>    ("ShipmentId", "Shipment"),
    Link<&Pack::ASNId>         ("ASNId",      "ASN"),
    Link<&Pack::LeadPackId>    ("LeadPackId", "Pack"),
    Link<&Pack::CarrierId>     ("CarrierId",  "PartnerAddress"),
    Link<&Pack::PackTypeId>    ("PackTypeId", "PackType"),
    Field<&Pack::Status>       ("Status"),
    Field<&Pack::VendorId>     ("VendorId"),
    Field<&Pack::ShipToCode>   ("ShipToCode"),
    Field<&Pack::BuyStoreCode> ("BuyStoreCode"),
    Field<&Pack::PartnerLocnId>("PartnerLocnId"),
    Field<&Pack::InvoiceNo>    ("InvoiceNo"),
    Field<&Pack::PalletNo>     ("PalletNo"),
    Field<&Pack::SSCC>         ("SSCC"),
    Field<&Pack::CartonCount>  ("CartonCount"),
    Field<&Pack::Weight>       ("Weight"),
};
constexpr Lookup Pack::kByShipment        = {"ByShipment",        kShipmentId};
constexpr Lookup Pack::kByOrder           = {"ByOrder",           kOrderId};
constexpr Lookup Pack::kByASN             = {"ByASN",             kASNId};
constexpr Lookup Pack::kByLeadPack        = {"ByLeadPack",        kLeadPackId};
constexpr Lookup Pack::kByPSlip           = {"ByPSlip",           kPSlipId};
constexpr Lookup Pack::kByVendorAndStatus = {"ByVendorAndStatus", kVendorIdAndStatus};
constexpr Lookup kPackLookups[] = {
    Pack::kByShipment, Pack::kByOrder, Pack::kByASN,
    Pack::kByLeadPack, Pack::kByPSlip, Pack::kByVendorAndStatus,
};
constexpr RecordType Pack::kType = {"Pack", "tbPack", kPackMembers, kPackLookups, "A carton or pallet."};

constexpr Member kPackLineMembers[] = {
    Id<&PackLine::Id>               ("Id"),
    Owner<&PackLine::PackId>        ("PackId",      "Pack"),
    Link<&PackLine::PSlipLineId>    ("PSlipLineId", "PSlipLine"),
    Field<&PackLine::APN>           ("APN"),
    Field<&PackLine::GTIN>          ("GTIN"),
    Field<&PackLine::Quantity>      ("Quantity"),
    Field<&PackLine::BatchNo>       ("BatchNo"),
    Field<&PackLine::UseByDate>     ("UseByDate"),
    Field<&PackLine::BestBeforeDate>("BestBeforeDate"),
    Field<&PackLine::ExpiryDate>    ("ExpiryDate"),
};
constexpr Lookup PackLine::kByPack      = {"ByPack",      kPackId};
constexpr Lookup PackLine::kByPSlipLine = {"ByPSlipLine", kPSlipLineId};
constexpr Lookup kPackLineLookups[] = {PackLine::kByPack, PackLine::kByPSlipLine};
constexpr RecordType PackLine::kType = {"PackLine", "tbPackLine", kPackLineMembers, kPackLineLookups,
    "A product in a pack."};

// clang-format on

}  // namespace partnerkit
