#include "shipment/notice_files.h"

#include <algorithm>
#include <utility>

#include "frame/line_reader.h"
#include "frame/note_lines.h"

namespace partnerkit::shipment {

namespace {

constexpr std::string_view kHead = "partnerkit notice 1";
constexpr std::string_view kFoot = "end";
// Whether the file was there before.
constexpr std::string_view kNew = "new";
constexpr std::string_view kGrown = "grown";

template <class T>
bool ReadNumber(LineReader& lines, T& number) {
  Line line;
  const auto read = lines.Read(line) ? WholeNumber(line.text) : std::nullopt;
  if (read) number = static_cast<T>(*read);
  return read.has_value();
}

// The file's name and whether it is new. Without both, the file was not touched yet.
bool ReadHead(LineReader& lines, NoticeFiles::Pending& pending, bool& isNew) {
  Line line;
  if (!lines.Read(line) || line.text != kHead || !lines.Read(line)) return false;
  pending.path = TextOfNoteLine(line.text);
  if (!lines.Read(line) || (line.text != kNew && line.text != kGrown)) return false;
  isNew = line.text == kNew;
  return true;
}

// Without all of it, nothing was written to the file yet.
bool ReadRest(LineReader& lines, NoticeFiles::Pending& pending) {
  Line line;
  if (!lines.Read(line)) return false;
  pending.id.ASNNo = TextOfNoteLine(line.text);
  return ReadNumber(lines, pending.id.shipmentId) && ReadNumber(lines, pending.id.orderId) &&
         ReadNumber(lines, pending.base) && ReadNumber(lines, pending.added) && lines.Read(line) && line.text == kFoot;
}

void ReadNote(NoticeFiles::Pending& pending) {
  LineReader lines(*pending.note);
  bool isNew = false;
  if (!ReadHead(lines, pending, isNew)) {
    pending.path.clear();
  } else if (!ReadRest(lines, pending)) {
    pending.id = {};
    pending.base = pending.added = 0;
    if (!isNew) pending.path.clear();
  }
}

std::string NoteHead(const std::string& path, bool isNew) {
  return std::string(kHead) + '\n' + NoteLine(path) + '\n' + std::string(isNew ? kNew : kGrown) + '\n';
}

template <class F>
void Ignoring(F operation) {
  try {
    operation();
  } catch (const RunTimeError&) {
    // The files are on the disk, or another failure is on its way out. A note that stays tells the next run.
  }
}

}  // namespace

std::string NoticeFiles::NotePath(std::string name) {
  std::ranges::replace(name, '*', '_');
  return name + ".pending";
}

std::optional<NoticeFiles::Pending> NoticeFiles::FindPending(const std::string& name) {
  const std::string path = NotePath(name);
  if (!files_.Exists(path)) return std::nullopt;
  Pending pending;
  try {
    pending.note = files_.OpenInput(path, Share::kExclusive);
    ReadNote(pending);
  } catch (const RunTimeError&) {
    return std::nullopt;
  }
  return pending;
}

bool NoticeFiles::TakeBack(const Pending& pending) {
  if (!files_.Exists(pending.path)) return false;
  const std::unique_ptr<OutputFile> file = files_.OpenOutput(pending.path, OutputMode::kAppend);
  const std::uint64_t length = file->Length();
  if (length < pending.base || length > pending.base + pending.added) return false;
  const bool grew = length > pending.base;
  if (grew) {
    file->Truncate(pending.base);
    file->Sync();
  }
  if (pending.base == 0) files_.Delete(pending.path);
  file->Close();
  return grew;
}

void NoticeFiles::Forget(const std::string& name) { files_.Delete(NotePath(name)); }

bool NoticeFiles::Begin(const std::string& name) {
  Held held;
  held.notePath = NotePath(name);
  held.note = files_.OpenOutput(held.notePath, OutputMode::kAppend);
  if (held.note->Length() > 0) {
    held.note->Close();
    return false;
  }
  held_.push_back(std::move(held));
  return true;
}

std::size_t NoticeFiles::Open(const std::string& path) {
  Held& held = held_.back();
  if (!files_.Exists(path)) NoteNew(held, path);
  held.file = files_.OpenOutput(path, OutputMode::kAppend);
  held.path = path;
  held.base = held.file->Length();
  return held_.size() - 1;
}

// A file that is made and then forgotten by a killed program would go to the partner empty. The note reaches the system
// only by being closed, and is another's if it is not as it was left.
void NoticeFiles::NoteNew(Held& held, const std::string& path) {
  const std::string head = NoteHead(path, true);
  held.note->Write(head);
  held.note->Close();
  held.note.reset();
  auto again = files_.OpenOutput(held.notePath, OutputMode::kAppend);
  if (again->Length() != head.size()) {
    throw RunTimeError(run_time::kPermissionDenied, "Another program uses the file: " + held.notePath);
  }
  held.note = std::move(again);
  held.isNew = true;
}

void NoticeFiles::WriteNote(Held& held, const NoticeId& id) {
  std::string note = held.isNew ? std::string() : NoteHead(held.path, false);
  note += NoteLine(id.ASNNo) + '\n';
  for (const std::uint64_t number : {static_cast<std::uint64_t>(id.shipmentId), static_cast<std::uint64_t>(id.orderId),
                                     held.base, static_cast<std::uint64_t>(held.text.size())}) {
    note += std::to_string(number) + '\n';
  }
  held.note->Write(note.append(kFoot) + '\n');
  held.note->Sync();
}

void NoticeFiles::Write(const NoticeId& id) {
  try {
    for (Held& held : held_) WriteNote(held, id);
    for (Held& held : held_) {
      held.file->Write(held.text);
      held.file->Sync();
    }
  } catch (const RunTimeError&) {
    Abandon();
    throw;
  }
}

void NoticeFiles::Settle() {
  std::vector<Held> settled = std::exchange(held_, {});
  for (Held& held : settled) Ignoring([&] { held.file->Close(); });
  for (Held& held : settled) {
    Ignoring([&] {
      files_.Delete(held.notePath);
      held.note->Close();
    });
  }
}

void NoticeFiles::CutBack(Held& held) {
  if (!held.file) return;
  if (held.file->Length() > held.base) {
    held.file->Truncate(held.base);
    held.file->Sync();
  }
  if (held.isNew && held.base == 0) files_.Delete(held.path);
  held.file->Close();
}

void NoticeFiles::Abandon() {
  for (Held& held : std::exchange(held_, {})) {
    Ignoring([&] {
      CutBack(held);
      if (held.note) files_.Delete(held.notePath);
    });
  }
}

}  // namespace partnerkit::shipment
