// An inbound file as a work queue: held exclusively while its rows are worked on, rewritten in one step so that what is
// done leaves it and everything else stays, byte for byte.
#pragma once

#include <cstdint>
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

// Bytes of a file: from `begin` up to, not including, `end`, positions from 1.
struct ByteRange {
  std::uint64_t begin;
  std::uint64_t end;
};

// The supplier's copy of every posted order's lines, over all runs. Held exclusively while open.
//
// A program that dies while it appends must leave neither half a line nor a line twice. So what is about to be appended
// is first noted in a small file beside the backup (its name and ".pending"): the backup's length, the order file and
// the byte ranges. `Open` finishes what such a note tells of; the order file is replaced only once the backup is whole,
// so that it still holds the lines.
class BackupFile {
 public:
  explicit BackupFile(Files& files) : files_(files) {}

  // Raises RunTimeError when it cannot be opened, held or finished.
  void Open(const std::string& path);
  bool IsOpen() const { return file_ != nullptr; }
  void Close();
  // Appends the ranges of `source`, each line whole, and leaves the note until `Settle`. On a failure the backup is cut
  // back and the note kept, for the next `Open` to finish.
  void Append(InputFile& source, const std::string& sourcePath, const std::vector<ByteRange>& ranges);
  // The order file no longer holds the lines appended, or the program knows them as done: the note goes.
  void Settle();

 private:
  std::string NotePath() const { return path_ + ".pending"; }
  std::string DraftPath() const { return NotePath() + ".tmp"; }
  struct Note;
  static std::optional<Note> ReadNote(InputFile& file);
  void WriteNote(InputFile& source, const std::string& sourcePath, const std::vector<ByteRange>& ranges);
  void FinishPending();
  void Finish(const Note& note);
  void CopyRanges(InputFile& source, const std::vector<ByteRange>& ranges);

  Files& files_;
  std::string path_;
  std::unique_ptr<OutputFile> file_;
  bool pending_ = false;
};

// The inbound file. How it is read is its reader's matter; see LineReader and SegmentReader.
class WorkQueue {
 public:
  explicit WorkQueue(Files& files) : files_(files) {}

  // Takes the exclusive hold. Raises RunTimeError.
  void Open(const std::string& path);
  bool IsOpen() const { return file_ != nullptr; }
  void Close();
  const std::string& Path() const { return path_; }
  // Raises RunTimeError when the file isn't open.
  InputFile& File();

  // A rewrite, in this order: `Begin` makes the temporary file, `Keep` takes what stays, `Finish` brings it to the
  // disk, `Claim` and `Replace` put it in the order file's place. All raise RunTimeError. An object that goes before
  // `Claim` takes the temporary file with it; from then on that stays, beside an order file that keeps all its lines.
  class Rewrite {
   public:
    explicit Rewrite(WorkQueue& queue);
    ~Rewrite();
    Rewrite(const Rewrite&) = delete;
    Rewrite& operator=(const Rewrite&) = delete;

    void Begin();
    void Keep(std::string_view bytes) { out_->Write(bytes); }
    void Finish() { out_->Sync(); }
    // Fails when the order file is no longer the one held; what was kept is then beside it, under its name and ".kept".
    void Claim();
    void Replace();
    // In the place of `Replace`, when nothing stays: the order file goes, and the temporary file unless it is to stay.
    void Remove(bool withTemporary);
    // Copies bytes of the order file, positions from 1.
    void KeepRange(ByteRange range);

   private:
    WorkQueue& queue_;
    std::string temporary_;
    std::unique_ptr<OutputFile> out_;
  };

 private:
  Files& files_;
  std::string path_;
  std::unique_ptr<InputFile> file_;
};

}  // namespace partnerkit
