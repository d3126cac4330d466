// The CSV ship notices: a line for each product of each carton, its columns named by a map file.
//
// The engine tells the whole; a partner's class gives its values and overrides the steps it does otherwise.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "files/field_map.h"
#include "shipment/compile_frame.h"
#include "shipment/csv/csv_notice_fields.h"
#include "shipment/notice_records.h"

namespace partnerkit::shipment {

enum class NoticeLines {
  kRuns,      // neighbours of one product in a carton make one line, up to 32,767 units
  kLongRuns,  // the same, without that bound
  kEach,      // each pack line is one
};

// A partner's differences, in the order in which a notice comes about.
struct CsvNoticeValues {
  CompileValues compile;
  std::span<const std::string_view> fields = {};  // those that the map may name; empty for the norm's
  std::span<const std::string_view> removed = {};
  std::span<const std::string_view> added = {};
  std::span<const NoticeField> own = {};     // what fills them, where it isn't the norm,
  std::span<const NoticeField> family = {};  // nor the partner's alone
  std::int32_t mostPacks = 0;                // of a shipment; 0 for any number
  bool logsOrder = true;                     // the log of a pack names the order
  NoticeLines lines = NoticeLines::kRuns;
  bool inventoryLessRelease = false;  // the order number of the inventory record
  bool deliveryDocket = false;        // made where the document asks for it
};

class CsvNotice : public CompileFrame {
 public:
  // The values must outlive the object.
  CsvNotice(const CsvNoticeValues& values, const Ports& ports);
  // Reads the map of the notice's columns, a name a line. False, with a log record, when it isn't there or is empty.
  bool OpenMapFile(const std::string& sMapFileName);

 protected:
  bool Prepare(Notice& notice) override;
  bool Number(Notice& notice) override;
  bool OpenOutput(Notice& notice) override;
  bool WriteNotice(Notice& notice) override;
  bool FollowOn(Notice& notice) override;

  // --- Steps that may end the notice: false, with the reason noted.
  // Before it is numbered.
  virtual bool CheckNotice(Notice&) { return true; }
  // Before anything of the pack is written.
  virtual bool FillPack(Notice& notice, const Pack& pack);

  NoticeRecords& Values() { return records_; }
  // Null when the map doesn't name it.
  MapField* Field(std::string_view name) { return map_.Find(name); }

 private:
  struct Filled {
    MapField* field;
    void (*fill)(NoticeRecords& records, std::string& value);
  };

  using Lines = std::vector<std::shared_ptr<PackLine>>;

  bool Knows(std::string_view name) const;
  const NoticeField* SourceOf(std::string_view name) const;
  bool ReadMap(const std::string& path);
  void BindColumns();
  bool WritePack(Notice& notice, const Pack& pack);
  void Fill(const std::vector<Filled>& fields);
  std::vector<Filled>& FilledPer(Level level);
  void SetLine(const PackLine& line);
  void WriteRuns(Notice& notice, const Lines& lines);
  void WriteEach(Notice& notice, const Lines& lines);
  void WriteRun(Notice& notice, std::int32_t quantity);
  void WriteLine(Notice& notice);
  void WriteInventory(Notice& notice);

  const CsvNoticeValues& values_;
  NoticeRecords records_;
  bool mapLoaded_ = false;
  MapHeader header_;
  FieldMap map_;                    // the fields that the partner knows and the map names
  std::vector<MapField*> columns_;  // in the map's order; null for a column that stays empty
  std::vector<Filled> perNotice_, perPack_, perLine_;
  MapField* quantity_ = nullptr;
  std::size_t leading_ = 0;  // so many columns are the same for all lines of a pack,
  std::string leadingText_;  // and read so
};

}  // namespace partnerkit::shipment
