#include "shipment/notice_files.h"

#include <algorithm>
#include <utility>

#include "frame/line_reader.h"
#include "frame/note_lines.h"

namespace partnerkit::shipment {

namespace {

constexpr std::string_view kHead = "partnerkit notice 1";
constexpr std::string_view kFoot = "end";

// "base added path"
std::optional<NoticeFiles::Pending::File> ReadFile(std::string_view line) {
  const std::size_t first = line.find(' ');
  const std::size_t second = first == std::string_view::npos ? first : line.find(' ', first + 1);
  if (second == std::string_view::npos) return std::nullopt;
  const auto base = WholeNumber(line.substr(0, first));
  const auto added = WholeNumber(line.substr(first + 1, second - first - 1));
  if (!base || !added) return std::nullopt;
  return NoticeFiles::Pending::File{TextOfNoteLine(line.substr(second + 1)), *base, *added};
}

// False for a note that is not whole: it was never finished, and then nothing was added for it either.
bool ReadNote(InputFile& file, NoticeFiles::Pending& pending) {
  LineReader lines(file);
  Line line;
  if (!lines.Read(line) || line.text != kHead || !lines.Read(line)) return false;
  pending.id.ASNNo = TextOfNoteLine(line.text);
  for (std::int32_t* id : {&pending.id.shipmentId, &pending.id.orderId}) {
    const auto number = lines.Read(line) ? WholeNumber(line.text) : std::nullopt;
    if (!number) return false;
    *id = static_cast<std::int32_t>(*number);
  }
  while (lines.Read(line)) {
    if (line.text == kFoot) return true;
    const auto entry = ReadFile(line.text);
    if (!entry) return false;
    pending.files.push_back(*entry);
  }
  return false;
}

template <class F>
void Ignoring(F operation) {
  try {
    operation();
  } catch (const RunTimeError&) {
    // On the way out of another failure; the note that stays tells the next run.
  }
}

}  // namespace

std::string NoticeFiles::NotePath(std::string output) {
  std::ranges::replace(output, '*', '_');
  return output + ".pending";
}

std::optional<NoticeFiles::Pending> NoticeFiles::FindPending(const std::string& output) {
  const std::string path = NotePath(output);
  if (!files_.Exists(path)) return std::nullopt;
  Pending pending;
  try {
    pending.note = files_.OpenInput(path, Share::kExclusive);
    if (!ReadNote(*pending.note, pending)) pending.files.clear();
  } catch (const RunTimeError&) {
    return std::nullopt;
  }
  return pending;
}

std::vector<std::string> NoticeFiles::TakeBack(const Pending& pending) {
  std::vector<std::string> cut;
  for (const Pending::File& each : pending.files) {
    if (!files_.Exists(each.path)) continue;
    const std::unique_ptr<OutputFile> file = files_.OpenOutput(each.path, OutputMode::kAppend);
    const std::uint64_t length = file->Length();
    if (length <= each.base || length > each.base + each.added) continue;
    file->Truncate(each.base);
    file->Sync();
    if (each.base == 0) files_.Delete(each.path);
    file->Close();
    cut.push_back(each.path);
  }
  return cut;
}

void NoticeFiles::Forget(const std::string& output) { files_.Delete(NotePath(output)); }

bool NoticeFiles::Begin(const std::string& output) {
  note_ = NotePath(output);
  heldNote_ = files_.OpenOutput(note_, OutputMode::kAppend);
  if (heldNote_->Length() == 0) return true;
  std::exchange(heldNote_, nullptr)->Close();
  return false;
}

std::size_t NoticeFiles::Open(const std::string& path) {
  const bool isNew = !files_.Exists(path);
  auto file = files_.OpenOutput(path, OutputMode::kAppend);
  const std::uint64_t base = file->Length();
  open_.push_back({path, std::move(file), base, isNew, {}});
  return open_.size() - 1;
}

void NoticeFiles::WriteNote(const NoticeId& id) {
  std::string note = std::string(kHead) + '\n' + NoteLine(id.ASNNo) + '\n' + std::to_string(id.shipmentId) + '\n' +
                     std::to_string(id.orderId) + '\n';
  for (const Held& held : open_) {
    note += std::to_string(held.base) + ' ' + std::to_string(held.text.size()) + ' ' + NoteLine(held.path) + '\n';
  }
  heldNote_->Write(note.append(kFoot) + '\n');
  heldNote_->Sync();
}

void NoticeFiles::Write(const NoticeId& id) {
  try {
    WriteNote(id);
    for (Held& held : open_) {
      held.file->Write(held.text);
      held.file->Sync();
    }
  } catch (const RunTimeError&) {
    Abandon();
    throw;
  }
}

void NoticeFiles::Settle() {
  for (Held& held : open_) held.file->Close();
  open_.clear();
  if (!heldNote_) return;
  files_.Delete(note_);
  std::exchange(heldNote_, nullptr)->Close();
}

void NoticeFiles::CutBack(Held& held) {
  if (held.file->Length() > held.base) {
    held.file->Truncate(held.base);
    held.file->Sync();
  }
  if (held.isNew && held.base == 0) files_.Delete(held.path);
  held.file->Close();
}

void NoticeFiles::Abandon() {
  bool whole = true;
  for (Held& held : open_) {
    try {
      CutBack(held);
    } catch (const RunTimeError&) {
      whole = false;
    }
  }
  open_.clear();
  if (!heldNote_) return;
  if (whole) Ignoring([&] { files_.Delete(note_); });
  Ignoring([&] { std::exchange(heldNote_, nullptr)->Close(); });
}

}  // namespace partnerkit::shipment
