// A label's layout as data: the records of its format, and the texts that carry its values in each printer language.
#pragma once

#include <span>
#include <string>
#include <string_view>

namespace partnerkit::labels {

enum class Use {
  kAlways,
  kComponent,  // on the label of a component of several only
  kCarton,     // on any other
};

// One record of a packet, with its bar.
struct PacketRecord {
  std::string_view text;
  Use use = Use::kAlways;
};

// The two packets of the format language that label printers understand, and that a page on an ordinary printer is
// drawn from. A format packet says where each numbered field stands and is sent once; a batch packet fills the fields.
//
// Records of a format: T a text field, C a constant text, B a barcode field, L a line, G a graphic; rows count upward
// from the foot of the label, columns from its left edge, in hundredths of an inch.
struct PacketLayout {
  std::string_view header;  // behind "{F," and the format number: length, width and name
  std::span<const PacketRecord> format;
  std::span<const PacketRecord> batch;
};

// "{F,10,A,R,E,600,400,"CMLDC"|...|}".
std::string FormatPacket(const PacketLayout& layout, std::string_view formatNo, bool component);
// The batch packet as a text with values in it.
std::string BatchTemplate(const PacketLayout& layout, bool component);

// A label that marks a change of store, item or location in a run: format and batch in one. Up to five lines, joined by
// carriage return and line feed.
std::string SeparatorPackets(std::string_view message, std::string_view batchControl);

}  // namespace partnerkit::labels
