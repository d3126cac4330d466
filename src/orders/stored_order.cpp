#include "orders/stored_order.h"

namespace partnerkit::orders {

namespace {

bool Fits(const StoredOrderRule& rule, const StoredOrderFacts& facts) {
  if (!rule.purpose.empty() && !IsOneOf(facts.purpose, rule.purpose)) return false;
  if (rule.jobs == Jobs::kNone && facts.hasJobs) return false;
  if (rule.jobs == Jobs::kSome && !facts.hasJobs) return false;
  return !rule.incomplete || facts.incomplete;
}

}  // namespace

const StoredOrderRule* FirstFitting(std::span<const StoredOrderRule> rules, const StoredOrderFacts& facts) {
  for (const StoredOrderRule& rule : rules) {
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
