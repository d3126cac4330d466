// An inbound file as a work queue: held exclusively while its rows are worked on, rewritten in one step so that what is
// done leaves it and everything else stays, byte for byte.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "partnerkit/ports.h"

namespace partnerkit {

// The name with the part behind its last "." replaced by "tmp"; ".tmp" at the end of a name without one, or of a name
// that would stay as it is. A "." of a folder's name doesn't count.
std::string TemporaryName(std::string_view path);

// A segment of an interchange's envelope, which says nothing of any order.
bool IsEnvelopeSegment(std::string_view text);

// Gives `from` the name, or the first of `name`.1, `name`.2 and so on that is free: no file is replaced. The name
// given. Raises RunTimeError.
std::string RenameToFree(Files& files, const std::string& from, const std::string& name);

// Bytes of a file: from `begin` up to, not including, `end`, positions from 1.
struct ByteRange {
  std::uint64_t begin;
  std::uint64_t end;
};

// The supplier's copy of every posted order's lines, over all runs. Held exclusively while open.
//
// A program that dies while it appends must leave neither half a line nor a line twice. So what is about to be appended
// is first noted in a small file beside the backup (its name and ".pending"): the backup's length, the order file, the
// byte ranges, and the orders whose lines they are. `Open` finishes what such a note tells of; the order file is
// replaced only once the backup is whole, so that it still holds the lines.
class BackupFile {
 public:
  explicit BackupFile(Files& files) : files_(files) {}

  // Raises RunTimeError when it cannot be opened, held or finished. Behind it, `Finished` has the orders that an
  // earlier run was about to append and whose lines the backup holds by now; `Settle` once that is known for good.
  void Open(const std::string& path);
  const std::vector<std::int32_t>& Finished() const { return finished_; }
  bool IsOpen() const { return file_ != nullptr; }
  void Close();
  // Appends the ranges of `source`, each line whole, and leaves the note until `Settle`. On a failure the backup is cut
  // back and the note kept, for the next `Open` to finish. A new backup takes the mode of `source`; an older one loses
  // what rights of group and others `source` doesn't give them.
  void Append(InputFile& source, const std::string& sourcePath, const std::vector<ByteRange>& ranges,
              const std::vector<std::int32_t>& orders = {});
  // The order file no longer holds the lines appended, or the program knows them as done: the note goes.
  void Settle();

 private:
  std::string NotePath() const { return path_ + ".pending"; }
  struct Note;
  static std::optional<Note> ReadNote(InputFile& file);
  void WriteNote(InputFile& source, const std::string& sourcePath, const std::vector<ByteRange>& ranges,
                 const std::vector<std::int32_t>& orders);
  void FinishPending();
  bool Finish(const Note& note);
  void CopyRanges(InputFile& source, const std::vector<ByteRange>& ranges);

  Files& files_;
  std::string path_;
  std::unique_ptr<OutputFile> file_;
  bool pending_ = false;
  std::vector<std::int32_t> finished_;
};

// The inbound file. How it is read is its reader's matter; see LineReader and SegmentReader.
class WorkQueue {
 public:
  explicit WorkQueue(Files& files) : files_(files) {}

  // Takes the exclusive hold. Raises RunTimeError. A link is followed: the file that it leads to is rewritten.
  void Open(const std::string& path);
  bool IsOpen() const { return file_ != nullptr; }
  void Close();
  const std::string& Path() const { return path_; }
  // Raises RunTimeError when the file isn't open.
  InputFile& File();
  // Where the file's text begins: behind a byte order mark, which stays in front of whatever else does. Raises
  // RunTimeError.
  std::uint64_t Begin();

  // A rewrite, in this order: `Begin` makes a draft beside the file, `Keep` takes what stays, `Finish` brings it to the
  // disk, `Claim` and `Replace` put it in the order file's place, with the rights of the old one. All raise
  // RunTimeError. An object that goes before `Claim` takes the draft with it.
  //
  // Where the order file cannot be replaced it keeps all its lines, and the draft is left under the temporary name,
  // "orders.tmp" for "orders.csv". A file of somebody else's that has that name is moved aside, under a new name, and
  // `tell` gets a sentence about it.
  class Rewrite {
   public:
    using Tell = std::function<void(const std::string& sentence)>;

    Rewrite(WorkQueue& queue, Tell tell);
    ~Rewrite();
    Rewrite(const Rewrite&) = delete;
    Rewrite& operator=(const Rewrite&) = delete;

    void Begin();
    // A byte order mark of the file goes in front of the first bytes.
    void Keep(std::string_view bytes);
    // Nothing was kept so far.
    bool Empty() { return out_->Length() == 0; }
    // What was read of the order file is so many bytes. A mailbox that appends to it later, while it is being replaced,
    // finds its lines at the end of the new one.
    void Finish(std::uint64_t readTo) {
      readTo_ = readTo;
      out_->Sync();
    }
    // Fails when the order file is no longer the one held; what was kept is then beside it, under its name and ".kept",
    // or ".kept.1" and so on where that is taken.
    void Claim();
    void Replace();
    // In the place of `Replace`, when nothing stays: the order file goes, and the draft unless it is to stay under the
    // temporary name.
    void Remove(bool withTemporary);
    // Copies bytes of the order file, positions from 1.
    void KeepRange(ByteRange range);

   private:
    void MoveAside(const std::string& path);
    const std::string& Leave(const std::string& name);
    [[noreturn]] void Fail(const RunTimeError& cause, const std::string& what);
    bool MayStay(const std::string& path);
    bool TakeLateBytes();
    void Copy(ByteRange range);

    WorkQueue& queue_;
    Tell tell_;
    std::string temporary_;
    std::string draft_;
    std::unique_ptr<OutputFile> out_;
    std::uint64_t readTo_ = 0;
  };

 private:
  Files& files_;
  std::string path_;
  std::string target_;  // what a link of that path leads to
  std::unique_ptr<InputFile> file_;
  std::uint64_t begin_ = 0;  // 0 until it is asked for
};

}  // namespace partnerkit
