#include "files/work_queue.h"

#include <algorithm>
#include <array>
#include <span>
#include <utility>

namespace partnerkit {

std::string TemporaryName(std::string_view path) {
  const std::size_t folder = path.find_last_of("/\\");
  const std::size_t name = folder == std::string_view::npos ? 0 : folder + 1;
  const std::size_t dot = path.substr(name).rfind('.');
  const std::string temporary = std::string(dot == std::string_view::npos ? path : path.substr(0, name + dot)) + ".tmp";
  return temporary == path ? temporary + ".tmp" : temporary;
}

bool IsEnvelopeSegment(std::string_view text) {
  constexpr std::string_view kTags[] = {"ISA", "GS*", "ST*", "IEA", "GE*", "SE*", "UNB", "UNH", "UNT", "UNZ"};
  return std::ranges::find(kTags, text.substr(0, 3)) != std::end(kTags);
}

std::string RenameToFree(Files& files, const std::string& from, const std::string& name) {
  std::string free = name;
  for (int number = 1; !files.RenameNew(from, free); ++number) free = name + "." + std::to_string(number);
  return free;
}

namespace {

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

std::uint64_t BehindByteOrderMark(InputFile& file) {
  std::array<char, 3> front{};
  const std::size_t read = file.ReadAt(0, front);
  return std::string_view(front.data(), read) == kByteOrderMark ? kByteOrderMark.size() + 1 : 1;
}

}  // namespace

void WorkQueue::Open(const std::string& path) {
  path_ = path;
  target_ = files_.Resolved(path);
  file_ = files_.OpenInput(path, Share::kExclusive);
  begin_ = 0;
}

std::uint64_t WorkQueue::Begin() {
  if (begin_ == 0) begin_ = BehindByteOrderMark(File());
  return begin_;
}

void WorkQueue::Close() { file_.reset(); }

InputFile& WorkQueue::File() {
  if (!file_) throw RunTimeError(run_time::kBadFileName, "The order file is not open");
  return *file_;
}

WorkQueue::Rewrite::Rewrite(WorkQueue& queue, Tell tell)
    : queue_(queue), tell_(std::move(tell)), temporary_(TemporaryName(queue.target_)) {}

WorkQueue::Rewrite::~Rewrite() {
  if (!out_) return;
  try {
    queue_.files_.Delete(draft_);
  } catch (const RunTimeError&) {
    // The next rewrite clears it away.
  }
}

void WorkQueue::Rewrite::Begin() {
  Files& files = queue_.files_;
  if (out_) {
    out_.reset();
    files.Delete(draft_);
  }
  readTo_ = queue_.File().Length();
  if (files.Exists(temporary_) && !MayStay(temporary_)) MoveAside(temporary_);
  out_ = files.OpenDraft(queue_.target_, draft_);
  if (!out_->TakeRights(queue_.File().Rights(), Take::kAll)) {
    tell_("The owner or the group of " + queue_.path_ + " cannot be kept: it is rewritten as a file of another's");
  }
}

// An earlier run may have left it with envelopes of nothing, or a mailbox have just begun to write to it: no reason to
// move it.
bool WorkQueue::Rewrite::MayStay(const std::string& path) {
  std::vector<char> block(64 * 1024);
  try {
    const std::unique_ptr<InputFile> file = queue_.files_.OpenInput(path, Share::kDenyWrite);
    if (file->Length() > block.size()) return false;
    std::string_view rest(block.data(), file->ReadAt(0, block));
    while (!rest.empty()) {
      const std::string_view segment = rest.substr(0, rest.find_first_of("~\r\n"));
      if (segment.find_first_not_of(' ') != std::string_view::npos && !IsEnvelopeSegment(segment)) return false;
      rest.remove_prefix(std::min(rest.size(), segment.size() + 1));
    }
    return true;
  } catch (const RunTimeError& error) {
    // A mailbox that holds it is at work on it.
    return error.Number() == run_time::kPermissionDenied;
  }
}

void WorkQueue::Rewrite::MoveAside(const std::string& path) {
  const std::string moved = RenameToFree(queue_.files_, path, path);
  tell_("The file " + path + " was there already and is now " + moved);
}

// Gives the draft its name before its hold ends: nobody then takes it for left over. A call that is tried again finds
// it there.
const std::string& WorkQueue::Rewrite::Leave(const std::string& name) {
  if (!out_) return draft_;
  draft_ = RenameToFree(queue_.files_, draft_, name);
  std::exchange(out_, nullptr)->Close();
  return draft_;
}

void WorkQueue::Rewrite::Claim() {
  if (queue_.File().StillNamed(queue_.path_) && queue_.File().StillNamed(queue_.target_)) return;
  throw RunTimeError(run_time::kFileNotFound, "The file " + queue_.path_ +
                                                  " was taken away or replaced; what is left of it is in " +
                                                  Leave(queue_.target_ + ".kept"));
}

void WorkQueue::Rewrite::Fail(const RunTimeError& cause, const std::string& what) {
  throw RunTimeError(cause.Number(), "The file " + queue_.path_ + " cannot be " + what + " and keeps all its lines (" +
                                         cause.Description() + "); what should be left of it is in " +
                                         Leave(temporary_));
}

void WorkQueue::Rewrite::Replace() {
  try {
    queue_.files_.Rename(draft_, queue_.target_);
  } catch (const RunTimeError& error) {
    Fail(error, "replaced");
  }
  if (!out_) return;
  TakeLateBytes();
  std::exchange(out_, nullptr)->Close();
}

// The old file has lost its name by now, and nobody else can find what was added to it.
bool WorkQueue::Rewrite::TakeLateBytes() {
  const std::uint64_t length = queue_.File().Length();
  if (length <= readTo_) return false;
  Copy({readTo_ + 1, length + 1});
  out_->Sync();
  return true;
}

void WorkQueue::Rewrite::Remove(bool withTemporary) {
  try {
    queue_.files_.Delete(queue_.target_);
  } catch (const RunTimeError& error) {
    Fail(error, "removed");
  }
  if (out_ && queue_.File().Length() > readTo_) {
    out_->Truncate(0);
    TakeLateBytes();
    Leave(queue_.target_);
    return;
  }
  // One that an earlier run left says as little.
  if (!withTemporary && !queue_.files_.Exists(temporary_)) {
    Leave(temporary_);
    return;
  }
  queue_.files_.Delete(draft_);
  out_.reset();
}

void WorkQueue::Rewrite::Keep(std::string_view bytes) {
  if (Empty()) Copy({1, queue_.Begin()});
  out_->Write(bytes);
}

void WorkQueue::Rewrite::KeepRange(ByteRange range) {
  if (Empty()) Copy({1, queue_.Begin()});
  Copy(range);
}

void WorkQueue::Rewrite::Copy(ByteRange range) {
  if (range.begin >= range.end) return;
  std::vector<char> block(std::min<std::uint64_t>(256 * 1024, range.end - range.begin));
  while (range.begin < range.end) {
    const std::size_t wanted = std::min<std::uint64_t>(block.size(), range.end - range.begin);
    const std::size_t read = queue_.File().ReadAt(range.begin - 1, std::span(block).first(wanted));
    if (read == 0) throw RunTimeError(run_time::kPastEnd, "The file " + queue_.path_ + " became shorter");
    out_->Write({block.data(), read});
    range.begin += read;
  }
}

}  // namespace partnerkit
