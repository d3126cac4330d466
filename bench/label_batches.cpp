// How long the labels of cartons take whose records are in memory:
//   label_batches packets COUNT      the batch packets, each with a free line of its own
//   label_batches fwrite COUNT FILE  the same packets, made before, written one by one to a new file
//   label_batches run COUNT          a whole run of PrintAllLabels, from the records to the print job
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include "partnerkit/catalogue.h"
#include "partnerkit/drawing.h"
#include "partnerkit/label.h"
#include "partnerkit/memory_host.h"
#include "partnerkit/platform.h"
#include "partnerkit/spooling.h"
#include "stopwatch.h"

namespace {

using namespace partnerkit;

class Warehouse : public MemoryHost {
 public:
  std::optional<std::string> Setting(std::string_view name) override {
    if (name == "PrinterLanguage") return "LBXII";
    if (name == "BatchControl") return "1";
    if (name == "LabelUserField") return "JOB";
    return std::nullopt;
  }
};

// One printer, which counts what it gets.
class CountingSpooler : public Spooler {
 public:
  std::size_t bytes = 0;

  std::vector<InstalledPrinter> InstalledPrinters() override { return {}; }
  std::unique_ptr<RawJob> OpenRaw(const std::string&, const std::string&) override {
    return std::make_unique<Job>(bytes);
  }
  std::unique_ptr<DrawingDevice> OpenDrawing(const std::string&, const std::string&) override { return nullptr; }
  std::int32_t JobCount(const std::string&) override { return 0; }

 private:
  struct Job : RawJob {
    explicit Job(std::size_t& count) : bytes(count) {}
    void Write(std::string_view text) override { bytes += text.size(); }
    void Close() override {}
    std::size_t& bytes;
  };
};

template <class R, class F>
std::int32_t New(RecordStore& store, std::int32_t R::*id, F fill) {
  R record;
  fill(record);
  if (!Add(store, record)) throw std::runtime_error("the records cannot be stored");
  return record.*id;
}

void NewLocation(RecordStore& store, const std::string& number, const char* name, const char* through) {
  PartnerLocn locn;
  locn.VendorId = "ACME", locn.PartnerLocnNo = number, locn.Name = locn.ShortName = locn.Suburb = name;
  locn.Address1 = "250 Dohertys Road", locn.Postcode = "3026", locn.CountryCode = "036", locn.DeliverToCode = through;
  if (!Add(store, locn)) throw std::runtime_error("the records cannot be stored");
}

class Labels {
 public:
  Labels() {
    ports_.spooler = &spooler_;
    label_ = CreateLabelClass("PartnerKit.clsCMLSCM", ports_);
    Partner vendor;
    vendor.PartnerId = "ACME", vendor.Name = "Acme Apparel", vendor.Suburb = "Brunswick", vendor.State = "VIC";
    if (!Add(store_, vendor)) throw std::runtime_error("the records cannot be stored");
    NewLocation(store_, "2510", "Laverton North", "");
    NewLocation(store_, "0464", "Geelong West", "2510");
    NewLocation(store_, "0471", "Ballarat Central", "2510");
    pack_.OrderId = New(store_, &Order::OrderId, [](Order& r) {
      r.VendorId = "ACME", r.PONo = "73014455 REL# 2", r.TypeCode = "SA", r.Header1 = "1203", r.Header2 = "HOMEWARES";
    });
    pack_.ShipmentId = New(store_, &Shipment::Id, [](Shipment& r) { r.ConNoteNo = "SLH0048213"; });
    const std::int32_t job = New(store_, &Job::JobId, [](Job& r) { r.PackerId = "KIM"; });
    pack_.PSlipId = New(store_, &PSlip::Id, [&](PSlip& r) { r.JobId = job; });
    pack_.VendorId = "ACME", pack_.ShipToCode = "0464", pack_.SSCC = "093123450000009015";
    if (!label_->Init(host_, "dock")) throw std::runtime_error("Init failed");
  }

  LabelClass& Class() { return *label_; }

  void PrintOne() {
    if (!label_->PrintLabel(pack_)) throw std::runtime_error("PrintLabel failed");
  }

  // A new store every hundred cartons.
  std::vector<Pack> Packs(std::size_t count) const {
    std::vector<Pack> packs(count, pack_);
    for (std::size_t n = 0; n < count; ++n) {
      packs[n].PackNo = "P-" + std::to_string(n);
      packs[n].BuyStoreCode = n / 100 % 2 == 0 ? "0464" : "0471";
    }
    return packs;
  }

  std::size_t BytesPrinted() const { return spooler_.bytes; }

 private:
  Warehouse host_;
  RecordStore& store_ = host_.Records();
  CountingSpooler spooler_;
  Ports ports_ = platform::DefaultPorts();
  std::unique_ptr<LabelClass> label_;
  Pack pack_;
};

std::string Packet(LabelClass& label, std::size_t n) {
  label.SetUser1("PACK ID P-" + std::to_string(n));
  return label.LBXIIBatchCommand();
}

void Tell(std::size_t bytes, const Stopwatch& watch) {
  const double seconds = watch.Elapsed(), busy = watch.Busy();
  std::printf("{\"bytes\": %zu, \"seconds\": %.6f, \"busy\": %.6f}\n", bytes, seconds, busy);
}

void MakePackets(Labels& labels, std::size_t count) {
  const Stopwatch watch;
  std::size_t bytes = 0;
  for (std::size_t n = 0; n < count; ++n) bytes += Packet(labels.Class(), n).size();
  Tell(bytes, watch);
}

void WritePackets(Labels& labels, std::size_t count, const char* name) {
  std::vector<std::string> packets;
  for (std::size_t n = 0; n < count; ++n) packets.push_back(Packet(labels.Class(), n));
  const Stopwatch watch;
  const std::unique_ptr<std::FILE, int (*)(std::FILE*)> file{std::fopen(name, "wb"), std::fclose};
  std::size_t bytes = 0;
  for (const std::string& packet : packets) {
    bytes += file == nullptr ? 0 : std::fwrite(packet.data(), 1, packet.size(), file.get());
  }
  if (file == nullptr || std::fflush(file.get()) != 0) throw std::runtime_error("the file cannot be written");
  Tell(bytes, watch);
}

void RunAll(Labels& labels, std::size_t count) {
  const std::vector<Pack> packs = labels.Packs(count);
  const Stopwatch watch;
  if (!labels.Class().PrintAllLabels(packs, true)) throw std::runtime_error("PrintAllLabels failed");
  Tell(labels.BytesPrinted(), watch);
}

}  // namespace

int main(int count, char** arguments) {
  const std::string_view what = count > 2 ? arguments[1] : "";
  const std::size_t cartons = count > 2 ? std::strtoul(arguments[2], nullptr, 10) : 0;
  if (cartons == 0 || (what != "packets" && what != "run" && (what != "fwrite" || count != 4))) {
    std::fputs("usage: label_batches packets|run COUNT, label_batches fwrite COUNT FILE\n", stderr);
    return 2;
  }
  try {
    Labels labels;
    labels.PrintOne();
    if (what == "packets") {
      MakePackets(labels, cartons);
    } else if (what == "run") {
      RunAll(labels, cartons);
    } else {
      WritePackets(labels, cartons, arguments[3]);
    }
    return 0;
  } catch (const std::exception& error) {
    std::fprintf(stderr, "label_batches: %s\n", error.what());
    return 1;
  }
}
