// The yardstick for ship notices: reads the rows that the notices of STORE are made of through SQLite's own C
// interface, statements prepared once, and writes the same bytes to OUTPUT, a durable addition for each notice.
//   bare_notice read|stamp STORE OUTPUT
// stamp: each notice is stored as well and its packs and shipment stamped, in one durable transaction.
#include <fcntl.h>
#include <sqlite3.h>
#include <unistd.h>

#include <array>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "bare_sqlite.h"
#include "stopwatch.h"

namespace {

std::string Shown(const char* format, double number) {
  std::array<char, 40> text{};
  std::snprintf(text.data(), text.size(), format, number);
  return text.data();
}

// "2006-03-20" as 060320.
std::string ShortDate(std::string_view iso) {
  return std::string(iso.substr(2, 2)).append(iso.substr(5, 2)).append(iso.substr(8, 2));
}

struct Waiting {
  std::int64_t id, shipment, order, slip;
  std::string shipTo, store, invoice, sscc, type;
  double weight;
};

class Notices {
 public:
  Notices(const Database& database, const char* output, bool stamps)
      : database_(database), stamps_(stamps), output_(open(output, O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0666)) {
    if (output_ == -1) throw std::runtime_error("the output cannot be opened");
  }
  ~Notices() { close(output_); }
  Notices(const Notices&) = delete;
  Notices& operator=(const Notices&) = delete;

  std::size_t Write() {
    const std::vector<Waiting> packs = Packs();
    for (std::size_t first = 0, last = 0; first < packs.size(); first = last) {
      while (last < packs.size() && packs[last].shipment == packs[first].shipment &&
             packs[last].order == packs[first].order) {
        ++last;
      }
      WriteNotice({packs.data() + first, packs.data() + last});
    }
    return packs.size();
  }

 private:
  struct Packed {
    const Waiting* first;
    const Waiting* behind;
    const Waiting* begin() const { return first; }
    const Waiting* end() const { return behind; }
  };

  std::vector<Waiting> Packs() {
    Query packs(
        database_,
        "SELECT Id,ShipmentId,OrderId,PSlipId,ShipToCode,BuyStoreCode,InvoiceNo,SSCC,PackTypeId,Weight FROM tbPack "
        "WHERE VendorId='ACME' AND Status<8 AND LeadPackId=0 AND OrderId IN (SELECT OrderId FROM tbOrder WHERE "
        "PartnerId='MGB') ORDER BY ShipmentId,OrderId,ShipToCode,Id");
    std::vector<Waiting> all;
    while (packs.Step()) {
      all.push_back({packs.Whole(0), packs.Whole(1), packs.Whole(2), packs.Whole(3), std::string(packs.Text(4)),
                     std::string(packs.Text(5)), std::string(packs.Text(6)), std::string(packs.Text(7)),
                     std::string(packs.Text(8)), packs.Real(9)});
    }
    return all;
  }

  bool OrderComplete(std::int64_t shipment, std::int64_t order) {
    return !openLines_.With(order).Step() && !openSlips_.With(shipment, order).Step();
  }

  // The columns in front of those of the pack, and between these and those of the line.
  void ReadHead(const Waiting& pack) {
    if (!shipment_.With(pack.shipment).Step() || !order_.With(pack.order).Step()) {
      throw std::runtime_error("a pack without shipment or order");
    }
    const std::string number = std::to_string(++number_);
    head_ = "ACMETOYS,MGBSTORES," + number + ",060308,1015,00,";
    head_ += OrderComplete(pack.shipment, pack.order) ? "CC," : "PR,";
    head_.append(order_.Text(2)).append(",").append(order_.Text(3)).append(",");
    head_.append(shipment_.Text(0)).append(",").append(shipment_.Text(1)).append(",");
    head_ += ShortDate(shipment_.Text(2)) + "," + ShortDate(shipment_.Text(3)) + ",";
    weights_ = Shown("%.2f", shipment_.Real(4)) + "," + Shown("%.15g", shipment_.Real(5)) + ",";
    weights_.append(order_.Text(0)).append(",").append(ShortDate(order_.Text(1))).append(",");
  }

  void AddPack(const Waiting& pack) {
    type_.With(std::string_view(pack.type)).Step();
    slip_.With(pack.slip).Step();
    std::string line = head_ + pack.shipTo + ",";
    line.append(type_.Text(0)).append(",").append(weights_).append(slip_.Text(0));
    line += ",," + pack.store + "," + pack.invoice + ",," + pack.invoice + "," + pack.sscc + ",";
    line.append(type_.Text(1)).append("," + Shown("%.2f", pack.weight) + ",");
    for (const int measure : {2, 3, 4}) line += Shown("%.15g", type_.Real(measure)) + ",";
    lines_.With(pack.id);
    while (lines_.Step()) {
      text_.append(line).append(lines_.Text(0)).append(",").append(lines_.Text(1)).append(",,,");
      text_.append(Shown("%.15g", lines_.Real(2)) + "," + Shown("%.15g", lines_.Real(3)) + ",");
      text_.append(lines_.Text(4)).append(",\r\n");
    }
  }

  void WriteNotice(Packed packs) {
    text_.clear();
    ReadHead(*packs.first);
    for (const Waiting& pack : packs) AddPack(pack);
    if (write(output_, text_.data(), text_.size()) != static_cast<ssize_t>(text_.size()) || fdatasync(output_) != 0) {
      throw std::runtime_error("the output cannot be written");
    }
    if (stamps_) Stamp(packs);
  }

  void Stamp(Packed packs) {
    database_.Run("BEGIN IMMEDIATE");
    addNotice_.With(std::string_view(std::to_string(number_)), packs.first->shipment, packs.first->order).Step();
    const std::int64_t id = sqlite3_last_insert_rowid(database_.Handle());
    for (const Waiting& pack : packs) stampPack_.With(id, pack.id).Step();
    stampShipment_.With(packs.first->shipment).Step();
    database_.Run("COMMIT");
  }

  const Database& database_;
  bool stamps_;
  int output_;
  std::int64_t number_ = 1000;
  std::string head_, weights_, text_;
  Query shipment_{database_,
                  "SELECT ConNoteNo,BookingNo,ScheduleDate,DeliveryDate,Weight,Volume FROM tbShipment WHERE "
                  "Id=?"};
  Query order_{database_, "SELECT PONo,PODate,CompanyCode,PartnerSupplierNo FROM tbOrder WHERE OrderId=?"};
  Query openLines_{database_, "SELECT 1 FROM tbOrderLocnLine WHERE OrderId=? AND Quantity>PackedQty"};
  Query openSlips_{database_,
                   "SELECT 1 FROM tbPSlipLine WHERE PSlipId IN (SELECT PSlipId FROM tbPack WHERE ShipmentId=? "
                   "AND OrderId=?) AND OrderQty>PackedQty"};
  Query type_{database_, "SELECT ShipPackCode,PackageTypeCode,Length,Width,Height FROM tbPackType WHERE PackTypeId=?"};
  Query slip_{database_, "SELECT j.PackerId FROM tbPSlip s JOIN tbJob j ON j.JobId=s.JobId WHERE s.Id=?"};
  Query lines_{database_,
               "SELECT p.InHouseProdNo,l.APN,l.Quantity,o.Cost,s.LineRef FROM tbPackLine l "
               "LEFT JOIN tbProduct p ON p.ProductNo=l.APN "
               "LEFT JOIN tbPSlipLine s ON s.LineId=l.PSlipLineId "
               "LEFT JOIN tbOrderLocnLine q ON q.Id=s.OrderLocnLineId "
               "LEFT JOIN tbOrderLine o ON o.LineId=q.LineId WHERE l.PackId=? ORDER BY l.Id"};
  Query addNotice_{database_,
                   "INSERT INTO tbASN(ASNNo,VendorId,PartnerId,ShipmentId,OrderId) "
                   "VALUES(?,'ACME','MGB',?,?)"};
  Query stampPack_{database_, "UPDATE tbPack SET ASNId=?,Status=8 WHERE Id=?"};
  Query stampShipment_{database_, "UPDATE tbShipment SET Status=8 WHERE Id=?"};
};

}  // namespace

int main(int count, char** arguments) {
  const std::string_view form = count == 4 ? arguments[1] : "";
  if (form != "read" && form != "stamp") {
    std::fputs("usage: bare_notice read|stamp STORE OUTPUT\n", stderr);
    return 2;
  }
  try {
    const Stopwatch watch;
    const Database database(arguments[2]);
    database.Run("PRAGMA journal_mode=WAL");
    database.Run("PRAGMA synchronous=FULL");
    Notices notices(database, arguments[3], form == "stamp");
    const std::size_t packs = notices.Write();
    std::printf("{\"packs\": %zu, \"seconds\": %.6f, \"busy\": %.6f}\n", packs, watch.Elapsed(), watch.Busy());
    return 0;
  } catch (const std::exception& error) {
    std::fprintf(stderr, "bare_notice: %s\n", error.what());
    return 1;
  }
}
