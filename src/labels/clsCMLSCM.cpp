#include "labels/cml_carton_layout.h"
#include "labels/label_classes.h"

namespace partnerkit::labels {

namespace {

constexpr CartonClass kClass{
    .name = "clsCMLSCM",
    .layout = kCmlCarton,
    .drawing = {.fieldMoves = kCmlCartonFieldMoves, .constantMoves = kCmlCartonConstantMoves},
};

}  // namespace

clsCMLSCM::clsCMLSCM(const Ports& ports) : CartonLabel(kClass, ports) {}

}  // namespace partnerkit::labels
