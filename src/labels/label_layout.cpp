#include "labels/label_layout.h"

#include <vector>

#include "values/windows_1252.h"

namespace partnerkit::labels {

namespace {

constexpr std::string_view kBatchFoot = ",0,1,1,0,1|";

void AppendRecords(std::string& packet, std::span<const PacketRecord> records, bool component) {
  for (const PacketRecord& record : records) {
    if (record.use == Use::kAlways || (record.use == Use::kComponent) == component) packet += record.text;
  }
  packet += '}';
}

// The message's lines; what follows the fifth belongs to it.
std::vector<std::string_view> LinesOf(std::string_view message) {
  constexpr std::size_t kMost = 5;
  constexpr std::string_view kLineEnd = "\r\n";
  std::vector<std::string_view> lines;
  for (;;) {
    const std::size_t end = lines.size() + 1 < kMost ? message.find(kLineEnd) : std::string_view::npos;
    lines.push_back(message.substr(0, end));
    if (end == std::string_view::npos) return lines;
    message.remove_prefix(end + kLineEnd.size());
  }
}

std::string Constant(std::string_view prefix, std::string_view line, std::size_t cut) {
  return std::string(prefix).append("\"").append(Windows1252Capitals(line.substr(0, cut))).append("\"|");
}

}  // namespace

std::string FormatPacket(const PacketLayout& layout, std::string_view formatNo, bool component) {
  std::string packet = "{F,";
  packet.append(formatNo).append(layout.header);
  AppendRecords(packet, layout.format, component);
  return packet;
}

std::string BatchTemplate(const PacketLayout& layout, bool component) {
  std::string packet = "{B,`FormatNo`,N,`Qty`|E,`BatchControl`";
  packet += kBatchFoot;
  AppendRecords(packet, layout.batch, component);
  return packet;
}

std::string SeparatorPackets(std::string_view message, std::string_view batchControl) {
  const std::vector<std::string_view> lines = LinesOf(message);
  std::string packets =
      R"({F,9,A,R,E,600,400,"SCMSEP"|C,580,300,0,3,2,2,W,L,0,3,"SEPARATOR"|C,580,250,0,3,1,1,B,L,0,3,"NEW STORE/ITEM/LOCATION:"|)";
  packets += Constant("C,580,150,0,3,2,2,B,L,0,3,", lines[0], 20);
  if (lines.size() >= 3) {
    packets += Constant("C,580,110,0,1,2,2,B,L,0,3,", lines[1], 30);
    packets += Constant("C,580,10,0,3,2,2,B,L,0,3,", lines[2], 20);
  } else {
    packets += Constant("C,580,10,0,3,2,2,B,L,0,3,", lines.back(), 20);
  }
  if (lines.size() >= 4) packets += Constant("C,580,55,0,1,2,2,B,L,0,3,", lines[3], 30);
  if (lines.size() >= 5) packets += Constant("C,580,83,0,1,2,2,B,L,0,3,", lines[4], 35);
  return packets.append("}{B,9,N,1|E,").append(batchControl).append(kBatchFoot).append("}");
}

}  // namespace partnerkit::labels
