// The procedure in hand: which module and procedure an error arises in, whether the standard handler is on there, and
// what the error trail's answer does to it. A step of a procedure is one primitive operation under `Attempt`.
#pragma once

#include <cstdint>
#include <exception>
#include <new>
#include <string>
#include <string_view>
#include <utility>

#include "frame/error_trail.h"

namespace partnerkit {

// One for each object whose procedures call each other.
class ErrorHandling {
 public:
  // `moduleLabel` is "cMGB850csv".
  ErrorHandling(std::string moduleLabel, ErrorTrail trail);
  ErrorHandling(std::string moduleLabel, const Ports& ports);
  ErrorHandling(const ErrorHandling&) = delete;
  ErrorHandling& operator=(const ErrorHandling&) = delete;

  // The error that the procedure in hand kept, 0 when there is none.
  std::int32_t Number() const { return number_; }

  // Thrown to unwind the procedure in hand; not a std::exception, so that no step takes it for a failure of its own.
  struct LeaveProcedure {};

  // A procedure from its first step to its last. Starts without an error number; the caller's is back afterwards.
  class InHand {
   public:
    // `procedure` must outlive the object.
    InHand(ErrorHandling& errors, std::string_view procedure);
    ~InHand();
    InHand(const InHand&) = delete;
    InHand& operator=(const InHand&) = delete;

    // An error that reached the procedure outside of any step. It is told, and the procedure ends whatever the answer,
    // for there is no saying what to repeat.
    void TellStray(const RunTimeError& error) { errors_.Ask(error); }
    // Raises for the caller what the trail passed upward.
    void RaiseIfPassedUpward() const {
      if (passedUpward_) std::rethrow_exception(passedUpward_);
    }

   private:
    friend class ErrorHandling;
    friend class HandlerOff;

    ErrorHandling& errors_;
    std::string_view procedure_;
    InHand* caller_;
    std::int32_t callersNumber_;
    bool handlerOn_ = true;
    std::exception_ptr passedUpward_;
  };

  // To be called while `error` is being handled. True: run the operation again; false: go on behind it. Throws
  // LeaveProcedure; outside of any procedure the error itself goes on.
  bool RunAgain(const RunTimeError& error);

 private:
  friend class HandlerOff;

  Answer Ask(const RunTimeError& error);

  std::string moduleLabel_;
  ErrorTrail trail_;
  InHand* inHand_ = nullptr;
  std::int32_t number_ = run_time::kNone;
};

// Runs `body()` as the procedure of that label ("Function SetOrderList"), which must be a literal. Nothing comes out
// but an error that the trail passes upward; what was done before the procedure was left stays done.
template <class F>
void Guarded(ErrorHandling& errors, std::string_view procedure, F body) {
  ErrorHandling::InHand inHand(errors, procedure);
  try {
    body();
  } catch (const ErrorHandling::LeaveProcedure&) {
  } catch (const RunTimeError& error) {
    inHand.TellStray(error);
  } catch (const std::bad_alloc&) {
    inHand.TellStray({run_time::kOutOfMemory, "Out of memory"});
  } catch (const std::exception& error) {
    inHand.TellStray({run_time::kInternal, std::string("Internal error: ") + error.what()});
  } catch (...) {
    inHand.TellStray({run_time::kInternal, "Internal error: unknown"});
  }
  inHand.RaiseIfPassedUpward();
}

// The same for a procedure with a result: `body(result)` finds `initial` in it, and what it has set when it is left
// counts.
template <class R, class F>
R Guarded(ErrorHandling& errors, std::string_view procedure, R initial, F body) {
  R result = std::move(initial);
  Guarded(errors, procedure, [&] { body(result); });
  return result;
}

// One primitive operation of the procedure in hand; true when it ran. On RunTimeError the error trail is asked: the
// operation runs again, is passed over (false) or the procedure is left. With the handler off the number is kept
// (false) instead.
template <class F>
bool Attempt(ErrorHandling& errors, F&& operation) {
  for (;;) {
    try {
      operation();
      return true;
    } catch (const RunTimeError& error) {
      if (!errors.RunAgain(error)) return false;
    }
  }
}

// Switches the handler off in the procedure in hand, around operations that may fail in a foreseen way. Starts without
// an error number; the number then stays for the procedure to test.
class HandlerOff {
 public:
  explicit HandlerOff(ErrorHandling& errors);
  ~HandlerOff();
  HandlerOff(const HandlerOff&) = delete;
  HandlerOff& operator=(const HandlerOff&) = delete;

 private:
  ErrorHandling::InHand* inHand_;
  bool wasOn_ = false;
};

}  // namespace partnerkit
