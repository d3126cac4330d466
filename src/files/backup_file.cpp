#include <algorithm>
#include <utility>

#include "files/line_reader.h"
#include "files/note_lines.h"
#include "files/work_queue.h"

namespace partnerkit {

// What a note tells: what was to be appended, and where the backup stood.
struct BackupFile::Note {
  std::uint64_t base = 0;
  std::string sourcePath;
  std::string sourceIdentity;
  std::vector<ByteRange> ranges;
  std::vector<std::int32_t> orders;
};

namespace {

constexpr std::string_view kNoteHead = "partnerkit backup 1";
constexpr std::string_view kNoteFoot = "end";
constexpr std::string_view kOrder = "order";

}  // namespace

// A note that is not whole was never finished, and then nothing was appended for it either.
std::optional<BackupFile::Note> BackupFile::ReadNote(InputFile& file) {
  LineReader lines(file);
  Line line;
  Note note;
  if (!lines.Read(line) || line.text != kNoteHead) return std::nullopt;
  if (!lines.Read(line)) return std::nullopt;
  const auto base = WholeNumber(line.text);
  if (!base || !lines.Read(line)) return std::nullopt;
  note.base = *base;
  note.sourcePath = TextOfNoteLine(line.text);
  if (!lines.Read(line)) return std::nullopt;
  note.sourceIdentity = line.text;
  while (lines.Read(line)) {
    if (line.text == kNoteFoot) return note;
    const std::size_t blank = line.text.find(' ');
    if (blank == std::string_view::npos) return std::nullopt;
    if (line.text.substr(0, blank) == kOrder) {
      note.orders.push_back(static_cast<std::int32_t>(WholeNumber(line.text.substr(blank + 1)).value_or(0)));
      continue;
    }
    const auto begin = WholeNumber(line.text.substr(0, blank));
    const auto end = WholeNumber(line.text.substr(blank + 1));
    if (!begin || !end) return std::nullopt;
    note.ranges.push_back({*begin, *end});
  }
  return std::nullopt;
}

void BackupFile::Open(const std::string& path) {
  path_ = path;
  file_ = files_.OpenOutput(path, OutputMode::kAppend);
  try {
    FinishPending();
  } catch (const RunTimeError&) {
    file_.reset();
    throw;
  }
}

void BackupFile::Close() {
  if (!file_) return;
  const std::unique_ptr<OutputFile> file = std::move(file_);
  file->Close();
}

void BackupFile::Append(InputFile& source, const std::string& sourcePath, const std::vector<ByteRange>& ranges,
                        const std::vector<std::int32_t>& orders) {
  if (ranges.empty()) return;
  const std::uint64_t base = file_->Length();
  file_->TakeRights(source.Rights(), base == 0 ? Take::kMode : Take::kNoMore);
  WriteNote(source, sourcePath, ranges, orders);
  try {
    CopyRanges(source, ranges);
  } catch (const RunTimeError&) {
    file_->Truncate(base);
    throw;
  }
}

void BackupFile::Settle() {
  finished_.clear();
  if (!pending_) return;
  files_.Delete(NotePath());
  pending_ = false;
}

void BackupFile::WriteNote(InputFile& source, const std::string& sourcePath, const std::vector<ByteRange>& ranges,
                           const std::vector<std::int32_t>& orders) {
  std::string draft;
  const std::unique_ptr<OutputFile> note = files_.OpenDraft(NotePath(), draft);
  note->Write(std::string(kNoteHead) + '\n' + std::to_string(file_->Length()) + '\n' + NoteLine(sourcePath) + '\n' +
              source.Identity() + '\n');
  for (const ByteRange& range : ranges) {
    note->Write(std::to_string(range.begin) + ' ' + std::to_string(range.end) + '\n');
  }
  for (const std::int32_t order : orders) note->Write(std::string(kOrder) + ' ' + std::to_string(order) + '\n');
  note->Write(std::string(kNoteFoot) + '\n');
  note->Sync();
  files_.Rename(draft, NotePath());
  note->Close();
  pending_ = true;
}

void BackupFile::FinishPending() {
  if (!files_.Exists(NotePath())) return;
  std::optional<Note> note;
  {
    const std::unique_ptr<InputFile> file = files_.OpenInput(NotePath(), Share::kExclusive);
    note = ReadNote(*file);
  }
  pending_ = true;
  if (note && Finish(*note)) finished_ = std::move(note->orders);
}

// The order file is replaced only after the backup is on the disk. So while it is the one noted, its lines are appended
// again from where the backup stood; once it is another, the backup is whole, unless somebody else took the order file
// away between the two: then the half that was appended goes, for a broken line is worse than none. True when the
// backup holds the lines.
bool BackupFile::Finish(const Note& note) {
  if (files_.Exists(note.sourcePath)) {
    const std::unique_ptr<InputFile> source = files_.OpenInput(note.sourcePath, Share::kExclusive);
    if (source->Identity() == note.sourceIdentity) {
      file_->Truncate(std::min(note.base, file_->Length()));
      CopyRanges(*source, note.ranges);
      return true;
    }
  }
  std::uint64_t whole = note.base;
  for (const ByteRange& range : note.ranges) whole += range.end - range.begin;
  if (file_->Length() >= whole) return true;
  file_->Truncate(std::min(note.base, file_->Length()));
  return false;
}

void BackupFile::CopyRanges(InputFile& source, const std::vector<ByteRange>& ranges) {
  std::vector<char> block(256 * 1024);
  for (const ByteRange& range : ranges) {
    char last = '\n';
    for (std::uint64_t at = range.begin; at < range.end;) {
      const std::size_t wanted = static_cast<std::size_t>(std::min<std::uint64_t>(block.size(), range.end - at));
      const std::size_t read = source.ReadAt(at - 1, std::span(block).first(wanted));
      if (read == 0)
        throw RunTimeError(run_time::kDeviceError, "The order file is shorter than it was when it was listed");
      file_->Write({block.data(), read});
      last = block[read - 1];
      at += read;
    }
    // The order file's last line may have no end; the next run's lines must not be glued to it.
    if (last != '\n' && last != '\r') file_->Write("\r\n");
  }
  file_->Sync();
}

}  // namespace partnerkit
