#include "cli/verbs/demo_packer.h"

#include <algorithm>
#include <memory>

#include "cli/output/command.h"
#include "partnerkit/records.h"
#include "values/format.h"
#include "values/numbers.h"

namespace partnerkit::cli {

namespace {

constexpr double kUnitsInACarton = 16;
constexpr std::int32_t kCarrier = 1;

class Packer {
 public:
  Packer(host::SqlHost& host, const Order& order) : host_(host), order_(order) {}

  std::vector<PackedCarton> Pack() {
    Job job;
    job.OrderId = order_.OrderId;
    job.PackerId = "JM";
    Add(job);
    shipment_.ConNoteNo = "SLH0048213";
    shipment_.CarrierId = kCarrier;
    shipment_.ScheduleDate = shipment_.DeliveryDate = order_.NotBefore;
    shipment_.Weight = 0;
    Add(shipment_);
    OrderLocn probe;
    probe.OrderId = order_.OrderId;
    for (const auto& locn : Select(host_.Records(), OrderLocn::kByOrder, probe)) PackLocation(job, *locn);
    shipment_.Complete = true;
    Update(shipment_);
    host_.Commit(0);
    return std::move(cartons_);
  }

 private:
  template <class R>
  void Add(R& record) {
    if (!partnerkit::Add(host_.Records(), record)) throw Failure("the demo's carton cannot be stored");
  }
  template <class R>
  void Update(const R& record) {
    if (!partnerkit::Update(host_.Records(), record)) throw Failure("the demo's packing cannot be stored");
  }

  void PackLocation(const Job& job, const OrderLocn& locn) {
    PSlip slip;
    slip.JobId = job.JobId;
    slip.OrderLocnId = locn.LocnId;
    slip.StoreCode = locn.ShipToLocn;
    Add(slip);
    room_ = 0;
    OrderLocnLine probe;
    probe.OrderId = order_.OrderId;
    probe.LocnId = locn.LocnId;
    for (const auto& line : Select(host_.Records(), OrderLocnLine::kByLocn, probe)) PackLine(slip, locn, *line);
  }

  void PackLine(const PSlip& slip, const OrderLocn& locn, OrderLocnLine& line) {
    PSlipLine slipLine;
    slipLine.PSlipId = slip.Id;
    slipLine.OrderLocnLineId = line.Id;
    slipLine.APN = line.ProductNo;
    slipLine.OrderQty = slipLine.PackedQty = line.Quantity;
    Add(slipLine);
    for (double left = line.Quantity; left > 0;) {
      if (room_ == 0) OpenCarton(slip, locn);
      const double packed = std::min(left, room_);
      partnerkit::PackLine content;
      content.PackId = cartons_.back().id;
      content.PSlipLineId = slipLine.LineId;
      content.APN = line.ProductNo;
      content.GTIN = line.GTIN;
      content.Quantity = packed;
      Add(content);
      cartons_.back().contents.push_back(NumberText(packed) + " x " + line.ProductNo);
      left -= packed;
      room_ -= packed;
    }
    line.PackedQty = line.Quantity;
    Update(line);
  }

  void OpenCarton(const PSlip& slip, const OrderLocn& locn) {
    partnerkit::Pack carton;
    carton.PSlipId = slip.Id;
    carton.OrderId = order_.OrderId;
    carton.ShipmentId = shipment_.Id;
    carton.VendorId = order_.VendorId;
    carton.ShipToCode = carton.BuyStoreCode = locn.ShipToLocn;
    carton.CarrierId = kCarrier;
    carton.PartnerLocnId = locn.LocnId;
    carton.CartonCount = 1;
    carton.Weight = 8.4;
    Add(carton);
    carton.PackNo = "P-" + std::to_string(carton.Id);
    carton.SSCC = Sscc(carton.Id);
    Update(carton);
    shipment_.Weight = *shipment_.Weight + *carton.Weight;
    cartons_.push_back({carton.Id, *carton.SSCC, {}});
    room_ = kUnitsInACarton;
  }

  host::SqlHost& host_;
  const Order& order_;
  Shipment shipment_;
  double room_ = 0;
  std::vector<PackedCarton> cartons_;
};

}  // namespace

std::string Sscc(std::int32_t serial) {
  std::string digits = "09312345" + Format(static_cast<double>(serial), "000000000");
  int sum = 0;  // by weights of 3 and 1 in turn
  for (std::size_t at = 0; at < digits.size(); ++at) sum += (digits[at] - '0') * (at % 2 == 0 ? 3 : 1);
  return digits + static_cast<char>('0' + (10 - sum % 10) % 10);
}

PackedOrder PackNewestOrder(host::SqlHost& host, const std::string& partnerId) {
  Order newest;
  host::ForEach<Order>(host.Records(), [&](const Order& order) {
    if (order.PartnerId == partnerId) newest = order;
  });
  if (newest.OrderId == 0) return {};
  return {newest.PONo, Packer(host, newest).Pack()};
}

}  // namespace partnerkit::cli
