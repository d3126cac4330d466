// Shows what an order file of MGB stores asks for, product by product. Its host keeps its records in memory.
#include <partnerkit/catalogue.h>
#include <partnerkit/memory_host.h>
#include <partnerkit/platform.h>

#include <iostream>
#include <map>

using namespace partnerkit;

class Desk : public MemoryHost {
 public:
  std::string UserId() override { return "kim"; }
  bool DeleteOrder(const Order&) override { return false; }  // whoever was first stays
};

int main() {
  Desk desk;
  Partner partner{.PartnerId = "MGB"};
  Vendor vendor{.VendorId = "ACME", .POBackupFile = "posted.csv"};
  EDIDoc document{.EDIDocId = 1,
                  .ProgId = "PartnerKit.clsMGB850csv",
                  .DocumentCode = "850",
                  .PartnerId = "MGB",
                  .VendorId = "ACME",
                  .CompanyEDIAddr = "ACMEEDI",
                  .PartnerEDIAddr = "MGBEDI",
                  .MapFile = "mgb850.map"};
  if (!Add(desk.Records(), partner) || !Add(desk.Records(), vendor) || !Add(desk.Records(), document)) return 2;
  for (const char* number : {"0052", "0061", "0117", "0204", "0900"}) {
    PartnerLocn locn{.VendorId = "ACME", .PartnerLocnNo = number};
    if (!Add(desk.Records(), locn)) return 2;
  }

  const auto orders = CreateTranslator("PartnerKit.clsMGB850csv", platform::DefaultPorts());
  ColumnTable columns;
  RowTable rows;
  std::int32_t posted = 0;
  if (orders->Init(desk, 1, columns) && orders->Load("orders.csv", rows) > 0) {
    ErrorList told;
    for (std::int32_t row = 0; row < static_cast<std::int32_t>(rows.Rows()); ++row) {
      posted += orders->Process(row, told) != 0;
    }
    if (!orders->Term()) return 2;
  }
  std::map<std::string, double> wanted;
  for (const auto& line : Select(desk.Records(), kEveryRecord, OrderLine())) wanted[line->ProductNo] += line->Quantity;
  for (const auto& [product, quantity] : wanted) std::cout << "wanted " << product << ": " << quantity << '\n';
  for (const auto& log : Select(desk.Records(), kEveryRecord, LogRecord())) {
    if (log->ErrorNumber != 0) std::cout << Str(log->UserId) << ": " << Str(log->Message) << '\n';
  }
  return posted == static_cast<std::int32_t>(rows.Rows()) && posted > 0 ? 0 : 1;
}
