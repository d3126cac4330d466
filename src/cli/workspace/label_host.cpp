#include "cli/workspace/label_host.h"

#include <utility>

#include "partnerkit/catalogue.h"

namespace partnerkit::cli {

LabelHost::LabelHost(host::SqlHost& host, Port port, std::string language)
    : WatchedHost(host), port_(std::move(port)), language_(std::move(language)) {}

std::optional<std::string> LabelHost::Setting(std::string_view name) {
  if (name == "PrinterLanguage" && !language_.empty()) return language_;
  return WatchedHost::Setting(name);
}

void LabelHost::ComSend(std::string_view text) {
  if (!port_) return WatchedHost::ComSend(text);
  port_(ComPort(), text);
}

std::unique_ptr<LabelClass> MakeLabelClass(const std::string& name, const Ports& ports) {
  auto label = CreateLabelClass(name, ports);
  if (!label) label = CreateLabelClass("PartnerKit." + name, ports);
  if (!label) throw Refusal("class \"" + name + "\" is not known, or no label class");
  return label;
}

std::optional<Pack> FindPack(const Command& command, Workspace& workspace, std::int32_t id) {
  Pack pack;
  pack.Id = id;
  if (workspace.Host().Records().Load(Pack::kType, &pack)) return pack;
  command.Say("pack " + std::to_string(id) + ": no such pack in " + workspace.Folder().string());
  return std::nullopt;
}

}  // namespace partnerkit::cli
