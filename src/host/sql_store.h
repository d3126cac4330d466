// The record store in SQL: each kind of record is a table, each member a column.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "partnerkit/store.h"

namespace partnerkit::host {

class SqlSession;

// Each statement is prepared at its first use and kept for the life of the store, so record types and look-ups have to
// be constants. A change that finds no transaction open opens one; see SqlSession.
class SqlStore : public RecordStore {
 public:
  explicit SqlStore(SqlSession& session);
  SqlStore(const SqlStore&) = delete;
  SqlStore& operator=(const SqlStore&) = delete;
  ~SqlStore() override;

  bool Load(const RecordType& type, void* record) override;
  bool Add(const RecordType& type, void* record) override;
  bool Update(const RecordType& type, const void* record) override;
  bool Delete(const RecordType& type, const void* record) override;
  bool Find(const RecordType& type, const Lookup& lookup, void* record) override;
  void Select(const RecordType& type, const Lookup& lookup, const void* probe,
              const std::function<void*()>& next) override;
  std::int32_t Count(const RecordType& type, const Lookup& lookup, const void* probe) override;
  std::int32_t NativeError() const override;

  // Writes the record over the stored one of the same id or key, or stores it as a new one; one with an id of 0 is
  // always new. False when the store refuses.
  bool ReplaceOrAdd(const RecordType& type, void* record);
  // Reads every record of the type into `record`, by id or key, and calls `visit` after each. Raises RunTimeError.
  void ForEach(const RecordType& type, void* record, const std::function<void()>& visit);
  // Removes every record that fits `probe`. False when the store refuses; how many there were doesn't matter.
  bool DeleteAll(const RecordType& type, const Lookup& lookup, const void* probe);

 protected:
  SqlSession& Session() { return session_; }
  // Writes a new record into the transaction that is open. Raises soci::soci_error.
  bool Insert(const RecordType& type, void* record);

 private:
  enum class Operation : std::uint8_t {
    kAdd,
    kAddWithId,
    kLoad,
    kUpdate,
    kDelete,
    kFind,
    kSelect,
    kCount,
    kAll,
    kDeleteAll
  };
  struct Key {
    const void* type;
    const void* lookup;
    Operation operation;
    bool operator==(const Key&) const = default;
  };
  struct KeyHash {
    std::size_t operator()(const Key& key) const;
  };
  struct Prepared;
  class Lease;

  Lease Take(const RecordType& type, Operation operation, const Lookup* lookup = nullptr);
  std::unique_ptr<Prepared> Prepare(const RecordType& type, Operation operation, const Lookup* lookup);
  template <class F>
  bool Change(F&& change);
  bool Write(const RecordType& type, Operation operation, const void* record);
  bool ReadOne(Lease& lease, void* record);

  SqlSession& session_;
  // Usually one statement; a second one where a walk through rows asks for the same rows again.
  std::unordered_map<Key, std::vector<std::unique_ptr<Prepared>>, KeyHash> statements_;
};

template <class R, class F>
void ForEach(SqlStore& store, F&& visit) {
  R record;
  store.ForEach(R::kType, &record, [&] { visit(static_cast<const R&>(record)); });
}

}  // namespace partnerkit::host
