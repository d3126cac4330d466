// The workspace's printers: where jobs go, and the verb that lists and tries them.
#pragma once

#include <string>
#include <vector>

#include "cli/output/command.h"
#include "cli/workspace/workspace.h"
#include "spool/printer_spooler.h"

namespace partnerkit::cli {

// The spooler over the workspace's `Printer` records.
spool::PrinterSpooler OpenSpooler(Workspace& workspace, spool::PdfDeviceFactory makePdfDevice = {});

// The printer of that name. Raises Refusal when there is none.
const Printer& CheckPrinter(const spool::PrinterSpooler& spooler, const std::string& name, const Workspace& workspace);

// Both take every printer, or those named; a name that no printer has is refused.
int ListPrinters(const Command& command, const std::vector<std::string>& names);
// Sends a short text to each of the printers, at least one of which has to be named.
int TestPrinters(const Command& command, const std::vector<std::string>& names);

}  // namespace partnerkit::cli
