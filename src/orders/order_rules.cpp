#include "orders/order_rules.h"

namespace partnerkit::orders {

namespace {

bool FitsCode(std::string_view codes, std::string_view code) { return codes.empty() || IsOneOf(code, codes); }

bool FitsJobs(Jobs jobs, bool hasJobs) { return jobs == Jobs::kAny || (jobs == Jobs::kSome) == hasJobs; }

bool FitsVersion(Version version, std::string_view given) {
  return version == Version::kAny || (version == Version::kGiven) == !given.empty();
}

bool Fits(const OrderRule& rule, const OrderFacts& facts) {
  return FitsCode(rule.purpose, facts.purpose) && FitsCode(rule.type, facts.type) &&
         (rule.otherType.empty() || rule.otherType != facts.type) && FitsCode(rule.storedType, facts.storedType) &&
         FitsCode(rule.storedChangeFlag, facts.storedChangeFlag) && FitsCode(rule.response, facts.response) &&
         FitsVersion(rule.version, facts.version) && FitsJobs(rule.jobs, facts.hasJobs) &&
         (!rule.incomplete || facts.incomplete) && (!rule.directToStore || facts.directToStore);
}

}  // namespace

const OrderRule* FirstFitting(std::span<const OrderRule> rules, const OrderFacts& facts) {
  for (const OrderRule& rule : rules) {
    if (Fits(rule, facts)) return &rule;
  }
  return nullptr;
}

bool IsOneOf(std::string_view code, std::string_view codes) {
  if (code.empty() || code.find(' ') != std::string_view::npos) return false;
  while (!codes.empty()) {
    const std::size_t blank = codes.find(' ');
    if (codes.substr(0, blank) == code) return true;
    codes = blank == std::string_view::npos ? std::string_view() : codes.substr(blank + 1);
  }
  return false;
}

}  // namespace partnerkit::orders
