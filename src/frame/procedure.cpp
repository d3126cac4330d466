#include "frame/procedure.h"

namespace partnerkit {

ErrorHandling::ErrorHandling(std::string moduleLabel, ErrorTrail trail)
    : moduleLabel_(std::move(moduleLabel)), trail_(std::move(trail)) {}

ErrorHandling::ErrorHandling(std::string moduleLabel, const Ports& ports)
    : ErrorHandling(std::move(moduleLabel), ErrorTrail(ports.errorOutlets, ports.errorSettings, *ports.files)) {}

ErrorHandling::InHand::InHand(ErrorHandling& errors, std::string_view procedure)
    : errors_(errors), procedure_(procedure), caller_(errors.inHand_), callersNumber_(errors.number_) {
  errors_.inHand_ = this;
  errors_.number_ = run_time::kNone;
}

ErrorHandling::InHand::~InHand() {
  errors_.inHand_ = caller_;
  errors_.number_ = callersNumber_;
}

bool ErrorHandling::RunAgain(const RunTimeError& error) {
  if (inHand_ == nullptr) throw;
  if (!inHand_->handlerOn_) {
    number_ = error.Number();
    return false;
  }
  switch (Ask(error)) {
    case Answer::kRetry:
      return true;
    case Answer::kNext:
      return false;
    case Answer::kLeave:
      break;
  }
  throw LeaveProcedure();
}

Answer ErrorHandling::Ask(const RunTimeError& error) {
  Answer answer = Answer::kLeave;
  try {
    answer = trail_(moduleLabel_, inHand_->procedure_, error);
  } catch (const RunTimeError&) {
    // Raised once the procedure is unwound.
    inHand_->passedUpward_ = std::current_exception();
  } catch (...) {
    // No memory to tell the error with: the procedure is left.
  }
  // The trail has dealt with the error, whatever the answer.
  number_ = run_time::kNone;
  return answer;
}

HandlerOff::HandlerOff(ErrorHandling& errors) : inHand_(errors.inHand_) {
  errors.number_ = run_time::kNone;
  if (inHand_ != nullptr) wasOn_ = std::exchange(inHand_->handlerOn_, false);
}

HandlerOff::~HandlerOff() {
  if (inHand_ != nullptr) inHand_->handlerOn_ = wasOn_;
}

}  // namespace partnerkit
