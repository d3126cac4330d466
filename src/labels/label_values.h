// What a carton's label says: the short texts that every printer language places.
#pragma once

#include <string>

namespace partnerkit::labels {

struct LabelValues {
  // The sender.
  std::string FromName, FromSuburb, FromState;
  // The carrier and its papers.
  std::string CarrierName, ConNoteNo, BillOfLadingNo;
  // The delivery point.
  std::string ToName, ToAddress, ToSuburb, ToPostcode, ToLocnNo;
  // The final store, or the customer.
  std::string ForName, ForLocnName, ForAddress, ForSuburb, ForPostcode, ForLocnNo;
  std::string FinalLocnNo, CountryCode;  // as the barcodes have it: application identifiers (90) and (421)
  // The carton and its order.
  std::string SSCCText, POText, ADFlag, ADDate, DeptText, DeptCapitals, PalletText;
  // Free lines, and the zone or department that some languages print.
  std::string User1, User2, StoreZoneDept, StoreZoneCapitals;
  // One component of several.
  std::string ComponentItem, ComponentCount, ComponentStyle;
  // The packet that carries them.
  std::string FormatNo, Qty, BatchControl;
};

// The value of that name; null when there is none.
std::string LabelValues::*ValueNamed(std::string_view name);

}  // namespace partnerkit::labels
