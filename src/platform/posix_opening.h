// Opening and holding files on POSIX: against programs of either custom, and against links that somebody else has put
// under a name. All raise RunTimeError.
#pragma once

#include <sys/stat.h>

#include <string>

#include "platform/posix_calls.h"

namespace partnerkit::platform {

struct stat StatusOf(int descriptor, const std::string& native);

// Whether a file has that name, and is the one held. `Names` raises where that cannot be told.
bool FileIs(const std::string& native, const struct stat& held);
bool Names(const std::string& native, const struct stat& held);

// Opens with these flags and those that every file is opened with. Not open, with the cause in errno, when it fails.
Descriptor OpenWith(const std::string& native, int flags);

struct HeldFile {
  Descriptor descriptor;
  struct stat status;
};

// Held, once the name still means that file: one that was replaced between the two would be held by nobody who looks
// for it.
HeldFile OpenInputHeld(const std::string& native, bool exclusive);
// Makes the file where there is none. A link that leads nowhere is refused, and every link unless they are followed.
HeldFile OpenOutputHeld(const std::string& native, bool followLinks);

struct Draft {
  std::string name;
  Descriptor descriptor;
};

// A new file beside `native`, see Files::OpenDraft.
Draft MakeDraft(const std::string& native);

}  // namespace partnerkit::platform
