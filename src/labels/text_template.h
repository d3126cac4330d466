// A text with values in it: "TO: `ToName`|". Layouts in every printer language are such texts.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "labels/label_values.h"

namespace partnerkit::labels {

class TextTemplate {
 public:
  // `source` must outlive the template. A name that no value has is a mistake in the layout and aborts the program.
  explicit TextTemplate(std::string_view source);

  // Values go out as they stand: no printer language is escaped.
  void AppendTo(std::string& text, const LabelValues& values) const;
  std::string With(const LabelValues& values) const;

 private:
  struct Piece {
    std::string_view literal;
    std::string LabelValues::*value;  // behind the literal; null for none
  };

  std::vector<Piece> pieces_;
};

}  // namespace partnerkit::labels
