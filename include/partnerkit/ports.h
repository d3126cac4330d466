// What the library asks of the platform: files, clock, computer name, and the error trail's outlets. An embedding
// program takes `platform::DefaultPorts()` and replaces what it wants to handle itself.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <span>
#include <string>
#include <string_view>

#include "partnerkit/components.h"
#include "partnerkit/run_time_error.h"
#include "partnerkit/values.h"

namespace partnerkit {

// Who may do what with a file, as the platform keeps it. The library carries it from one file to another, unread.
struct FileRights {
  bool known = false;
  std::uint32_t mode = 0;
  std::uint32_t owner = 0, group = 0;
};

// What a file takes of them.
enum class Take {
  kAll,
  kMode,
  kNoMore,  // it loses what group and others have beyond them
};

// A file held open for reading. Every operation may raise RunTimeError.
class InputFile {
 public:
  virtual ~InputFile() = default;
  // Reads up to `into.size()` bytes at byte `offset` (from 0); the number read, 0 at the end of the file.
  virtual std::size_t ReadAt(std::uint64_t offset, std::span<char> into) = 0;
  virtual std::uint64_t Length() = 0;
  // False when the path now names another file than the one held (somebody replaced it).
  virtual bool StillNamed(const std::string& path) = 0;
  // A text without blanks or line ends that tells this file from any other that bears its name before or after it: the
  // same while the file grows, another once it is replaced.
  virtual std::string Identity() = 0;
  virtual FileRights Rights() { return {}; }
};

// A file held open for writing. Every operation may raise RunTimeError. A file that is let go without `Close` keeps
// what was written so far.
class OutputFile {
 public:
  virtual ~OutputFile() = default;
  virtual void Write(std::string_view bytes) = 0;
  // Everything written so far is on the disk when this returns.
  virtual void Sync() = 0;
  virtual std::uint64_t Length() = 0;
  // Cuts the file back to `length` bytes.
  virtual void Truncate(std::uint64_t length) = 0;
  virtual void Close() = 0;
  // Gives the file the rights of another, as far as the platform lets us. False when owner or group, which were to be
  // taken, stay what they were.
  virtual bool TakeRights(const FileRights&, Take) { return true; }
};

enum class Share {
  kExclusive,  // no other program may hold the file
  kDenyWrite,  // others may read it, not write it
};

enum class OutputMode {
  kReplace,    // a new file, or an old one emptied
  kAppend,     // a new file, or behind what the old one holds
  kAppendOwn,  // the same of a file whose name we made up: a link that somebody else has put there is refused
};

// The file system. A "\" in a path counts as the platform's separator where no file of that very name exists. Failures
// raise RunTimeError with the numbers of `run_time`. A file is made only under a name that stands for nothing: a link
// that leads nowhere is refused, not followed.
class Files {
 public:
  virtual ~Files() = default;
  virtual std::uint64_t Length(const std::string& path) = 0;
  virtual bool Exists(const std::string& path) = 0;
  // The path in a form that means the same file to a later run, started in another folder.
  virtual std::string FullName(const std::string& path) { return path; }
  // Where a link of that name leads to in the end; the path itself for any other file.
  virtual std::string Resolved(const std::string& path) { return path; }
  virtual std::unique_ptr<InputFile> OpenInput(const std::string& path, Share share) = 0;
  // Exclusive: an output file is never shared.
  virtual std::unique_ptr<OutputFile> OpenOutput(const std::string& path, OutputMode mode) = 0;
  // A new, empty file in the folder of `path`, held like any output until it is closed, for what is to take the place
  // of `path`. `name` gets the path to give to Rename, RenameNew or Delete. These must work while the draft is open:
  // callers rename first and close then, for a draft that nobody holds counts as left by a killed program. Such a one
  // of the same `path` is cleared away, one that is held never; several may be open at once, each under a name of its
  // own. No link is followed. A draft that is let go stays until it is renamed or deleted.
  virtual std::unique_ptr<OutputFile> OpenDraft(const std::string& path, std::string& name) = 0;
  virtual void Delete(const std::string& path) = 0;
  // Gives `from` the name `to` in one step, in the place of a file that has it; durable when it returns.
  virtual void Rename(const std::string& from, const std::string& to) = 0;
  // The same, but never in the place of a file: False, and nothing done, when one has the name `to`.
  virtual bool RenameNew(const std::string& from, const std::string& to) = 0;
  // Makes the last folder of the path. Raises for one that is there.
  virtual void CreateFolder(const std::string& path) = 0;
  // Copies a file with its mode, in the place of one that has the name `to`. What is there under that name is whole at
  // any moment.
  virtual void Copy(const std::string& from, const std::string& to) = 0;
};

class Clock {
 public:
  virtual ~Clock() = default;
  virtual DateTime Now() = 0;
};

// A run-time error as the error trail tells it.
struct ErrorReport {
  std::int32_t number;
  std::string description;
  std::string module;
  std::string procedure;
  std::string report;  // the whole sentence
};

enum class Button { kAbort, kRetry, kIgnore };

struct Mail {
  std::string recipient, subject, note, type, attachmentPath, attachmentName;
};

// Where the error trail goes. Every outlet may be left empty: without a dialog the answer is Abort.
struct ErrorOutlets {
  std::function<Button(const ErrorReport& report, const std::string& title)> dialog;
  std::function<void(std::uint64_t window, const std::string& text)> monitor;
  std::function<void(const Mail& mail)> mail;
  std::string applicationName;
  std::string libraryPath;
};

// Optional outputs of the error trail. All are off at first, so that only the dialog acts.
struct ErrorSettings {
  std::uint64_t monitorWindow = 0;  // above 0: each error goes to this window as text
  bool logToFile = false;           // append each report to the log file
  std::string logFileName;          // empty: "error.log" in the current folder
  std::string mailRecipient;        // not empty: mail each report
  bool silent = false;              // never ask; the procedure is left
  bool passUpward = false;          // raise the error again for the calling component
};

class Spooler;

// Something about his files that the user should know, beside what the run log tells.
enum class Told {
  kDone,    // a file of another was moved aside, say
  kFailed,  // a file could not be put in its place, or removed
};

// Everything a class is handed at its creation. The objects must outlive the class.
struct Ports {
  Files* files = nullptr;
  Clock* clock = nullptr;
  // The computer's name; nothing when the platform cannot tell.
  std::function<std::optional<std::string>()> computerName;
  ComponentFactory components;
  // Where labels and tickets are printed; without one, no printer can be opened.
  Spooler* spooler = nullptr;
  // Called between labels and while a print queue is full, for a host to keep its windows alive. May be empty.
  std::function<void()> yield;
  // One sentence for the user. Where it is empty, a warning on the run log takes its place.
  std::function<void(Told, const std::string& sentence)> tell;
  ErrorOutlets errorOutlets;
  ErrorSettings errorSettings;
};

}  // namespace partnerkit
