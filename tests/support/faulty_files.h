// Real files whose operations fail on demand: a disk that fills up or a share that goes away has no other stand-in.
#pragma once

#include <memory>
#include <string>
#include <utility>

#include "partnerkit/ports.h"

namespace partnerkit::testing {

class FaultyFiles : public Files {
 public:
  explicit FaultyFiles(Files& real) : real_(real) {}

  // After `passed` good ones, the next `times` operations `what` ("Length", "OpenInput", "OpenOutput", "OpenDraft",
  // "Delete", "Rename", "Copy", "Read", "Write", "Sync" or "Truncate") on a file whose path ends in `name` raise
  // `number`.
  void Fail(std::string what, std::string name, std::int32_t number, int times = 1, int passed = 0) {
    fault_ = {std::move(what), std::move(name), number, times, passed};
  }

  std::uint64_t Length(const std::string& path) override { return Check("Length", path), real_.Length(path); }
  bool Exists(const std::string& path) override { return real_.Exists(path); }
  std::string FullName(const std::string& path) override { return real_.FullName(path); }
  std::unique_ptr<InputFile> OpenInput(const std::string& path, Share share) override {
    Check("OpenInput", path);
    return std::make_unique<Input>(*this, path, real_.OpenInput(path, share));
  }
  std::unique_ptr<OutputFile> OpenOutput(const std::string& path, OutputMode mode) override {
    Check("OpenOutput", path);
    return std::make_unique<Output>(*this, path, real_.OpenOutput(path, mode));
  }
  // A draft fails under the name that it is a draft of.
  std::unique_ptr<OutputFile> OpenDraft(const std::string& path, std::string& name) override {
    Check("OpenDraft", path);
    return std::make_unique<Output>(*this, path, real_.OpenDraft(path, name));
  }
  std::string Resolved(const std::string& path) override { return real_.Resolved(path); }
  void Delete(const std::string& path) override { Check("Delete", path), real_.Delete(path); }
  bool RenameNew(const std::string& from, const std::string& to) override {
    return Check("Rename", to), real_.RenameNew(from, to);
  }
  void Rename(const std::string& from, const std::string& to) override { Check("Rename", to), real_.Rename(from, to); }
  void CreateFolder(const std::string& path) override { real_.CreateFolder(path); }
  void Copy(const std::string& from, const std::string& to) override { Check("Copy", to), real_.Copy(from, to); }

 private:
  struct Fault {
    std::string what, name;
    std::int32_t number = 0;
    int times = 0, passed = 0;
  };

  struct Input : InputFile {
    Input(FaultyFiles& owner, std::string path, std::unique_ptr<InputFile> file)
        : files(owner), name(std::move(path)), real(std::move(file)) {}
    std::size_t ReadAt(std::uint64_t offset, std::span<char> into) override {
      return files.Check("Read", name), real->ReadAt(offset, into);
    }
    std::uint64_t Length() override { return real->Length(); }
    bool StillNamed(const std::string& path) override { return real->StillNamed(path); }
    std::string Identity() override { return real->Identity(); }
    FileRights Rights() override { return real->Rights(); }

    FaultyFiles& files;
    std::string name;
    std::unique_ptr<InputFile> real;
  };

  struct Output : OutputFile {
    Output(FaultyFiles& owner, std::string path, std::unique_ptr<OutputFile> file)
        : files(owner), name(std::move(path)), real(std::move(file)) {}
    void Write(std::string_view bytes) override { files.Check("Write", name), real->Write(bytes); }
    void Sync() override { files.Check("Sync", name), real->Sync(); }
    std::uint64_t Length() override { return real->Length(); }
    void Truncate(std::uint64_t length) override { files.Check("Truncate", name), real->Truncate(length); }
    void Close() override { real->Close(); }
    bool TakeRights(const FileRights& rights, Take what) override { return real->TakeRights(rights, what); }

    FaultyFiles& files;
    std::string name;
    std::unique_ptr<OutputFile> real;
  };

  void Check(std::string_view what, const std::string& path) {
    if (fault_.what != what || !path.ends_with(fault_.name) || fault_.times == 0) return;
    if (fault_.passed > 0) {
      --fault_.passed;
      return;
    }
    --fault_.times;
    throw RunTimeError(fault_.number, "It failed: " + fault_.name);
  }

  Files& real_;
  Fault fault_;
};

}  // namespace partnerkit::testing
