// The files that one notice is written to. They grow by the whole notice or not at all, whatever fails and whenever the
// program is killed.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "partnerkit/ports.h"

namespace partnerkit::shipment {

// How a file grows by a notice.
struct FileGrowth {
  std::string path;
  std::string draft;                    // what a new file is called until it is whole
  bool isNew = false;                   // the notice's file is made for it
  std::uint64_t before = 0, added = 0;  // bytes
};

// Whose choice a file's name is.
enum class Naming {
  kGiven,   // the user's: it may be a link
  kMadeUp,  // ours, and to be guessed: a link there is somebody else's, and refused
};

// How the files ended that were opened or written so far. They grow by notice after notice, and would be read each
// time.
struct FileEnd {
  std::uint64_t length = 0;
  bool endsLine = true;
};
using FileEnds = std::map<std::string, FileEnd>;

// Nothing is written before Write, so that the growths can be noted in the store first. A file that isn't there yet is
// a draft until it is whole and on the disk: nobody ever finds a part of it under its name.
class NoticeFiles {
 public:
  // `ends` is kept from notice to notice, and must outlive this one.
  NoticeFiles(Files& files, FileEnds& ends) : files_(files), ends_(ends) {}
  ~NoticeFiles();
  NoticeFiles(const NoticeFiles&) = delete;
  NoticeFiles& operator=(const NoticeFiles&) = delete;

  // Opens a file and gives its number. No other program may have it open until the notice is done with. One that
  // doesn't end in a line end gets one, in front of the text. Raises RunTimeError, as does Write.
  std::size_t Open(const std::string& path, Naming naming);
  // Lets go of the file opened last.
  void LetGo();
  // Text for the file of that number.
  std::string& Text(std::size_t file) { return held_[file].text; }

  std::vector<FileGrowth> Growths() const;
  // Adds every file's text and brings it to the disk. A new file gets its name behind that, unless there is one of that
  // name by now, which is an error.
  void Write();
  // The notice is stored: closes the files.
  void Settle();
  // Cuts the files back to where they stood before Write, and lets go of them; a new one goes. False when that fails.
  // Drafts stay until the end of the object: they are what tells a file that never had its name, and have to outlive
  // what is noted of it in the store.
  bool Abandon();
  // Drafts stay behind that, too: something is noted of them still.
  void LeaveDrafts() { leavesDrafts_ = true; }

  enum class TakenBack {
    kInUse,      // by another program, which may be at work on the notice: nothing is done
    kUntouched,  // the file had not grown, or never had its name
    kCutBack,    // it had, and is as it was before
    kChanged,    // it was added to by others since, or replaced, or is gone: nothing is done
  };
  // What Abandon does, after a killed run. A draft is left to RemoveDraft, for the same reason.
  static TakenBack TakeBack(Files& files, const FileGrowth& growth);
  // False while another program has it.
  static bool RemoveDraft(Files& files, const std::string& draft);
  // Those of a file that killed programs left. Nothing may be noted of any.
  static void ClearDrafts(Files& files, const std::string& path);

 private:
  struct Held {
    std::string path;
    std::string draft;  // empty for a file that was there
    std::unique_ptr<OutputFile> file;
    std::uint64_t before = 0;
    std::string text;
    std::size_t begun = 0;  // of the text: the line end that the file lacked
    bool isNamed = true;    // a new file has its own name,
    bool mayBe = false;     // or may have it and its draft's

    // A notice of no text doesn't end a line either.
    std::string_view Added() const { return text.size() > begun ? std::string_view(text) : std::string_view(); }
  };

  Held OpenGrowing(const std::string& path, Naming naming);
  void Name(Held& held);
  void CutBack(Held& held);
  void DropDrafts();

  Files& files_;
  FileEnds& ends_;
  std::vector<Held> held_;
  bool leavesDrafts_ = false;
};

}  // namespace partnerkit::shipment
