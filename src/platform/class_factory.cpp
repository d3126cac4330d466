#include "partnerkit/class_factory.h"

#include <dlfcn.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <exception>
#include <filesystem>
#include <fstream>
#include <new>
#include <string>
#include <vector>

#include "frame/live_objects.h"
#include "partnerkit/catalogue.h"
#include "partnerkit/platform.h"

namespace partnerkit::platform {

namespace {

namespace fs = std::filesystem;

fs::path RegisterFile() {
  const char* const data = std::getenv("XDG_DATA_HOME");
  if (data != nullptr && *data != '\0') return fs::path(data) / "partnerkit" / "classes";
  const char* const home = std::getenv("HOME");
  if (home == nullptr || *home == '\0') throw std::runtime_error("no home folder");
  return fs::path(home) / ".local" / "share" / "partnerkit" / "classes";
}

std::string OwnPath() {
  Dl_info info{};
  if (dladdr(reinterpret_cast<const void*>(&DllRegisterServer), &info) == 0 || info.dli_fname == nullptr) {
    throw std::runtime_error("the library's path is unknown");
  }
  return fs::absolute(info.dli_fname).lexically_normal().string();
}

// The lines of the register that name none of our classes.
std::vector<std::string> ForeignLines(const fs::path& file) {
  std::vector<std::string> lines;
  std::ifstream in(file);
  for (std::string line; std::getline(in, line);) {
    if (FindClass(line.substr(0, line.find('\t'))) == nullptr) lines.push_back(line);
  }
  return lines;
}

// The register is replaced in one step, so that a reader sees the old one or the new one.
void WriteRegister(const fs::path& file, const std::vector<std::string>& lines) {
  fs::create_directories(file.parent_path());
  const fs::path draft = file.string() + "." + std::to_string(getpid()) + ".tmp";
  {
    std::ofstream out(draft, std::ios::trunc);
    for (const std::string& line : lines) out << line << '\n';
    out.flush();
    if (!out) throw std::runtime_error("the register cannot be written");
  }
  fs::rename(draft, file);
}

template <class F>
std::int32_t Registering(F change) {
  try {
    const fs::path file = RegisterFile();
    std::vector<std::string> lines = ForeignLines(file);
    change(lines);
    WriteRegister(file, lines);
    return kPartnerKitOk;
  } catch (const std::exception&) {
    return kPartnerKitCannotRegister;
  }
}

}  // namespace

}  // namespace partnerkit::platform

using namespace partnerkit;

namespace {

template <class Class>
std::int32_t GetObject(const char* progId, const Ports* ports, Class** object,
                       std::unique_ptr<Class> (*create)(std::string_view, const Ports&)) {
  if (object == nullptr) return kPartnerKitBadPointer;
  *object = nullptr;
  if (progId == nullptr) return kPartnerKitBadPointer;
  try {
    *object = create(progId, ports != nullptr ? *ports : platform::DefaultPorts()).release();
  } catch (const std::exception&) {
    return kPartnerKitOutOfMemory;
  }
  return *object != nullptr ? kPartnerKitOk : kPartnerKitNoSuchClass;
}

}  // namespace

std::int32_t DllGetClassObject(const char* progId, const Ports* ports, Translator** object) {
  return GetObject(progId, ports, object, CreateTranslator);
}

std::int32_t DllGetLabelObject(const char* progId, const Ports* ports, LabelClass** object) {
  return GetObject(progId, ports, object, CreateLabelClass);
}

std::int32_t DllCanUnloadNow() { return LiveObjects() == 0 ? kPartnerKitOk : kPartnerKitFalse; }

std::int32_t DllRegisterServer() {
  return platform::Registering([](std::vector<std::string>& lines) {
    const std::string path = platform::OwnPath();
    for (const PublicClass& row : Catalogue()) lines.push_back(std::string(row.progId) + '\t' + path);
  });
}

std::int32_t DllUnregisterServer() {
  return platform::Registering([](std::vector<std::string>&) {});
}
