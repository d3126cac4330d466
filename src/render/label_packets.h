// A label's format and batch packets, read for drawing: what a label printer would do with them, an ordinary printer
// does by the program.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace partnerkit::render {

// A record of the format. Rows count up from the foot of the label, columns from its left edge, in hundredths of an
// inch.
struct LabelField {
  char recordType = 'T';  // T a text field, C a constant text, B a barcode field, L a line
  int recordNo = 0;       // among all records of the format, from 1
  std::string fieldNo;    // of a text or barcode field
  double row = 0, col = 0;
  double row2 = 0, col2 = 0;  // the other end of a line
  int font = 0;               // 0 for any but the three that are known
  double heightMult = 0;      // of a text; of a barcode its height in hundredths of an inch
  double widthMult = 0;       // of a text
  std::string density;        // of a barcode
  double thickness = 0;       // of a line
  std::string colour;         // of a text
  std::string text;

  // What corrections go by: a field's own number, of a constant that of its record.
  int Number() const;
};

struct LabelPackets {
  int length = 0, width = 0;  // of the label, in hundredths of an inch
  std::vector<LabelField> fields;
};

// Reads both packets, so that a mistake in them is found before anything is drawn. Graphics and other records are
// passed over, for ordinary printers have no pictures stored. A bar in a value cuts it short, as it does for a label
// printer. Raises RunTimeError: 5 for a packet that ends within a record, 13 for a place that is no number, 91 for a
// value whose field the format doesn't have, 457 for two fields of one number.
LabelPackets ReadPackets(std::string_view format, std::string_view batch);

}  // namespace partnerkit::render
