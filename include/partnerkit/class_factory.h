// The entry points of libpartnerkit.so, for a host that loads it at run time by ProgID instead of linking it.
//
// They keep the names and the result codes of the component model that such hosts were written for; where that asked
// for the system's registry, a text file in the user's data folder stands in ("$XDG_DATA_HOME/partnerkit/classes", or
// "~/.local/share/partnerkit/classes"): a line for each ProgID, a tab, and the path of the library that has it.
#pragma once

#include <cstdint>

namespace partnerkit {
struct Ports;
class LabelClass;
class Translator;
}  // namespace partnerkit

extern "C" {

inline constexpr std::int32_t kPartnerKitOk = 0;
inline constexpr std::int32_t kPartnerKitFalse = 1;
inline constexpr std::int32_t kPartnerKitBadPointer = static_cast<std::int32_t>(0x80004003);
inline constexpr std::int32_t kPartnerKitNoSuchClass = static_cast<std::int32_t>(0x80040111);
inline constexpr std::int32_t kPartnerKitOutOfMemory = static_cast<std::int32_t>(0x8007000E);
inline constexpr std::int32_t kPartnerKitCannotRegister = static_cast<std::int32_t>(0x80040201);

// Puts a new object of a document's class into `*object`; the caller deletes it. `ports` null stands for
// platform::DefaultPorts(). Another result than kPartnerKitOk leaves `*object` null.
std::int32_t DllGetClassObject(const char* progId, const partnerkit::Ports* ports, partnerkit::Translator** object);
// The same for a label class.
std::int32_t DllGetLabelObject(const char* progId, const partnerkit::Ports* ports, partnerkit::LabelClass** object);
// kPartnerKitOk when no object of the library is alive, so that it may be unloaded; else kPartnerKitFalse.
std::int32_t DllCanUnloadNow();
// Enters every public class with the path of this library; entries of other libraries stay.
std::int32_t DllRegisterServer();
// Takes this library's classes out again.
std::int32_t DllUnregisterServer();
}
