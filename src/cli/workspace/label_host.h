// What the verbs that print labels share: the host as a label class meets it, the class and the packs by name.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "cli/workspace/watched_host.h"
#include "cli/workspace/workspace.h"
#include "partnerkit/label.h"

namespace partnerkit::cli {

// The workspace's host, with a port for direct labels and, unless it is empty, a printer language of the command's own.
class LabelHost : public WatchedHost {
 public:
  using Port = std::function<void(const std::string& port, std::string_view text)>;

  LabelHost(host::SqlHost& host, Port port, std::string language);

  std::optional<std::string> Setting(std::string_view name) override;
  void ComSend(std::string_view text) override;

 private:
  Port port_;
  std::string language_;
};

// By ProgID, or by the class's name alone. Raises Refusal for a class that isn't known, or no label class.
std::unique_ptr<LabelClass> MakeLabelClass(const std::string& name, const Ports& ports);

// Says so when there is no such pack.
std::optional<Pack> FindPack(const Command& command, Workspace& workspace, std::int32_t id);

}  // namespace partnerkit::cli
