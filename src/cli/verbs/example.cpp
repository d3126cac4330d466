#include "cli/verbs/example.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <optional>
#include <sstream>
#include <string_view>
#include <vector>

#include "cli/output/json_writer.h"
#include "cli/output/table.h"
#include "cli/output/text.h"
#include "cli/verbs/demo_packer.h"
#include "cli/workspace/demo_files.h"
#include "partnerkit/catalogue.h"

namespace partnerkit::cli {

namespace {

namespace fs = std::filesystem;
using json = nlohmann::ordered_json;

// A class whose work begins with a packed order: the class of the partner's orders, whose sample has the partner and
// its products, one more class whose sample belongs to it, and the sample map that its notices take their columns from.
struct AfterPacking {
  std::string_view progId, orders, besides = {}, map = {};
};

// clang-format off
constexpr AfterPacking kAfterPacking[] = {
    {"PartnerKit.clsMGB856csv",         "PartnerKit.clsMGB850csv"},
    {"PartnerKit.clsTarget856csv",      "PartnerKit.clsTarget850csv"},
    {"PartnerKit.clsKMart856csv",       "PartnerKit.clsKMart850csv"},
    {"PartnerKit.clsOfficeworks856csv", "PartnerKit.clsOfficeworks850csv"},
    {"PartnerKit.clsMGBBT856csv",       "PartnerKit.clsMGBBT850csv"},
    {"PartnerKit.clsMYERDropShipDAcsv", "PartnerKit.clsMYERDropShipPOcsv"},
    {"PartnerKit.clsTargetBulkDAcsv",   "PartnerKit.clsTargetBulkPOcsv",   {}, "maps/cmlflfda.map"},
    {"PartnerKit.clsCMLFLFDAcsv",       "PartnerKit.clsCMLFLFPOcsv",       "PartnerKit.clsCMLFLFDAcsv"},
    {"PartnerKit.clsCMLSCM",            "PartnerKit.clsCMLFLFPOcsv",       "PartnerKit.clsCMLFLFDAcsv"},
};
// clang-format on

// Columns that every CSV notice but the freight forwarders' knows; a partner's own translator asks for more, in an
// order of its own.
constexpr std::string_view kNoticeMap =
    "SUPPLIERNO\nCUSTOMERCODE\nSHIPNOTENO\nSHIPNOTEDATE\nSHIPNOTETYPECODE\nCONSIGNMENTNOTENO\nDELIVERYDATE\nSHIPTOCODE"
    "\n"
    "ORDERNO\nORDERDATE\nORDERSTATUSCODE\nBUYSTORECODE\nCONTAINERNO\nPACKAGETYPECODE\nINHOUSEPRODNO\nAPN\n"
    "QUANTITYSHIPPED\nPACKERID\n";

// Notices' documents are numbered behind those of the orders.
constexpr std::int32_t kNoticeDocuments = 20;
// The packed order's ids, a hundred for each partner, are out of the way of a supplier's own.
constexpr std::int32_t kPackedIds = 900'000;

struct NamedText {
  std::string path;
  std::string_view text;
};

struct Example {
  json records;
  std::vector<NamedText> files;  // beside the records
  std::int32_t document = 0;
  std::vector<std::int32_t> packs;
};

std::string ShortName(const PublicClass& of) { return std::string(of.progId.substr(of.progId.find('.') + 1)); }

const DemoFile* FindFile(std::string_view path) {
  const auto file = std::ranges::find(DemoFiles(), path, &DemoFile::path);
  return file == DemoFiles().end() ? nullptr : &*file;
}

// The order file that came with those records: inbox/ has one of their name, whatever it ends in.
const DemoFile* OrdersOf(const DemoFile& records) {
  const std::string name = records.path == "records.json" ? "orders" : fs::path(records.path).stem().string();
  const auto file = std::ranges::find_if(DemoFiles(), [&](const DemoFile& each) {
    const fs::path path(each.path);
    return path.parent_path() == "inbox" && path.stem() == name;
  });
  return file == DemoFiles().end() ? nullptr : &*file;
}

// The sample that defines a document of the class.
std::optional<Example> SampleOf(std::string_view progId) {
  for (const DemoFile& file : DemoFiles()) {
    if (!file.path.ends_with(".json") || file.text.find(progId) == std::string_view::npos) continue;
    Example example = {json::parse(file.text), {}, 0, {}};
    for (const json& document : example.records["EDIDoc"]) {
      if (document["ProgId"] != progId) continue;
      example.document = document["EDIDocId"];
      if (document.contains("MapFile")) {
        const std::string map = "maps/" + document["MapFile"].get<std::string>();
        if (const DemoFile* found = FindFile(map)) example.files.push_back({map, found->text});
      }
      if (const DemoFile* orders = OrdersOf(file)) example.files.push_back({std::string(orders->path), orders->text});
      return example;
    }
  }
  return std::nullopt;
}

void Append(json& records, const std::string& kind, json record) { records[kind].push_back(std::move(record)); }

// Two cartons of the sample's first product for its first location, in a shipment that waits for its notice.
void AddPackedOrder(Example& example, std::int32_t id) {
  json& records = example.records;
  const json vendor = records["Vendor"][0]["VendorId"];
  const json product = records["Product"][0]["ProductNo"];
  const json place = records["PartnerLocn"][0]["PartnerLocnNo"];
  constexpr int kUnits = 12;
  Append(records, "PartnerAddress", {{"Id", id}, {"Name", "Example Linehaul"}});
  Append(records, "PackType", {{"PackTypeId", "EXAMPLE"}, {"ShipPackCode", "CTN25"}, {"PackageTypeCode", "P01"}});
  Append(records, "Order",
         {{"OrderId", id},
          {"VendorId", vendor},
          {"PartnerId", records["Partner"][0]["PartnerId"]},
          {"PONo", "4500" + std::to_string(id)},
          {"PODate", "2026-03-02"},
          {"CancelAfter", "2026-12-31"},
          {"SupplierNo", "104455"},
          {"CompanyCode", "EX"}});
  Append(records, "OrderLine",
         {{"LineId", id},
          {"OrderId", id},
          {"LineNo", "1"},
          {"ProductNo", product},
          {"Quantity", 2 * kUnits},
          {"Cost", 10.5}});
  Append(records, "OrderLocn",
         {{"LocnId", id}, {"OrderId", id}, {"VendorId", vendor}, {"BuyingLocn", place}, {"ShipToLocn", place}});
  Append(records, "OrderLocnLine",
         {{"Id", id},
          {"OrderId", id},
          {"LineId", id},
          {"LocnId", id},
          {"ProductNo", product},
          {"Quantity", 2 * kUnits},
          {"PackedQty", 2 * kUnits}});
  Append(records, "Job", {{"JobId", id}, {"OrderId", id}, {"PackerId", "KIM"}});
  Append(records, "PSlip", {{"Id", id}, {"JobId", id}, {"OrderLocnId", id}, {"StoreCode", place}});
  Append(records, "PSlipLine",
         {{"LineId", id},
          {"PSlipId", id},
          {"OrderLocnLineId", id},
          {"APN", product},
          {"OrderQty", 2 * kUnits},
          {"PackedQty", 2 * kUnits}});
  Append(records, "Shipment",
         {{"Id", id},
          {"ConNoteNo", "EXAMPLE1"},
          {"CarrierId", id},
          {"ScheduleDate", "2026-03-16"},
          {"DeliveryDate", "2026-03-20"},
          {"Weight", 16.8},
          {"Complete", true}});
  for (const std::int32_t pack : {id, id + 1}) {
    example.packs.push_back(pack);
    Append(records, "Pack",
           {{"Id", pack},
            {"PackNo", "EX-" + std::to_string(pack)},
            {"PSlipId", id},
            {"OrderId", id},
            {"ShipmentId", id},
            {"CarrierId", id},
            {"PackTypeId", "EXAMPLE"},
            {"VendorId", vendor},
            {"ShipToCode", place},
            {"BuyStoreCode", place},
            {"PartnerLocnId", id},
            {"InvoiceNo", std::to_string(id)},
            {"SSCC", Sscc(pack)},
            {"CartonCount", 1},
            {"Weight", 8.4}});
    Append(records, "PackLine",
           {{"Id", pack},
            {"PackId", pack},
            {"PSlipLineId", id},
            {"APN", product},
            {"GTIN", product},
            {"Quantity", kUnits}});
  }
}

// A document like that of the partner's orders, with a map of its own.
void AddNoticeDocument(Example& example, const PublicClass& of, const AfterPacking& needs) {
  const std::string name = ShortName(of);
  json document = example.records["EDIDoc"][0];
  example.document += kNoticeDocuments;
  document.update(
      {{"EDIDocId", example.document}, {"ProgId", of.progId}, {"DocumentCode", "856"}, {"MapFile", name + ".map"}});
  for (const char* check : {"ValidateProduct", "ValidateCost", "ValidateRetail"}) document.erase(check);
  Append(example.records, "EDIDoc", document);
  example.files.push_back({"maps/" + name + ".map", needs.map.empty() ? kNoticeMap : FindFile(needs.map)->text});
}

Example PackedExample(const PublicClass& of, const AfterPacking& needs) {
  Example example = *SampleOf(needs.orders);
  std::erase_if(example.files, [](const NamedText& file) { return file.path.starts_with("inbox/"); });
  const std::int32_t id = kPackedIds + 100 * example.document + 1;
  if (!needs.besides.empty()) {
    Example besides = *SampleOf(needs.besides);
    for (const auto& [kind, value] : besides.records.items()) {
      if (kind == "System") example.records[kind].update(value);
      else
        for (const json& record : value) Append(example.records, kind, record);
    }
    example.document = besides.document;
    example.files.insert(example.files.end(), besides.files.begin(), besides.files.end());
  } else {
    AddNoticeDocument(example, of, needs);
  }
  AddPackedOrder(example, id);
  return example;
}

const PublicClass& ClassOf(const std::string& name) {
  const PublicClass* row = FindClass(name);
  if (row == nullptr) row = FindClass("PartnerKit." + name);
  if (row == nullptr) throw Refusal("class \"" + name + "\" is not known (`partnerkit classes` lists them)");
  return *row;
}

Example ExampleFor(const PublicClass& of) {
  const auto needs = std::ranges::find(kAfterPacking, of.progId, &AfterPacking::progId);
  if (needs != std::end(kAfterPacking)) return PackedExample(of, *needs);
  std::optional<Example> example = SampleOf(of.progId);
  if (!example) throw Refusal("class " + std::string(of.progId) + ": there is no example for it yet");
  return *std::move(example);
}

void WriteRecord(JsonWriter& out, const json& record) {
  out.BeginObject();
  for (const auto& [name, value] : record.items()) {
    out.Name(name);
    out.Literal(value.dump());
  }
  out.EndObject();
}

void WriteRecords(std::ostream& stream, const json& records) {
  JsonWriter out(stream);
  out.BeginObject();
  for (const auto& [kind, value] : records.items()) {
    out.Name(kind);
    if (value.is_object()) {
      WriteRecord(out, value);
      continue;
    }
    out.BeginArray();
    for (const json& record : value) WriteRecord(out, record);
    out.EndArray();
  }
  out.EndObject();
}

std::vector<std::string> NextCommands(const PublicClass& of, const Example& example) {
  const std::string name = ShortName(of);
  const std::string document = std::to_string(example.document);
  std::vector<std::string> next = {"data load " + name + ".json"};
  if (of.createLabel != nullptr) {
    const std::string pack = std::to_string(example.packs.front());
    next.push_back("preview " + name + " --pack " + pack + " --out label.png");
    next.push_back("print " + name + " --pack " + pack + " " + std::to_string(example.packs.back()));
  } else {
    const std::string file = of.direction == "out" ? "'outbox/asn*.csv'" : example.files.back().path;
    next.push_back("rows " + document + " " + file);
    next.push_back("process " + document + " " + file);
  }
  return next;
}

// A file with the same text already is as good as written.
void CheckFree(const fs::path& path, std::string_view text) {
  std::ifstream there(path, std::ios::binary);
  std::ostringstream bytes;
  if (there) bytes << there.rdbuf();
  std::error_code failure;
  if (fs::exists(path, failure) && bytes.view() != text) throw Refusal(path.string() + ": is there already");
}

void WriteFile(const fs::path& path, std::string_view text) {
  std::error_code failure;
  if (path.has_parent_path()) fs::create_directories(path.parent_path(), failure);
  std::ofstream out(path, std::ios::binary);
  if (!(out << text).flush()) throw Refusal(path.string() + ": cannot be written: " + std::strerror(errno));
}

void Report(const Command& command, const PublicClass& of, const Example& example,
            const std::vector<std::string>& written) {
  if (command.options.json) {
    JsonWriter json(command.out);
    json.BeginObject();
    json.Name("files");
    json.BeginArray();
    for (const std::string& path : written) json.String(path);
    json.EndArray();
    json.EndObject();
    return;
  }
  std::string list;
  for (const std::string& path : written) list += (list.empty() ? "" : ", ") + OneLine(path);
  PrintWrapped(command.out, "Wrote " + list + ".", 2, OutputWidth());
  command.out << "Fill in your own partner, products and prices, or try it as it is, in the workspace:\n";
  for (const std::string& next : NextCommands(of, example)) command.out << "  partnerkit " << next << '\n';
}

}  // namespace

int WriteExample(const Command& command, const std::string& className, const std::string& folder) {
  const PublicClass& of = ClassOf(className);
  Example example = ExampleFor(of);
  std::ostringstream records;
  WriteRecords(records, example.records);
  if (folder.empty()) {
    command.out << records.view();
    return kDone;
  }
  example.files.insert(example.files.begin(), {ShortName(of) + ".json", records.view()});
  std::vector<std::string> written;
  for (const NamedText& file : example.files) {
    written.push_back((fs::path(folder) / file.path).lexically_normal().string());
    CheckFree(written.back(), file.text);
  }
  for (std::size_t n = 0; n < written.size(); ++n) WriteFile(written[n], example.files[n].text);
  Report(command, of, example, written);
  return kDone;
}

}  // namespace partnerkit::cli
