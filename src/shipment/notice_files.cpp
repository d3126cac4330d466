#include "shipment/notice_files.h"

#include <utility>

#include "partnerkit/run_time_error.h"

namespace partnerkit::shipment {

namespace {

std::string NameUntilWritten(const std::string& path) { return path + ".new"; }

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

// Null while another program has it open.
std::unique_ptr<OutputFile> OpenUnlessInUse(Files& files, const std::string& path) {
  try {
    return files.OpenOutput(path, OutputMode::kAppend);
  } catch (const RunTimeError& error) {
    if (error.Number() != run_time::kPermissionDenied) throw;
    return nullptr;
  }
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

}  // namespace

std::size_t NoticeFiles::Open(const std::string& path) {
  Held held;
  held.path = path;
  held.isNew = IsNew(files_, path);
  held.isNamed = !held.isNew;
  held.file = files_.OpenOutput(held.isNew ? NameUntilWritten(path) : path, OutputMode::kAppend);
  held.before = held.file->Length();
  if (held.isNew && held.before > 0) {
    throw RunTimeError(run_time::kFileExists, "Another file has the name: " + NameUntilWritten(path));
  }
  held_.push_back(std::move(held));
  return held_.size() - 1;
}

void NoticeFiles::LetGo() {
  CutBack(held_.back());
  held_.pop_back();
}

std::vector<FileGrowth> NoticeFiles::Growths() const {
  std::vector<FileGrowth> growths;
  for (const Held& held : held_) growths.push_back({held.path, held.isNew, held.before, held.text.size()});
  return growths;
}

void NoticeFiles::Name(Held& held) {
  if (!IsNew(files_, held.path)) {
    throw RunTimeError(run_time::kFileExists, "Another program has made the file: " + held.path);
  }
  files_.Rename(NameUntilWritten(held.path), held.path);
  held.isNamed = true;
}

void NoticeFiles::Write() {
  for (Held& held : held_) {
    if (!held.isNamed) Name(held);
    held.file->Write(held.text);
    held.file->Sync();
  }
}

void NoticeFiles::Settle() {
  // What they hold is on the disk.
  for (Held& held : std::exchange(held_, {})) Done([&] { held.file->Close(); });
}

void NoticeFiles::CutBack(Held& held) {
  if (held.file->Length() > held.before) {
    held.file->Truncate(held.before);
    held.file->Sync();
  }
  if (held.isNew) files_.Delete(held.isNamed ? held.path : NameUntilWritten(held.path));
  held.file->Close();
}

bool NoticeFiles::Abandon() {
  bool all = true;
  for (Held& held : std::exchange(held_, {})) all = Done([&] { CutBack(held); }) && all;
  return all;
}

bool NoticeFiles::RemoveUnwritten(Files& files, const std::string& path) {
  const std::string name = NameUntilWritten(path);
  if (!files.Exists(name)) return true;
  const auto held = OpenUnlessInUse(files, name);
  if (held == nullptr) return false;
  if (held->Length() == 0) files.Delete(name);
  return true;
}

NoticeFiles::TakenBack NoticeFiles::TakeBack(Files& files, const FileGrowth& growth) {
  if (growth.isNew && files.Exists(NameUntilWritten(growth.path))) {
    if (!RemoveUnwritten(files, growth.path)) return TakenBack::kInUse;
    if (!files.Exists(growth.path)) return TakenBack::kUntouched;
  }
  if (!files.Exists(growth.path)) return TakenBack::kChanged;
  const auto file = OpenUnlessInUse(files, growth.path);
  if (file == nullptr) return TakenBack::kInUse;
  const std::uint64_t length = file->Length();
  if (length < growth.before || length > growth.before + growth.added) return TakenBack::kChanged;
  const bool grew = length > growth.before;
  if (grew) {
    file->Truncate(growth.before);
    file->Sync();
  }
  if (growth.isNew) files.Delete(growth.path);
  file->Close();
  return grew ? TakenBack::kCutBack : TakenBack::kUntouched;
}

}  // namespace partnerkit::shipment
