// What fills the columns of a CSV ship notice, by name.
#pragma once

#include <span>
#include <string>
#include <string_view>

#include "shipment/notice_records.h"

namespace partnerkit::shipment {

// How often a field is filled.
enum class Level { kNotice, kPack, kLine };

struct NoticeField {
  std::string_view name;
  Level level;
  // Leaves the value as it is where there is nothing to fill it with and the last one stands. Null: never filled.
  void (*fill)(NoticeRecords& records, std::string& value);
};

// The 38 fields of the norm.
std::span<const NoticeField> UsualNoticeFields();

// Fields that several partners fill otherwise.
namespace fill {
void AsnNo2(NoticeRecords& records, std::string& value);           // "07"
void CompileDateLong(NoticeRecords& records, std::string& value);  // yyyymmdd, as the next three
void DeliveryDateLong(NoticeRecords& records, std::string& value);
void ScheduleDateLong(NoticeRecords& records, std::string& value);
void OrderDateLong(NoticeRecords& records, std::string& value);
void ScheduleDate(NoticeRecords& records, std::string& value);
void FirstInvoiceNo(NoticeRecords& records, std::string& value);
void OrderHeader2(NoticeRecords& records, std::string& value);
void OrderNoLessRelease(NoticeRecords& records, std::string& value);
void OrderNoLessLocation(NoticeRecords& records, std::string& value);
void PalletNo(NoticeRecords& records, std::string& value);
void ShipPackCode(NoticeRecords& records, std::string& value);
void PackageTypeCode(NoticeRecords& records, std::string& value);
void PackWeight(NoticeRecords& records, std::string& value);
void ShipmentWeight(NoticeRecords& records, std::string& value);  // as it stands
void WaitingCartons(NoticeRecords& records, std::string& value);
void WaitingPacks(NoticeRecords& records, std::string& value);
void OrderedProductNo(NoticeRecords& records, std::string& value);
void LineGTIN(NoticeRecords& records, std::string& value);
void LineQuantity(NoticeRecords& records, std::string& value);
void LineBatchNo(NoticeRecords& records, std::string& value);
void LineBestBefore(NoticeRecords& records, std::string& value);
void LineUseBy(NoticeRecords& records, std::string& value);
void LineCount(NoticeRecords& records, std::string& value);
// "164" or "165", by the shipment.
void ShipmentStatusCode(NoticeRecords& records, std::string& value);
}  // namespace fill

// The order number without a release number behind it.
std::string_view LessRelease(std::string_view PONo);

}  // namespace partnerkit::shipment
