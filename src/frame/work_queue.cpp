#include "frame/work_queue.h"

#include <algorithm>
#include <span>

namespace partnerkit {

std::string TemporaryName(std::string_view path) {
  const std::size_t folder = path.find_last_of("/\\");
  const std::size_t name = folder == std::string_view::npos ? 0 : folder + 1;
  const std::size_t dot = path.substr(name).rfind('.');
  const std::string temporary = std::string(dot == std::string_view::npos ? path : path.substr(0, name + dot)) + ".tmp";
  return temporary == path ? temporary + ".tmp" : temporary;
}

void WorkQueue::Open(const std::string& path) {
  path_ = path;
  file_ = files_.OpenInput(path, Share::kExclusive);
}

void WorkQueue::Close() { file_.reset(); }

InputFile& WorkQueue::File() {
  if (!file_) throw RunTimeError(run_time::kBadFileName, "The order file is not open");
  return *file_;
}

WorkQueue::Rewrite::Rewrite(WorkQueue& queue) : queue_(queue), temporary_(TemporaryName(queue.path_)) {}

WorkQueue::Rewrite::~Rewrite() {
  if (!out_) return;
  out_.reset();
  try {
    queue_.files_.Delete(temporary_);
  } catch (const RunTimeError&) {
    // It stays beside the order file, as it does when the order file cannot be replaced; the next rewrite clears it.
  }
}

void WorkQueue::Rewrite::Begin() {
  try {
    queue_.files_.Delete(temporary_);
  } catch (const RunTimeError&) {
    // There is none, as a rule.
  }
  out_ = queue_.files_.OpenOutput(temporary_, OutputMode::kReplace);
}

void WorkQueue::Rewrite::Claim() {
  const std::unique_ptr<OutputFile> out = std::move(out_);
  if (out) out->Close();
  if (!queue_.File().StillNamed(queue_.path_)) {
    // The next rewrite would clear the temporary file away.
    const std::string kept = queue_.path_ + ".kept";
    queue_.files_.Rename(temporary_, kept);
    throw RunTimeError(run_time::kFileNotFound,
                       "The file " + queue_.path_ + " was taken away or replaced; what is left of it is in " + kept);
  }
}

void WorkQueue::Rewrite::Replace() { queue_.files_.Rename(temporary_, queue_.path_); }

void WorkQueue::Rewrite::Remove(bool withTemporary) {
  queue_.files_.Delete(queue_.path_);
  if (withTemporary) queue_.files_.Delete(temporary_);
}

void WorkQueue::Rewrite::KeepRange(ByteRange range) {
  std::vector<char> block(256 * 1024);
  while (range.begin < range.end) {
    const std::size_t wanted = std::min<std::uint64_t>(block.size(), range.end - range.begin);
    const std::size_t read = queue_.File().ReadAt(range.begin - 1, std::span(block).first(wanted));
    if (read == 0) throw RunTimeError(run_time::kPastEnd, "The file " + queue_.path_ + " became shorter");
    Keep({block.data(), read});
    range.begin += read;
  }
}

}  // namespace partnerkit
