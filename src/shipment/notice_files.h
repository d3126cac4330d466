// The files that one notice is written to. They grow by the whole notice or not at all, whatever fails and whenever the
// program is killed.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "partnerkit/ports.h"

namespace partnerkit::shipment {

// How a file grows by a notice.
struct FileGrowth {
  std::string path;
  bool isNew = false;                   // the notice's file is made for it
  std::uint64_t before = 0, added = 0;  // bytes
};

// Nothing is written before Write, so that the growths can be noted in the store first. A file that isn't there yet is
// held under another name (its own and ".new") until then: a file that was made, and then forgotten by a killed
// program, would go to the partner empty.
class NoticeFiles {
 public:
  explicit NoticeFiles(Files& files) : files_(files) {}
  ~NoticeFiles() { Abandon(); }
  NoticeFiles(const NoticeFiles&) = delete;
  NoticeFiles& operator=(const NoticeFiles&) = delete;

  // Opens a file and gives its number. No other program may have it open until the notice is done with. Raises
  // RunTimeError, as does Write.
  std::size_t Open(const std::string& path);
  // Lets go of the file opened last.
  void LetGo();
  // Text for the file of that number.
  std::string& Text(std::size_t file) { return held_[file].text; }

  std::vector<FileGrowth> Growths() const;
  // Appends every file's text and brings it to the disk.
  void Write();
  // The notice is stored: closes the files.
  void Settle();
  // Cuts the files back to where they stood before Write, and closes them; a new one goes. False when that fails.
  bool Abandon();

  enum class TakenBack {
    kInUse,      // by another program, which may be at work on the notice: nothing is done
    kUntouched,  // the file had not grown
    kCutBack,    // it had, and is as it was before
    kChanged,    // it was added to by others since, or replaced, or is gone: nothing is done
  };
  // Deletes what a killed run left of a file that was still to be made. False while another program has it.
  static bool RemoveUnwritten(Files& files, const std::string& path);
  // What Abandon does, after a killed run.
  static TakenBack TakeBack(Files& files, const FileGrowth& growth);

 private:
  struct Held {
    std::string path;
    std::unique_ptr<OutputFile> file;
    std::uint64_t before = 0;
    bool isNew = false;
    bool isNamed = true;  // a new file has its own name
    std::string text;
  };

  void Name(Held& held);
  void CutBack(Held& held);

  Files& files_;
  std::vector<Held> held_;
};

}  // namespace partnerkit::shipment
