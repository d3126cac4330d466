// The columns of the despatch advices by way of a freight forwarder, and what fills them where it isn't the norm.
#pragma once

#include <string_view>

#include "shipment/csv/csv_notice_fields.h"

namespace partnerkit::shipment {

// clang-format off
inline constexpr std::string_view kDespatchAdviceNames[] = {
    "SUPPLIERNO", "CUSTOMERCODE", "SHIPNOTENO", "SHIPNOTEDATE", "SHIPNOTETYPECODE", "SHIPNOTEFUNCTIONCODE",
    "SHIPNOTESTATUS", "CONSIGNMENTNOTENO", "BOOKINGNO", "INVOICENO", "DELIVERYDATE", "DATESHIPPED", "SHIPTOCODE",
    "SHIPMENTWEIGHT", "PARTNERSUPPLIERNO", "SHIPMENTCOUNT", "SHIPMENTPALLETCOUNT", "ORDERNO", "ORDERDATE",
    "ORDERSTATUSCODE", "BUYSTORECODE", "DELREFERENCE", "PALLETTYPECODE", "CONTAINERNO", "PACKAGETYPECODE", "WEIGHT",
    "INHOUSEPRODNO", "GTIN", "TRADEDQUANTITY", "BESTBEFORE", "EXPIRATION", "DETAIL1", "SEQUENTIALLINENO", "SYMBOLOGY",
    "PACKERID", "COST", "DELLINEREF",
};

inline constexpr NoticeField kDespatchAdviceFields[] = {
    {"SHIPNOTEDATE",         Level::kNotice, fill::CompileDateLong},
    {"DELIVERYDATE",         Level::kNotice, fill::DeliveryDateLong},
    {"DATESHIPPED",          Level::kNotice, fill::ScheduleDateLong},
    {"SHIPMENTWEIGHT",       Level::kNotice, fill::ShipmentWeight},
    {"SHIPMENTCOUNT",        Level::kNotice, fill::WaitingCartons},
    {"SHIPMENTPALLETCOUNT",  Level::kNotice, fill::WaitingPacks},
    {"ORDERNO",              Level::kNotice, fill::OrderNoLessLocation},
    {"ORDERDATE",            Level::kNotice, fill::OrderDateLong},
    {"ORDERSTATUSCODE",      Level::kNotice, fill::ShipmentStatusCode},
    {"INVOICENO",            Level::kNotice, fill::FirstInvoiceNo},
    {"WEIGHT",               Level::kPack,   fill::PackWeight},
    {"INHOUSEPRODNO",        Level::kLine,   fill::OrderedProductNo},
    {"GTIN",                 Level::kLine,   fill::LineGTIN},
    {"TRADEDQUANTITY",       Level::kLine,   fill::LineQuantity},
    {"BESTBEFORE",           Level::kLine,   fill::LineBestBefore},
    {"EXPIRATION",           Level::kLine,   fill::LineUseBy},
    {"DETAIL1",              Level::kLine,   fill::LineBatchNo},
    {"SEQUENTIALLINENO",     Level::kLine,   fill::LineCount},
};
// clang-format on

}  // namespace partnerkit::shipment
