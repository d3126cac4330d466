// The label classes: a line each. What tells one from another is the table of values in the file of its name.
#pragma once

#include "labels/carton_label.h"

namespace partnerkit::labels {

class clsCMLSCM : public CartonLabel {  // CML carton label, portrait
 public:
  explicit clsCMLSCM(const Ports& ports);
};

}  // namespace partnerkit::labels
