// Files on POSIX. A file in use is held against programs of either custom: those that ask with `flock` and those that
// ask for a lock on the file's bytes (`fcntl`), as other systems' programs do through a file server.
#pragma once

#include <string>

#include "partnerkit/ports.h"

namespace partnerkit::platform {

// The path with each "\" that isn't part of an existing file's or folder's own name turned into "/".
std::string NativePath(const std::string& path);

// Numbers of the errors raised: 70 the file is held by another program; 75 it may not be used so (access rights, a
// read-only disk, a folder); 53 and 76 no such file, no such folder; 61 disk, quota or largest file size reached; 67
// too many open files; 57 the disk fails; 52 a name that no file can have. The description ends with the path and the
// cause.
class PosixFiles : public Files {
 public:
  std::uint64_t Length(const std::string& path) override;
  // True for anything but a folder.
  bool Exists(const std::string& path) override;
  std::string FullName(const std::string& path) override;
  std::string Resolved(const std::string& path) override;
  std::unique_ptr<InputFile> OpenInput(const std::string& path, Share share) override;
  std::unique_ptr<OutputFile> OpenOutput(const std::string& path, OutputMode mode) override;
  // ".orders.csv.partnerkit-1", or a higher number while other programs hold the lower ones.
  std::unique_ptr<OutputFile> OpenDraft(const std::string& path, std::string& name) override;
  // Removes the name also while a program holds the file.
  void Delete(const std::string& path) override;
  void Rename(const std::string& from, const std::string& to) override;
  bool RenameNew(const std::string& from, const std::string& to) override;
  void CreateFolder(const std::string& path) override;
  // By way of a draft. The copy isn't brought to the disk at once.
  void Copy(const std::string& from, const std::string& to) override;
};

}  // namespace partnerkit::platform
