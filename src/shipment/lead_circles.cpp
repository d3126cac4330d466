#include "shipment/lead_circles.h"

#include <algorithm>
#include <map>

namespace partnerkit::shipment {

namespace {

// Led packs and their leads, by id.
using Leads = std::map<std::int32_t, std::int32_t>;

void ReadLeads(RecordStore& store, const Pack& probe, Leads& leads) {
  Pack pack;
  const auto keep = [&] {
    if (pack.LeadPackId != 0) leads.emplace(pack.Id, pack.LeadPackId);
    pack = {};
  };
  store.Select(Pack::kType, Pack::kByVendorAndStatus, &probe, [&]() -> void* {
    keep();
    return &pack;
  });
  keep();
}

// The circle that `start` leads into, unless it was met from a lower id. `metFrom` grows by what is met.
std::vector<std::int32_t> CircleFrom(std::int32_t start, const Leads& leads, Leads& metFrom) {
  std::vector<std::int32_t> circle;
  auto at = leads.find(start);
  while (at != leads.end() && metFrom.emplace(at->first, start).second) at = leads.find(at->second);
  if (at == leads.end() || metFrom[at->first] != start) return circle;
  const std::int32_t first = at->first;
  do {
    circle.push_back(at->first);
    at = leads.find(at->second);
  } while (at->first != first);
  return circle;
}

bool Concerns(RecordStore& store, const LeadCircle& circle, std::string_view partnerId) {
  return std::ranges::any_of(circle, [&](const auto& pack) {
    Order order;
    order.OrderId = pack->OrderId;
    return pack->ShipmentId != 0 && Load(store, order) && order.PartnerId == partnerId;
  });
}

std::string Named(const Pack& pack) {
  return std::to_string(pack.Id) + " (PackNo " + pack.PackNo + ", SSCC " + std::string(Str(pack.SSCC)) + ")";
}

}  // namespace

std::vector<LeadCircle> LeadCircles(RecordStore& store, std::string_view vendorId, std::string_view partnerId,
                                    std::int32_t belowStatus) {
  Pack probe;
  probe.VendorId = vendorId;
  Leads leads, metFrom;
  for (probe.Status = 0; probe.Status < belowStatus; ++probe.Status) ReadLeads(store, probe, leads);
  std::vector<LeadCircle> circles;
  for (const auto& [start, lead] : leads) {
    LeadCircle circle;
    for (const std::int32_t id : CircleFrom(start, leads, metFrom)) {
      Pack& pack = *circle.emplace_back(std::make_shared<Pack>());
      pack.Id = id;
      Load(store, pack);
    }
    if (Concerns(store, circle, partnerId)) circles.push_back(std::move(circle));
  }
  return circles;
}

std::string Told(const LeadCircle& circle) {
  if (circle.size() == 1) {
    return "Pack " + Named(*circle.front()) + " leads itself, so that no notice ever holds it: set its LeadPackId to 0";
  }
  std::string packs;
  for (const auto& pack : circle) packs += (packs.empty() ? "" : ", ") + Named(*pack);
  return "Packs " + packs +
         " lead each other, so that no notice ever holds them: set the LeadPackId of the one that is to lead to 0";
}

}  // namespace partnerkit::shipment
