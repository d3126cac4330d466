// A progress line on the terminal, for work of more than a second.
#pragma once

#include <chrono>
#include <cstdint>
#include <string>
#include <string_view>

#include "partnerkit/ports.h"

namespace partnerkit::cli {

// Writes to standard error, and only where that is a terminal.
class Progress {
 public:
  Progress();
  ~Progress() { Clear(); }
  Progress(const Progress&) = delete;
  Progress& operator=(const Progress&) = delete;

  void Show(std::string_view what, std::uint64_t done, std::uint64_t all);
  // Wipes the line, for something else to be written.
  void Clear();

 private:
  using Time = std::chrono::steady_clock::time_point;

  bool onTerminal_;
  bool shown_ = false;
  Time next_;
};

// Files that show how far the reading of one large file has come.
class ProgressFiles : public Files {
 public:
  ProgressFiles(Files& files, Progress& progress) : files_(files), progress_(progress) {}

  std::uint64_t Length(const std::string& path) override { return files_.Length(path); }
  bool Exists(const std::string& path) override { return files_.Exists(path); }
  std::string FullName(const std::string& path) override { return files_.FullName(path); }
  std::unique_ptr<InputFile> OpenInput(const std::string& path, Share share) override;
  std::unique_ptr<OutputFile> OpenOutput(const std::string& path, OutputMode mode) override {
    return files_.OpenOutput(path, mode);
  }
  std::unique_ptr<OutputFile> OpenDraft(const std::string& path, std::string& name) override {
    return files_.OpenDraft(path, name);
  }
  std::string Resolved(const std::string& path) override { return files_.Resolved(path); }
  void Delete(const std::string& path) override { files_.Delete(path); }
  bool RenameNew(const std::string& from, const std::string& to) override { return files_.RenameNew(from, to); }
  void Rename(const std::string& from, const std::string& to) override { files_.Rename(from, to); }
  void CreateFolder(const std::string& path) override { files_.CreateFolder(path); }
  void Copy(const std::string& from, const std::string& to) override { files_.Copy(from, to); }
  // What the reading is for: "listing", "settling".
  void SetPurpose(std::string_view purpose) { purpose_ = purpose; }

 private:
  class Input;

  Files& files_;
  Progress& progress_;
  std::string purpose_;
};

}  // namespace partnerkit::cli
