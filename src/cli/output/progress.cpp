#include "cli/output/progress.h"

#include <unistd.h>

#include <algorithm>
#include <cstdio>

namespace partnerkit::cli {

namespace {

constexpr auto kQuietStart = std::chrono::seconds(1);
constexpr auto kPause = std::chrono::milliseconds(100);
constexpr std::uint64_t kBarWidth = 30;

}  // namespace

Progress::Progress() : onTerminal_(isatty(STDERR_FILENO) == 1), next_(std::chrono::steady_clock::now() + kQuietStart) {}

void Progress::Show(std::string_view what, std::uint64_t done, std::uint64_t all) {
  if (!onTerminal_ || all == 0) return;
  const Time now = std::chrono::steady_clock::now();
  if (now < next_) return;
  next_ = now + kPause;
  shown_ = true;
  const double share = static_cast<double>(std::min(done, all)) / static_cast<double>(all);
  const auto filled = static_cast<std::size_t>(share * static_cast<double>(kBarWidth));
  const std::string bar = std::string(filled, '#') + std::string(kBarWidth - filled, '.');
  std::fprintf(stderr, "\r%-10.*s [%s] %3d%%", static_cast<int>(what.size()), what.data(), bar.c_str(),
               static_cast<int>(share * 100));
  std::fflush(stderr);
}

void Progress::Clear() {
  if (!shown_) return;
  shown_ = false;
  std::fputs("\r\033[K", stderr);
  std::fflush(stderr);
}

// The classes read in large blocks, so that a look at the clock for each costs nothing.
class ProgressFiles::Input : public InputFile {
 public:
  Input(std::unique_ptr<InputFile> file, ProgressFiles& files)
      : file_(std::move(file)), length_(file_->Length()), files_(files) {}

  std::size_t ReadAt(std::uint64_t offset, std::span<char> into) override {
    if (!files_.purpose_.empty()) files_.progress_.Show(files_.purpose_, offset, length_);
    return file_->ReadAt(offset, into);
  }
  std::uint64_t Length() override { return file_->Length(); }
  bool StillNamed(const std::string& path) override { return file_->StillNamed(path); }
  std::string Identity() override { return file_->Identity(); }
  FileRights Rights() override { return file_->Rights(); }

 private:
  std::unique_ptr<InputFile> file_;
  std::uint64_t length_;
  ProgressFiles& files_;
};

std::unique_ptr<InputFile> ProgressFiles::OpenInput(const std::string& path, Share share) {
  return std::make_unique<Input>(files_.OpenInput(path, share), *this);
}

}  // namespace partnerkit::cli
