// Draws a label that was read from its packets, so that an ordinary printer's font lands where the label printer's
// would.
#pragma once

#include <span>

#include "render/drawing.h"
#include "render/label_packets.h"

namespace partnerkit::render {

// A move of one field, in hundredths of an inch: up by `rows`, to the right by `cols`.
struct FieldMove {
  int number;
  double rows = 0, cols = 0;
  int font = 0;  // the font it gets; 0: its own
};

// How a class's labels are drawn.
struct LabelStyle {
  std::span<const FieldMove> fieldMoves;     // of text fields, by their numbers
  std::span<const FieldMove> constantMoves;  // of constant texts, by their records' numbers
};

void DrawLabel(const LabelPackets& label, const LabelStyle& style, Drawing& drawing, const DrawingContext& page);

}  // namespace partnerkit::render
