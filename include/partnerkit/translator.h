// The contract of every document class ("translator"): how a host creates it, drives it through one run and releases
// it.
//
//   created --Init--> bound --Load--> loaded --Process on any rows, in any order--> Term or Cancel --> release
//                                     loaded --Delete--> release
//
// A translator runs on the caller's thread, one call at a time. It raises nothing to its host: a foreseen failure is a
// log record and a False or 0; any other failure is put to the error trail (see `Ports::errorOutlets`), whose answer
// runs the operation again, skips it or leaves the procedure with its result as it stands. The one exception is
// `ErrorSettings::passUpward`, which asks for RunTimeError to come through.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "partnerkit/ports.h"
#include "partnerkit/records.h"
#include "partnerkit/store.h"
#include "partnerkit/values.h"

namespace partnerkit {

// The struct `Log` under a name that the contract's `Log` operation leaves free.
using LogRecord = Log;

class Translator {
 public:
  virtual ~Translator() = default;
  Translator(const Translator&) = delete;
  Translator& operator=(const Translator&) = delete;

  // "PartnerKit.clsMGB850csv".
  virtual std::string_view ProgId() const = 0;

  // A flag for the host; False after `Init` but on the reconciliation class. The translators never read it.
  bool PROCESSALL = false;

  // Binds the translator to the host and to one document definition and hands out the column table. False when the run
  // cannot start, with a log record or a fault on the error trail. An unknown definition is no reason: it lists
  // nothing. `Load` and what follows need an `Init` that gave True.
  virtual bool Init(System& system, std::int16_t EDIDocId, ColumnTable& Columns) = 0;
  // Reads the input and fills the rows. Gives their number; 0 when there are none or the input could not be read, with
  // the reason on the log and `a_vtRows` untouched. An input file stays held until `Term` or `Cancel`.
  virtual std::int32_t Load(const std::string& a_sFileName, RowTable& a_vtRows) = 0;
  // Carries out one row, from 0. An order importer gives the id of the order posted, 0 when none was. `vtErrorLog` gets
  // the ids of the log records that this call wrote, and stays untouched when it wrote none.
  virtual std::int32_t Process(std::int32_t a_lRowNum, ErrorList& vtErrorLog) = 0;
  // Takes one row's transaction out of the input file without posting it. The file is rewritten, so that the rows no
  // longer hold: only release may follow. Orders and order responses only.
  virtual bool Delete(std::int32_t a_lRowNum, ErrorList& vtErrorLog) = 0;
  // The normal end: settles the input file and closes everything.
  virtual bool Term() = 0;
  // Abandons the run and closes the files. What was posted stays posted. A CSV file stays as it is; an X12 file is
  // settled and marked as by `Term`, but for the partners that leave it be.
  virtual void Cancel() = 0;
  // A new log record with `LogId` set to that of the newest record this translator wrote, 0 when it wrote none.
  virtual LogRecord Log() const = 0;

 protected:
  Translator() = default;
};

}  // namespace partnerkit
