// A host in memory, for programs that need no database: tests, converters, trials. It runs as it stands; a host of your
// own derives from it and overrides what it knows better.
//
//   class Desk : public partnerkit::MemoryHost {
//    public:
//     std::string UserId() override { return "kim"; }
//   };
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "partnerkit/store_host.h"

namespace partnerkit {

// Records of any type in memory, in order, found by id, key or look-up through hash tables. A look-up's table is made
// when it is first used, so record types and look-ups have to be constants. Nothing here raises but a look-up that
// names a member which the type doesn't have. For one thread at a time.
//
// An id is never given twice, not even when the record was deleted or the transaction that it was given in taken back.
// A partner's counters only ever go up: a record that was read before the newest number was drawn doesn't bring that
// number back. A number that is none (NaN) has no place in a `double`, and is null where null is possible.
class MemoryStore : public RecordStore {
 public:
  // What `NativeError` gives behind a change that was refused.
  enum Refusal : std::int32_t {
    kNotRefused = 0,
    kDuplicate = 1,   // a record of that id, key or unique look-up is there already
    kNoId = 2,        // the id is below 0, or no higher one is left to give
    kNotANumber = 3,  // a member of kind `kDouble` holds no number
  };

  MemoryStore();
  ~MemoryStore() override;
  MemoryStore(const MemoryStore&) = delete;
  MemoryStore& operator=(const MemoryStore&) = delete;

  bool Load(const RecordType& type, void* record) override;
  bool Add(const RecordType& type, void* record) override;
  bool Update(const RecordType& type, const void* record) override;
  bool Delete(const RecordType& type, const void* record) override;
  bool Find(const RecordType& type, const Lookup& lookup, void* record) override;
  // `next` may use the store. Records that are added meanwhile are not given, nor those deleted before their turn.
  void Select(const RecordType& type, const Lookup& lookup, const void* probe,
              const std::function<void*()>& next) override;
  std::int32_t Count(const RecordType& type, const Lookup& lookup, const void* probe) override;
  std::int32_t NativeError() const override { return refusal_; }

  // From BeginTrans on, changes are noted, so that RollbackTrans can take them back. There is one transaction at a
  // time; a second BeginTrans keeps what the first has seen.
  void BeginTrans();
  void CommitTrans();
  void RollbackTrans();

 private:
  struct Parts;

  bool Done(Refusal refusal = kNotRefused);

  std::unique_ptr<Parts> parts_;
  Refusal refusal_ = kNotRefused;
};

// Nothing is durable: everything is gone with the object.
class MemoryHost : public StoreHost {
 public:
  MemoryStore& Records() override { return store_; }
  // What SetSetting has set.
  std::optional<std::string> Setting(std::string_view name) override;
  void SetSetting(std::string_view name, std::string_view value);

 protected:
  void OpenTransaction() override;
  void CloseTransaction(bool keep) override;

 private:
  using SettingMap = std::map<std::string, std::string, std::less<>>;

  MemoryStore store_;
  SettingMap settings_, settingsBefore_;
};

}  // namespace partnerkit
