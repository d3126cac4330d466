#include <partnerkit/catalogue.h>
#include <partnerkit/platform.h>

#include <iostream>

int main() {
  const auto ports = partnerkit::platform::DefaultPorts();
  const auto translator = partnerkit::CreateTranslator("PartnerKit.clsMGB850csv", ports);
  std::cout << translator->ProgId() << '\n';
}
