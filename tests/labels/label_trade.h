// A carton of a shipment and all that hangs from it, with the printers and the port that its label goes to.
#pragma once

#include <deque>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "cli/workspace/label_host.h"
#include "host/sql_session.h"
#include "partnerkit/label.h"
#include "partnerkit/spooling.h"
#include "render/recording_device.h"
#include "support/trading_fixture.h"

namespace partnerkit::testing {

using ::testing::ElementsAre;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::StartsWith;
using Strings = std::vector<std::string>;

// Printers "dock" (at 300 dots an inch) and "office" (at 200), which keep what was delivered.
class KeepingSpooler : public Spooler {
 public:
  Strings jobs;  // "dock PartnerKit.clsCMLSCM: bytes"; of a drawing, a line for each call
  bool shut = false, broken = false, mute = false;  // can't be opened; can't deliver; can't be asked
  std::deque<std::int32_t> queues;                  // what JobCount finds, 0 once it is empty
  int opened = 0, asked = 0;

  std::vector<InstalledPrinter> InstalledPrinters() override {
    return {{"office", 7.199, 7.201}, {"dock", 1440.0 / 300, 1440.0 / 300}};
  }
  std::unique_ptr<RawJob> OpenRaw(const std::string& printer, const std::string& document) override {
    CheckOpen(printer);
    return std::make_unique<Raw>(*this, printer + " " + document);
  }
  std::unique_ptr<DrawingDevice> OpenDrawing(const std::string& printer, const std::string& document) override {
    CheckOpen(printer);
    return std::make_unique<Drawn>(*this, printer + " " + document);
  }
  std::int32_t JobCount(const std::string&) override {
    ++asked;
    if (mute) throw RunTimeError(run_time::kPrinter, "Nobody answers");
    if (queues.empty()) return 0;
    const std::int32_t count = queues.front();
    queues.pop_front();
    return count;
  }

 private:
  struct Raw : RawJob {
    Raw(KeepingSpooler& of, const std::string& job) : spooler(of), name(job) {}
    void Write(std::string_view bytes) override { text += bytes; }
    void Close() override { spooler.Deliver(name, text); }

    KeepingSpooler& spooler;
    std::string name, text;
  };

  struct Drawn : RecordingDevice {
    Drawn(KeepingSpooler& of, const std::string& job) : spooler(of), name(job) {}
    void StartPage(int width, int height) override {
      drawn.push_back("page " + std::to_string(width) + " x " + std::to_string(height));
    }
    void EndDoc() override {
      std::string text;
      for (const std::string& line : drawn) text += line + "\n";
      spooler.Deliver(name, text);
    }

    KeepingSpooler& spooler;
    std::string name;
  };

  void CheckOpen(const std::string& printer) {
    ++opened;
    if (printer != "dock" && printer != "office") throw RunTimeError(run_time::kPrinter, "There is no such printer");
    if (shut) throw RunTimeError(run_time::kPrinter, "The lid is open");
  }
  // One without a byte is no job.
  void Deliver(const std::string& job, const std::string& text) {
    if (broken) throw RunTimeError(run_time::kDeviceError, "Out of paper");
    if (!text.empty()) jobs.push_back(job + ": " + text);
  }
};

// What a batch of the trade's pack holds from its first field to the one ahead of the SSCC's.
inline constexpr std::string_view kBatchFields =
    R"(1,"Acme Apparel"|2,"Brunswick"|3,"VIC"|4,"Linehaul"|5,"CN77"|6,"Altona"|7,"250 Dohertys Rd"|8,"Laverton 3026"|)"
    R"(9,"2510"|10,"Ballarat"|11,"8 Sturt St"|12,"Ballarat East"|13,"3350"|14,"0471"|15,"~2014210363026~201900471"|)"
    R"(16,"(421)0363026(90)0471"|17,"(00)093123450000009015"|18,"PO 4500012345"|19,"AD"|20,"1203"|21,"HOMEWARES"|)";

struct LabelTrade : TradingHost {
  using Settings = std::vector<std::pair<std::string_view, std::string_view>>;

  KeepingSpooler spooler;
  Strings sent;  // to the port: "COM1 bytes"
  bool portGone = false;
  int yields = 0;
  cli::LabelHost labelHost{*system,
                           [this](const std::string& port, std::string_view text) {
                             if (portGone) throw RunTimeError(run_time::kDeviceError, "Device I/O error");
                             sent.push_back(port + " " + std::string(text));
                           },
                           ""};

  Partner vendor = New<Partner>(
      [](auto& r) { r.PartnerId = "ACME", r.Name = "Acme Apparel", r.Suburb = "Brunswick", r.State = "VIC"; });
  PartnerAddress linehaul = New<PartnerAddress>([](auto& r) { r.Name = "Linehaul"; });
  PartnerAddress couriers = New<PartnerAddress>([](auto& r) { r.Name = "Couriers"; });
  // What goes to location 464 is received by 2510, and ends at store 471.
  PartnerLocn shipTo = New<PartnerLocn>([this](auto& r) {
    r.VendorId = "ACME", r.PartnerLocnNo = "464", r.Name = "Geelong", r.ShortName = "Geelong W";
    r.Address1 = "95 Shannon Ave", r.Suburb = "Geelong West", r.Postcode = "3218", r.CountryCode = "554";
    r.DeliverToCode = "2510", r.CarrierId = linehaul.Id;
  });
  PartnerLocn hub = New<PartnerLocn>([this](auto& r) {
    r.VendorId = "ACME", r.PartnerLocnNo = "2510", r.Name = "Altona hub", r.ShortName = "Altona";
    r.Address1 = "250 Dohertys Rd", r.Suburb = "Laverton", r.Postcode = "3026", r.CountryCode = "554";
    r.CarrierId = couriers.Id;
  });
  PartnerLocn store = New<PartnerLocn>([this](auto& r) {
    r.VendorId = "ACME", r.PartnerLocnNo = "471", r.Name = "Ballarat Central", r.ShortName = "Ballarat";
    r.Address1 = "8 Sturt St", r.Suburb = "Ballarat East", r.Postcode = "3350", r.CountryCode = "036";
    r.CarrierId = couriers.Id;
  });
  Order order = New<Order>([](auto& r) {
    r.VendorId = "ACME", r.PartnerId = "CML", r.PONo = "4500012345", r.TypeCode = "SA";
    r.DeptNo = "45", r.Header1 = "1203", r.Header2 = "Homewares", r.Header3 = "Ms. Customer";
  });
  Shipment shipment = New<Shipment>([](auto& r) { r.ConNoteNo = "CN77", r.BillOfLadingNo = "BL88"; });
  Job job = New<Job>([this](auto& r) { r.OrderId = order.OrderId, r.PackerId = "KIM"; });
  PSlip slip = New<PSlip>([this](auto& r) { r.JobId = job.JobId, r.StoreCode = "464"; });
  Pack pack = NewPack("P-1", "471");

  LabelTrade() {
    ports.spooler = &spooler;
    ports.yield = [this] { ++yields; };
  }

  template <class R, class F>
  R New(F fill) {
    R record;
    fill(record);
    return Stored(record);
  }
  Pack NewPack(const std::string& packNo, const std::string& storeCode) {
    return New<Pack>([&](auto& r) {
      r.PackNo = packNo, r.PSlipId = slip.Id, r.OrderId = order.OrderId, r.ShipmentId = shipment.Id;
      r.CarrierId = couriers.Id, r.PackTypeId = "CTN25", r.VendorId = "ACME", r.ShipToCode = "464";
      r.BuyStoreCode = storeCode, r.InvoiceNo = "INV9", r.SSCC = "00093123450000009015";
    });
  }

  void Set(const Settings& settings) {
    for (const auto& [name, value] : settings) system->SetSetting(name, value);
  }
  void Sql(const std::string& statement) { system->Session().Execute(statement); }

  std::unique_ptr<LabelClass> Created() { return CreateLabelClass("PartnerKit.clsCMLSCM", ports); }
  // Bound to the printer, with the job of `Init` taken away.
  std::unique_ptr<LabelClass> Ready(const Settings& settings, const std::string& printer = "dock") {
    Set(settings);
    std::unique_ptr<LabelClass> label = Created();
    EXPECT_TRUE(label->Init(labelHost, printer));
    spooler.jobs.clear();
    sent.clear();
    return label;
  }
  Strings Jobs() { return std::exchange(spooler.jobs, {}); }
};

}  // namespace partnerkit::testing
