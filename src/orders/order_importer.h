// What every importer of purchase orders does alike, whatever the syntax of its file: the rows, an order that is
// already stored, the locations, and storing.
#pragma once

#include <optional>
#include <set>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "files/work_queue.h"
#include "orders/listed_order.h"
#include "orders/order_checks.h"
#include "orders/order_draft.h"
#include "orders/order_rules.h"

namespace partnerkit::orders {

// What an order file says that no order can be made of: a number beyond all bounds, an element that isn't there. The
// order is turned away, with these words on the log, and stays in the file.
struct Unreadable {
  std::string why;  // "line 17: ..."
};

class OrderImporter : public TranslatorBase {
 protected:
  enum class Next { kGoOn, kEnd };

  // One call of `Process`.
  struct OrderPosting {
    OrderPosting(OrderImporter& importer, ListedOrder& listed, std::string_view procedure, ErrorList& errorList)
        : entry(listed), log(importer, procedure, errorList), checks(importer, log, listed.PONo) {}

    ListedOrder& entry;
    CallLog log;
    OrderDraft draft;
    OrderChecks checks;
    std::optional<Order> replaces;  // the order stored under the number that goes when this one is stored
    bool deletedStored = false;     // it is gone
    std::set<std::string> warned;   // places of values that were warned of
    bool complete = true;           // the transaction was read to its end
    std::int32_t result = 0;        // what the call gives when it ends before storing
    std::string shipTo;             // current ship-to and buying location
    std::string buyingLocn;
    std::string locationLookedAt;
  };

  OrderImporter(std::string_view className, const Ports& ports)
      : TranslatorBase(className, ports), queue_(FileSystem()) {}

  // --- The file and its rows
  // The file is there and isn't empty. False, with the reason on the log, when it isn't so.
  bool FindOrderFile(const std::string& path);
  bool HoldOrderFile(const std::string& path);
  // The grid of what was listed, and the number of its rows; 0, with a word on the log, when nothing was.
  std::int32_t ShowRows(RowTable& rows);
  // The rows of that order number, in their order. They are looked up only when asked for: few files need it.
  std::span<const std::uint32_t> RowsOfNumber(std::string_view PONo);
  // Behind every listing.
  void ForgetRows() { rowsByNumber_.clear(); }
  // Null, with the error told, for a row that the list doesn't have.
  ListedOrder* EntryOfRow(std::int32_t row);
  // False, with the error told, when the file is too short for the entry.
  bool Reaches(const ListedOrder& entry);
  // Where the row's successor begins, or the file's length and 1. Nothing, with the error told, when the file fails.
  std::optional<std::uint64_t> EndOf(const ListedOrder& entry);
  // A file that holds nothing goes when the document definition asks for it.
  void DeleteWhenEmpty(bool optionAnywhere = false);
  // Carries out the last step of a rewrite. False, and the user is told, when it fails.
  template <class F>
  bool PutInPlace(F step) {
    try {
      step();
      return true;
    } catch (const RunTimeError& error) {
      Tell(Told::kFailed, error.Description());
      return false;
    }
  }
  WorkQueue::Rewrite::Tell TellOfRewrite() {
    return [this](const std::string& sentence) { Tell(Told::kDone, sentence); };
  }

  // --- Orders that are stored while the file still holds them, see UnsettledOrder
  // Behind listing: drops records of orders that have left the file since.
  void ForgetUnlisted();
  // Behind settling: the file holds them no longer.
  void ForgetUnsettled();
  // The backup has the lines of these.
  void NoteBackedUp(std::span<const std::int32_t> orders);

  // --- Values of lines and segments
  // The number at the front of `text`, which `place` gives as `name` ("line 17", "ORDERQUANTITY"). One that isn't a
  // number as a whole is read as far as it is one, and warned of; so is a negative quantity. Raises Unreadable for one
  // beyond all bounds.
  static double ReadNumber(OrderPosting& posting, std::string_view text, std::string_view place, std::string_view name,
                           bool isQuantity = false);
  // The same, where nothing needs to be said of it: nearly always, so that no caller makes its place up in vain.
  static std::optional<double> PlainNumber(std::string_view text, bool isQuantity = false);
  // Tells why the order cannot be read.
  static void Refuse(OrderPosting& posting, const Unreadable& fault);
  // The order has no number, which some partners' translators let pass.
  static void WarnOfNoNumber(OrderPosting& posting, std::string_view place);

  // --- An order already stored
  // An order under the entry's number: the same transaction again is turned away, and of the rules the first that fits
  // decides about any other. `announce` is noted beforehand, off the caller's error list.
  Next SettleStoredOrder(OrderPosting& posting, OrderFacts facts, std::span<const OrderRule> rules,
                         std::string_view procedure, const Words& announce = {});
  // A number that isn't stored, or no longer, may still be none to post.
  Next RefuseNewOrder(OrderPosting& posting, const OrderFacts& facts, std::span<const OrderRule> rules);

  virtual bool SameTransaction(const Order& stored, const ListedOrder& entry) const;
  // The order needs no further work without being stored.
  Next TurnAway(OrderPosting& posting);
  // Deletes the stored order that this one replaces, if there is one. False when the host refuses.
  bool DeleteReplaced(OrderPosting& posting);
  // An earlier transaction of the same number stays in the file, so that this one, which refers to it, has to stay,
  // too.
  virtual bool EarlierStays(const ListedOrder&) { return false; }
  virtual void MarkTurnedAway(ListedOrder& entry) = 0;
  // The order is stored no longer: what is known of it as dealt with is so no more.
  virtual void Forget(const Order&) {}
  // Changes the stored order instead of replacing it.
  virtual Next ChangeStored(OrderPosting&, Order&) { return Next::kEnd; }

  // --- Locations
  // A location is looked at when it changes from one line to the next.
  void CheckShipTo(OrderPosting& posting, std::string_view wanted);
  void CheckBuyingLocn(OrderPosting& posting, std::string_view wanted, bool looksItUp,
                       std::string_view what = "buying");
  // The draft's new location for the current ship-to and buying location; null when there is one already.
  OrderLocn* NewLocation(OrderPosting& posting);
  // A product stands twice at the current location.
  Next RejectRepeat(OrderPosting& posting, std::string_view ordered);

  // --- Storing
  // Stores the order when every check passed, and tells the outcome. The stored order's id, 0 when nothing was posted.
  std::int32_t Store(OrderPosting& posting, std::optional<std::string_view> lineSequence = {});
  virtual void MarkPosted(ListedOrder& entry) = 0;
  // What follows on a posted order before its outcome is told.
  virtual void Export(OrderPosting&) {}

  // Before anything that was done to the store counts as done.
  bool MakeDurable();

  WorkQueue queue_;
  std::string fileName_;
  std::vector<ListedOrder> listed_;
  std::set<std::int32_t> unsettled_;  // orders of this file whose records ForgetUnsettled drops

 private:
  std::vector<std::uint32_t> rowsByNumber_;

  bool IsStoredEarlier(OrderPosting& posting, const Order& stored);
  UnsettledOrder NoteOf(std::int32_t orderId);
  Next CarryOut(OrderPosting& posting, const OrderRule& rule, const OrderFacts& facts, Order& stored);
  bool DeleteStored(const Order& stored);
  bool HasJobs(const Order& stored);
};

}  // namespace partnerkit::orders
