#include "render/label_drawing.h"

#include <algorithm>

#include "values/numbers.h"

namespace partnerkit::render {

namespace {

constexpr int kNormal = 400, kBold = 700;

// Hundredths of an inch as millimetres. An inch counts as 25, as everywhere in a label's drawing. A quarter is exact,
// so that 22.5 mm stay a half, to be rounded as one.
double Millimetres(double hundredths) { return hundredths / 4; }

int Whole(double value) { return ToInteger(value); }

struct Size {
  double height, width;
  int weight = kNormal;
};

Size SizeOf(const LabelField& field) {
  switch (field.font) {
    case 1:
      return {4, field.widthMult * 2};
    case 2:
      return {field.heightMult * 2, field.widthMult};
    case 3:
      return {field.heightMult * 4, field.widthMult * 3, kBold};
    default:
      return {field.heightMult, field.widthMult};
  }
}

// The bold fields are fitted to their boxes one by one. Constant texts go by the numbers of their records.
void FitBold(Size& size, const LabelField& field) {
  const auto scale = [&](double height, double width) {
    size.height = RoundHalfEven(size.height * height, 0);
    size.width = RoundHalfEven(size.width * width, 0);
  };
  const int number = field.Number();
  if (number == 19 || number == 20) scale(1.7, 1.7);
  if (number == 14) scale(1.2, 1.2);
  if (number == 9 && field.recordType == 'T') scale(0.75, 1);
}

void DrawText(const LabelField& field, double pageHeight, Drawing& drawing, const DrawingContext& page) {
  const int number = field.Number();
  double x = Millimetres(field.col), y = Millimetres(field.row);
  Size size = SizeOf(field);
  if (field.font == 3) FitBold(size, field);
  if ((number >= 1 && number <= 5) || (number == 7 && field.text == "CON:")) y -= 3;
  if ((number == 9 && field.text != "TO:") || (number == 14 && field.text != "FOR:")) x -= 10;
  if (number == 18) x += 20;
  const bool reversed = field.colour == "W" || field.colour == "w";
  drawing.PrintText(
      page, field.text,
      {.x = Whole(x), .y = Whole(pageHeight - y), .width = Whole(size.width), .height = Whole(size.height)},
      {.weight = size.weight, .name = "ARIAL"},
      reversed ? TextInks{Ink::kWhite, Ink::kBlack} : TextInks{Ink::kBlack, Ink::kWhite});
}

// Millimetres for the densities that labels have; another one is taken for the width itself.
double BarWidth(const std::string& density) {
  if (density == "4") return 0.5;
  if (density == "6") return 0.4;
  if (density == "8") return 0.3;
  return NumberAtStart(density);
}

void DrawBarcode(const LabelField& field, double pageHeight, Drawing& drawing, const DrawingContext& page) {
  const double y = Millimetres(field.row) - 4, height = Millimetres(field.heightMult);
  drawing.EAN128Barcode(page, field.text,
                        {.x = Whole(Millimetres(field.col)),
                         .y = Whole(pageHeight - y - height),
                         .height = Whole(height),
                         .barWidth = BarWidth(field.density)});
}

void DrawLine(const LabelField& field, double pageHeight, Drawing& drawing, const DrawingContext& page) {
  const auto down = [&](double row) { return Whole(pageHeight - (Millimetres(row) - 3)); };
  drawing.PrintLine(page, {.x1 = Whole(Millimetres(field.col)),
                           .y1 = down(field.row),
                           .x2 = Whole(Millimetres(field.col2)),
                           .y2 = down(field.row2),
                           .thickness = Whole(field.thickness / 4)});
}

LabelField Moved(LabelField field, std::span<const FieldMove> moves) {
  const auto move = std::ranges::find(moves, field.Number(), &FieldMove::number);
  if (move == moves.end()) return field;
  field.row += move->rows;
  field.col += move->cols;
  if (move->font != 0) field.font = move->font;
  return field;
}

}  // namespace

void DrawLabel(const LabelPackets& label, const LabelStyle& style, Drawing& drawing, const DrawingContext& page) {
  const double pageHeight = Millimetres(label.length);
  for (const LabelField& field : label.fields) {
    switch (field.recordType) {
      case 'T':
        DrawText(Moved(field, style.fieldMoves), pageHeight, drawing, page);
        break;
      case 'C':
        DrawText(Moved(field, style.constantMoves), pageHeight, drawing, page);
        break;
      case 'B':
        DrawBarcode(field, pageHeight, drawing, page);
        break;
      default:
        DrawLine(field, pageHeight, drawing, page);
    }
  }
}

}  // namespace partnerkit::render
