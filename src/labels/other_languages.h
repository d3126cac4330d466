// A carton label in the languages of other makers' printers: layout and data in one text, nothing kept in the printer.
// One copy, whatever quantity is asked for. Each layout has a place for a zone mark in large print, which stays empty.
#pragma once

#include <string>

#include "labels/label_values.h"

namespace partnerkit::labels {

std::string ZplLabel(const LabelValues& values);
std::string AxiohmLabel(const LabelValues& values);
// The same plan for an earlier, smaller label.
std::string SmallAxiohmLabel(const LabelValues& values);
std::string SatoLabel(const LabelValues& values);

}  // namespace partnerkit::labels
