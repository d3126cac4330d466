// Imports an order file of MGB stores into a database, and shows every row and what became of it.
#include <partnerkit/catalogue.h>
#include <partnerkit/database_host.h>
#include <partnerkit/platform.h>

#include <iostream>

using namespace partnerkit;

int main() try {
  const auto host = DatabaseHost::Open("orders.db");  // made when it isn't there
  RecordStore& records = host->Records();
  const auto put = [&](auto record) {
    if (!Update(records, record) && !Add(records, record)) throw RunTimeError(run_time::kDatabase, "cannot store");
  };
  put(Partner{.PartnerId = "MGB", .Name = "MGB Stores"});
  put(Vendor{.VendorId = "ACME", .Name = "Acme Apparel", .POBackupFile = "posted.csv"});
  put(EDIDoc{.EDIDocId = 1,
             .ProgId = "PartnerKit.clsMGB850csv",
             .DocumentCode = "850",
             .PartnerId = "MGB",
             .VendorId = "ACME",
             .CompanyEDIAddr = "ACMEEDI",
             .PartnerEDIAddr = "MGBEDI",
             .MapFile = "mgb850.map"});
  for (const char* number : {"0052", "0061", "0117", "0204", "0900"}) {
    put(PartnerLocn{.VendorId = "ACME", .PartnerLocnNo = number});
  }

  Ports ports = platform::DefaultPorts();
  ports.errorOutlets.dialog = [](const ErrorReport& fault, const std::string&) {  // what no class foresaw
    std::cerr << fault.report << '\n';
    return Button::kAbort;
  };
  ports.tell = [](Told, const std::string& sentence) { std::cerr << sentence << '\n'; };  // of his files
  const auto orders = CreateTranslator("PartnerKit.clsMGB850csv", ports);
  const auto tell = [&](std::int32_t logId) {
    LogRecord log{.LogId = logId};
    if (Load(records, log)) std::cout << "   " << Str(log.Message) << '\n';
  };
  ColumnTable columns;
  RowTable rows;
  const std::int32_t count = orders->Init(*host, 1, columns) ? orders->Load("orders.csv", rows) : 0;
  if (count == 0) {
    tell(orders->Log().LogId);  // why
    return 1;
  }
  int posted = 0;
  for (std::int32_t row = 0; row < count; ++row) {
    for (std::size_t column = 0; column < rows.Columns(); ++column) {
      if (const auto* text = std::get_if<std::string>(&rows.At(row, column))) std::cout << *text << ' ';
      if (const auto* date = std::get_if<DateTime>(&rows.At(row, column))) std::cout << date->Iso() << ' ';
    }
    ErrorList told;
    const std::int32_t id = orders->Process(row, told);  // of the order posted, 0 when none was
    std::cout << (id != 0 ? "posted, id " + std::to_string(id) : "NOT DONE") << '\n';
    for (const std::int32_t logId : told.value_or(std::vector<std::int32_t>())) tell(logId);
    posted += id != 0;
  }
  const bool settled = orders->Term();  // what was posted leaves the file
  host->Close();
  return settled && posted == count ? 0 : 1;
} catch (const RunTimeError& error) {
  std::cerr << error.what() << '\n';
  return 2;
}
