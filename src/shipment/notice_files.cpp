#include "shipment/notice_files.h"

#include <array>
#include <utility>

#include "partnerkit/run_time_error.h"

namespace partnerkit::shipment {

namespace {

constexpr std::string_view kLineEnd = "\r\n";

// How often a file that grows while it is being opened is tried again.
constexpr int kOpenAttempts = 5;

// Whether a file is still to be made. Raises for a folder that isn't there, or that has the name.
bool IsNew(Files& files, const std::string& path) {
  try {
    files.Length(path);
    return false;
  } catch (const RunTimeError& error) {
    if (error.Number() != run_time::kFileNotFound) throw;
    return true;
  }
}

bool EndsLine(std::string_view text) { return text.empty() || text.back() == '\n' || text.back() == '\r'; }

FileEnd EndOf(Files& files, const std::string& path) {
  const auto file = files.OpenInput(path, Share::kDenyWrite);
  const std::uint64_t length = file->Length();
  std::array<char, 1> last{};
  const std::size_t read = length > 0 ? file->ReadAt(length - 1, last) : 0;
  return {length, EndsLine({last.data(), read})};
}

// What `open` gives; null when another program has the file, or has just taken it away.
template <class F>
auto UnlessInUse(F open) -> decltype(open()) {
  try {
    return open();
  } catch (const RunTimeError& error) {
    if (error.Number() != run_time::kPermissionDenied && error.Number() != run_time::kFileNotFound) throw;
    return nullptr;
  }
}

// Held against everybody, for what is to be removed.
std::unique_ptr<InputFile> HoldUnlessInUse(Files& files, const std::string& path) {
  return UnlessInUse([&] { return files.OpenInput(path, Share::kExclusive); });
}

template <class F>
bool Done(F operation) {
  try {
    operation();
    return true;
  } catch (const RunTimeError&) {
    return false;
  }
}

NoticeFiles::TakenBack RemoveNew(Files& files, const FileGrowth& growth) {
  const bool isDraft = !growth.draft.empty() && files.Exists(growth.draft);
  const auto file = HoldUnlessInUse(files, isDraft ? growth.draft : growth.path);
  if (file == nullptr) return NoticeFiles::TakenBack::kInUse;
  // Where files are renamed by a second link, a kill between the two leaves both names.
  if (isDraft && !file->StillNamed(growth.path)) return NoticeFiles::TakenBack::kUntouched;
  if (file->Length() != growth.added) return NoticeFiles::TakenBack::kChanged;
  files.Delete(growth.path);
  return NoticeFiles::TakenBack::kCutBack;
}

NoticeFiles::TakenBack CutGrownBack(Files& files, const FileGrowth& growth) {
  const auto file = UnlessInUse([&] { return files.OpenOutput(growth.path, OutputMode::kAppendOwn); });
  if (file == nullptr) return NoticeFiles::TakenBack::kInUse;
  const std::uint64_t length = file->Length();
  if (length < growth.before || length > growth.before + growth.added) return NoticeFiles::TakenBack::kChanged;
  if (length == growth.before) return NoticeFiles::TakenBack::kUntouched;
  file->Truncate(growth.before);
  file->Sync();
  file->Close();
  return NoticeFiles::TakenBack::kCutBack;
}

}  // namespace

NoticeFiles::~NoticeFiles() {
  Abandon();
  if (!leavesDrafts_) DropDrafts();
}

std::size_t NoticeFiles::Open(const std::string& path, Naming naming) {
  if (naming == Naming::kMadeUp && files_.Resolved(path) != path) {
    throw RunTimeError(run_time::kPathAccess, "The name is a link of somebody else's: " + path);
  }
  if (IsNew(files_, path)) {
    Held held;
    held.isNamed = false;
    held.file = files_.OpenDraft(path, held.draft);
    held_.push_back(std::move(held));
  } else {
    held_.push_back(OpenGrowing(path, naming));
  }
  held_.back().path = path;
  return held_.size() - 1;
}

// A file that is held for writing cannot be read beside that, so that it is read before and held again. A device has no
// length, and cannot be read.
NoticeFiles::Held NoticeFiles::OpenGrowing(const std::string& path, Naming naming) {
  const OutputMode mode = naming == Naming::kMadeUp ? OutputMode::kAppendOwn : OutputMode::kAppend;
  for (int attempt = 0; attempt < kOpenAttempts; ++attempt) {
    Held held;
    held.file = files_.OpenOutput(path, mode);
    held.before = held.file->Length();
    FileEnd& end = ends_[path];
    if (held.before == 0) end = {};
    if (held.before == end.length) {
      if (!end.endsLine) held.text = kLineEnd;
      held.begun = held.text.size();
      return held;
    }
    held.file.reset();
    end = EndOf(files_, path);
  }
  throw RunTimeError(run_time::kPermissionDenied, "Another program keeps writing to the file: " + path);
}

void NoticeFiles::LetGo() {
  Held held = std::move(held_.back());
  held_.pop_back();
  CutBack(held);
  if (!held.isNamed) files_.Delete(held.draft);
}

std::vector<FileGrowth> NoticeFiles::Growths() const {
  std::vector<FileGrowth> growths;
  for (const Held& held : held_) {
    growths.push_back({held.path, held.draft, !held.draft.empty(), held.before, held.Added().size()});
  }
  return growths;
}

void NoticeFiles::Name(Held& held) {
  try {
    held.isNamed = files_.RenameNew(held.draft, held.path);
  } catch (const RunTimeError&) {
    // It may be named all the same, and only not be known to outlive a power failure.
    held.isNamed = !files_.Exists(held.draft);
    held.mayBe = !held.isNamed && files_.Exists(held.path);
    throw;
  }
  if (!held.isNamed) throw RunTimeError(run_time::kFileExists, "There is something of that name by now: " + held.path);
}

void NoticeFiles::Write() {
  for (Held& held : held_) {
    held.file->Write(held.Added());
    held.file->Sync();
    if (!held.isNamed) Name(held);
  }
}

void NoticeFiles::Settle() {
  for (Held& held : std::exchange(held_, {})) {
    if (!held.Added().empty()) ends_[held.path] = {held.before + held.Added().size(), EndsLine(held.text)};
    // What they hold is on the disk.
    Done([&] { held.file->Close(); });
  }
}

void NoticeFiles::CutBack(Held& held) {
  if (!held.isNamed) return;
  if (!held.draft.empty()) {
    files_.Delete(held.path);
  } else if (held.file->Length() > held.before) {
    held.file->Truncate(held.before);
    held.file->Sync();
  }
  held.file->Close();
}

bool NoticeFiles::Abandon() {
  bool all = true;
  std::vector<Held> drafts;
  for (Held& held : std::exchange(held_, {})) {
    all = Done([&] { CutBack(held); }) && !held.mayBe && all;
    if (!held.isNamed) drafts.push_back(std::move(held));
  }
  held_ = std::move(drafts);
  return all;
}

void NoticeFiles::DropDrafts() {
  for (const Held& held : std::exchange(held_, {})) Done([&] { files_.Delete(held.draft); });
}

NoticeFiles::TakenBack NoticeFiles::TakeBack(Files& files, const FileGrowth& growth) {
  if (!growth.draft.empty() && files.Exists(growth.draft)) return RemoveNew(files, growth);
  // A link is somebody else's: the name that was noted was none.
  if (!files.Exists(growth.path) || files.Resolved(growth.path) != growth.path) return TakenBack::kChanged;
  return growth.isNew ? RemoveNew(files, growth) : CutGrownBack(files, growth);
}

bool NoticeFiles::RemoveDraft(Files& files, const std::string& draft) {
  if (!files.Exists(draft)) return true;
  const auto held = HoldUnlessInUse(files, draft);
  if (held == nullptr) return false;
  files.Delete(draft);
  return true;
}

// A new draft clears them away. One that can't be made is missed by nobody.
void NoticeFiles::ClearDrafts(Files& files, const std::string& path) {
  Done([&] {
    std::string draft;
    const auto file = files.OpenDraft(path, draft);
    files.Delete(draft);
  });
}

}  // namespace partnerkit::shipment
