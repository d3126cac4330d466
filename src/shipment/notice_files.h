// The files that one notice is written to. They grow by the whole notice or not at all, whatever fails and whenever the
// program is killed.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "partnerkit/ports.h"

namespace partnerkit::shipment {

// Which notice it is. What stands in the files for a notice that the store doesn't know is taken out of them again.
struct NoticeId {
  std::string ASNNo;
  std::int32_t shipmentId = 0;
  std::int32_t orderId = 0;
};

// Before a file grows, a note beside it ("NAME.pending", with "_" for "*" in NAME) says which notice it is and where
// the file stood; it goes when the notice is stored. The note is held for as long as the notice is in the making, so
// that a second program is turned away. Each file has its own, because several documents may write to one of them.
class NoticeFiles {
 public:
  explicit NoticeFiles(Files& files) : files_(files) {}
  ~NoticeFiles() { Abandon(); }
  NoticeFiles(const NoticeFiles&) = delete;
  NoticeFiles& operator=(const NoticeFiles&) = delete;

  // An interrupted notice that a note tells of. The note stays held.
  struct Pending {
    std::shared_ptr<InputFile> note;
    NoticeId id;
    std::string path;                   // empty when nothing was done for it yet
    std::uint64_t base = 0, added = 0;  // both 0 for a file that was made and not written to
  };
  static std::string NotePath(std::string name);
  // Nothing when there is no note, or another program holds it.
  std::optional<Pending> FindPending(const std::string& name);
  // Cuts the file back to where it stood, unless something else was added since; one that was made for the notice goes.
  // True when something was cut off.
  bool TakeBack(const Pending& pending);
  // The note goes.
  void Forget(const std::string& name);

  // Holds the note of that name. False when it tells of an interrupted notice, which is to be dealt with first. Raises
  // RunTimeError, as does the next, which opens the file that the note is for and gives its number.
  bool Begin(const std::string& name);
  std::size_t Open(const std::string& path);
  // Text for the file of that number; nothing reaches the disk before Write.
  std::string& Text(std::size_t file) { return held_[file].text; }

  // Appends every file's text and brings it to the disk. Raises RunTimeError; the files then are as they were.
  void Write(const NoticeId& id);
  // The notice is stored: closes the files, and the notes go. One that can't stays for the next run.
  void Settle();
  // Cuts the files back to where they stood before Write, and closes them. A file that Open made goes.
  void Abandon();

 private:
  struct Held {
    std::string notePath;
    std::unique_ptr<OutputFile> note;
    std::string path;
    std::unique_ptr<OutputFile> file;
    std::uint64_t base = 0;
    bool isNew = false;
    std::string text;
  };

  void NoteNew(Held& held, const std::string& path);
  void WriteNote(Held& held, const NoticeId& id);
  void CutBack(Held& held);

  Files& files_;
  std::vector<Held> held_;
};

}  // namespace partnerkit::shipment
