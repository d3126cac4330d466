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

// Before a file grows, a note beside the output ("NAME.pending", NAME being the output's with "_" for "*") says which
// notice it is and where each file stood; it goes when the notice is stored. The note is held for as long as a notice
// is in the making, so that a second program is turned away.
class NoticeFiles {
 public:
  explicit NoticeFiles(Files& files) : files_(files) {}
  ~NoticeFiles() { Abandon(); }
  NoticeFiles(const NoticeFiles&) = delete;
  NoticeFiles& operator=(const NoticeFiles&) = delete;

  // An interrupted notice that a note tells of; without files if nothing was added for it. The note stays held.
  struct Pending {
    std::shared_ptr<InputFile> note;
    NoticeId id;
    struct File {
      std::string path;
      std::uint64_t base, added;
    };
    std::vector<File> files;
  };
  static std::string NotePath(std::string output);
  // Nothing when there is no note, or another program holds it.
  std::optional<Pending> FindPending(const std::string& output);
  // Cuts the files back to where they stood, where nothing else was added since; the names of those that had grown.
  std::vector<std::string> TakeBack(const Pending& pending);
  // The note goes.
  void Forget(const std::string& output);

  // Opens a file for appending, holds it, and gives its number. Raises RunTimeError, as does the next.
  std::size_t Open(const std::string& path);
  // Holds the note. False when it tells of an interrupted notice, which is to be dealt with first.
  bool Begin(const std::string& output);
  // Text for the file of that number; nothing reaches the disk before Write.
  std::string& Text(std::size_t file) { return open_[file].text; }

  // Appends every file's text and brings it to the disk. Raises RunTimeError; the files then are as they were.
  void Write(const NoticeId& id);
  // The notice is stored: closes the files, and the note goes.
  void Settle();
  // Cuts the files back to where they stood before Write, and closes them. A file that Open made goes.
  void Abandon();

 private:
  struct Held {
    std::string path;
    std::unique_ptr<OutputFile> file;
    std::uint64_t base;
    bool isNew;
    std::string text;
  };

  void WriteNote(const NoticeId& id);
  void CutBack(Held& held);

  Files& files_;
  std::string note_;
  std::unique_ptr<OutputFile> heldNote_;
  std::vector<Held> open_;
};

}  // namespace partnerkit::shipment
