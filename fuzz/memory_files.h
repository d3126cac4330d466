// Files in memory, held and shared as on a disk.
#pragma once

#include <algorithm>
#include <cstring>
#include <map>
#include <memory>
#include <span>
#include <string>
#include <string_view>

#include "partnerkit/ports.h"

namespace partnerkit::fuzz {

class MemoryFiles : public Files {
 public:
  void Put(const std::string& path, std::string bytes) { names_[path] = std::make_shared<File>(std::move(bytes)); }
  const std::string& Bytes(const std::string& path) { return Named(path)->bytes; }
  std::size_t Count() const { return names_.size(); }
  template <class F>
  bool AllNames(F fits) const {
    return std::all_of(names_.begin(), names_.end(), [&](const auto& entry) { return fits(entry.first); });
  }
  bool AnyHeld() const {
    return std::any_of(names_.begin(), names_.end(), [](const auto& entry) { return entry.second->holders != 0; });
  }

  std::uint64_t Length(const std::string& path) override { return Named(path)->bytes.size(); }
  bool Exists(const std::string& path) override { return names_.contains(path); }
  std::unique_ptr<InputFile> OpenInput(const std::string& path, Share) override {
    return std::make_unique<Input>(*this, Free(path));
  }
  std::unique_ptr<OutputFile> OpenOutput(const std::string& path, OutputMode mode) override {
    if (!Exists(path)) Put(path, {});
    const auto file = Free(path);
    if (mode == OutputMode::kReplace) file->bytes.clear();
    return std::make_unique<Output>(file);
  }
  std::unique_ptr<OutputFile> OpenDraft(const std::string& path, std::string& name) override {
    name = path + ".draft";
    return OpenOutput(name, OutputMode::kReplace);
  }
  bool RenameNew(const std::string& from, const std::string& to) override {
    if (Exists(to)) return false;
    Rename(from, to);
    return true;
  }
  void Delete(const std::string& path) override {
    Named(path);
    names_.erase(path);
  }
  void CreateFolder(const std::string&) override {}
  void Copy(const std::string& from, const std::string& to) override { Put(to, Bytes(from)); }
  void Rename(const std::string& from, const std::string& to) override {
    const auto file = Named(from);
    names_.erase(from);
    names_[to] = file;
  }

 private:
  struct File {
    explicit File(std::string content) : bytes(std::move(content)) {}
    std::string bytes;
    int holders = 0;
  };

  class Hold {
   public:
    explicit Hold(std::shared_ptr<File> file) : file_(std::move(file)) { ++file_->holders; }
    ~Hold() { --file_->holders; }
    Hold(const Hold&) = delete;
    Hold& operator=(const Hold&) = delete;
    File& operator*() const { return *file_; }
    File* operator->() const { return file_.get(); }
    const std::shared_ptr<File>& Get() const { return file_; }

   private:
    std::shared_ptr<File> file_;
  };

  class Input : public InputFile {
   public:
    Input(MemoryFiles& files, std::shared_ptr<File> file) : files_(files), file_(std::move(file)) {}
    std::size_t ReadAt(std::uint64_t offset, std::span<char> into) override {
      const std::string& bytes = file_->bytes;
      if (offset >= bytes.size()) return 0;
      const std::size_t count = std::min<std::size_t>(into.size(), bytes.size() - offset);
      std::memcpy(into.data(), bytes.data() + offset, count);
      return count;
    }
    std::uint64_t Length() override { return file_->bytes.size(); }
    bool StillNamed(const std::string& path) override {
      return files_.Exists(path) && files_.Named(path) == file_.Get();
    }
    std::string Identity() override { return std::to_string(reinterpret_cast<std::uintptr_t>(file_.Get().get())); }

   private:
    MemoryFiles& files_;
    Hold file_;
  };

  class Output : public OutputFile {
   public:
    explicit Output(std::shared_ptr<File> file) : file_(std::move(file)) {}
    void Write(std::string_view bytes) override { file_->bytes += bytes; }
    void Sync() override {}
    std::uint64_t Length() override { return file_->bytes.size(); }
    void Truncate(std::uint64_t length) override {
      file_->bytes.resize(std::min<std::size_t>(length, file_->bytes.size()));
    }
    void Close() override {}

   private:
    Hold file_;
  };

  std::shared_ptr<File> Named(const std::string& path) {
    const auto found = names_.find(path);
    if (found == names_.end()) throw RunTimeError(run_time::kFileNotFound, "File not found: " + path);
    return found->second;
  }
  std::shared_ptr<File> Free(const std::string& path) {
    auto file = Named(path);
    if (file->holders != 0) throw RunTimeError(run_time::kPermissionDenied, "In use: " + path);
    return file;
  }

  std::map<std::string, std::shared_ptr<File>> names_;
};

}  // namespace partnerkit::fuzz
