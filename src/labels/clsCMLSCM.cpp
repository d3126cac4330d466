#include "labels/carton_label.h"
#include "labels/cml_carton_layout.h"

namespace partnerkit::labels {

namespace {

constexpr CartonClass kClass{
    .name = "clsCMLSCM",
    .layout = kCmlCarton,
    .drawing = {.fieldMoves = kCmlCartonFieldMoves, .constantMoves = kCmlCartonConstantMoves},
};

}  // namespace

std::unique_ptr<LabelClass> MakeCMLSCM(const Ports& ports) { return std::make_unique<CartonLabel>(kClass, ports); }

}  // namespace partnerkit::labels
