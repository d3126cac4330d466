#include "frame/procedure.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <vector>

#include "partnerkit/platform.h"
#include "support/error_of.h"

namespace partnerkit {
namespace {

class ProcedureTest : public ::testing::Test {
 protected:
  // The user answers the dialogs in this order; behind the last, Abort.
  ErrorHandling Answering(const std::vector<Button>& buttons, bool passUpward = false) {
    Ports ports = platform::DefaultPorts();
    ports.errorSettings.passUpward = passUpward;
    ports.errorOutlets.libraryPath = "/pk.so";
    ports.errorOutlets.dialog = [this, buttons](const ErrorReport& report, const std::string&) {
      asked_.push_back(std::to_string(report.number) + " " + report.description + " in " + report.procedure);
      return asked_.size() <= buttons.size() ? buttons[asked_.size() - 1] : Button::kAbort;
    };
    return ErrorHandling("cMGB850csv", ports);
  }

  // An operation that fails `failures` times, then works.
  auto Failing(int failures) {
    return [this, failures] {
      if (++runs_ <= failures) throw RunTimeError(53, "File not found");
    };
  }
  static auto Raising(std::int32_t number) {
    return [number] { throw RunTimeError(number, "Trouble"); };
  }

  std::vector<std::string> asked_;
  int runs_ = 0;
};

// Again until it works, then over an operation, then out: with the result as it stands, and what is held let go.
TEST_F(ProcedureTest, DoesAsTheUserAnswers) {
  ErrorHandling errors = Answering({Button::kRetry, Button::kRetry, Button::kIgnore, Button::kAbort});
  const auto held = std::make_shared<int>();
  EXPECT_EQ(Guarded(errors, "Function Load", 1,
                    [&](int& result) {
                      std::shared_ptr<int> alsoHeld;
                      alsoHeld = held;
                      EXPECT_TRUE(Attempt(errors, Failing(2)));
                      EXPECT_EQ(runs_, 3);
                      {
                        const HandlerOff off(errors);
                        Attempt(errors, Raising(70));
                      }
                      EXPECT_EQ(errors.Number(), 70);
                      EXPECT_FALSE(Attempt(errors, Raising(61)));
                      EXPECT_EQ(errors.Number(), 0) << "the trail has dealt with it";
                      result = 12;
                      try {
                        Attempt(errors, Raising(57));
                      } catch (const std::exception&) {
                        result = 13;  // a step's own handling must not stop the leaving
                      }
                      result = 14;
                    }),
            12);
  EXPECT_EQ(held.use_count(), 1);
  EXPECT_EQ(asked_,
            (std::vector<std::string>{"53 File not found in Function Load", "53 File not found in Function Load",
                                      "61 Trouble in Function Load", "57 Trouble in Function Load"}));
}

TEST_F(ProcedureTest, LeavesOnlyTheProcedureThatFailed) {
  ErrorHandling errors = Answering({Button::kAbort, Button::kAbort});
  const auto inner = [&] { Guarded(errors, "Sub WriteLog", [&] { Attempt(errors, Failing(1)); }); };
  EXPECT_TRUE(Guarded(errors, "Function Load", false, [&](bool& result) {
    EXPECT_TRUE(Attempt(errors, inner));
    result = true;
    Attempt(errors, Raising(6));
    result = false;
  }));
  EXPECT_EQ(asked_, (std::vector<std::string>{"53 File not found in Sub WriteLog", "6 Trouble in Function Load"}));
}

TEST_F(ProcedureTest, KeepsTheNumberWhereTheHandlerIsOff) {
  ErrorHandling errors = Answering({});
  Guarded(errors, "Function Load", [&] {
    EXPECT_EQ(errors.Number(), 0);
    {
      const HandlerOff off(errors);
      EXPECT_FALSE(Attempt(errors, Failing(1)));
      EXPECT_TRUE(Attempt(errors, [] {}));
      EXPECT_EQ(errors.Number(), 53);
      {
        const HandlerOff again(errors);
        EXPECT_EQ(errors.Number(), 0);
        Attempt(errors, Raising(76));
      }
      EXPECT_FALSE(Attempt(errors, Raising(61)));
      Guarded(errors, "Sub WriteLog", [&] {
        EXPECT_EQ(errors.Number(), 0);
        Attempt(errors, Raising(57));
        ADD_FAILURE() << "the caller's handler is off, not this one's";
      });
    }
    EXPECT_TRUE(Attempt(errors, [] {}));
    EXPECT_EQ(errors.Number(), 61);
    Attempt(errors, Raising(75));
    ADD_FAILURE() << "the handler should be on again";
  });
  EXPECT_EQ(errors.Number(), 0);
  EXPECT_EQ(asked_, (std::vector<std::string>{"57 Trouble in Sub WriteLog", "75 Trouble in Function Load"}));
}

TEST_F(ProcedureTest, TellsWhateverReachesTheProcedureOutsideOfAStepAndLeaves) {
  const auto thrown = [this](auto error) {
    asked_.clear();
    ErrorHandling errors = Answering({Button::kRetry});
    EXPECT_EQ(Guarded(errors, "Function Load", 5,
                      [&](int& result) {
                        const HandlerOff off(errors);
                        result = 6;
                        throw error;
                      }),
              6);
    return asked_;
  };
  using Asked = std::vector<std::string>;
  EXPECT_EQ(thrown(RunTimeError(457, "Key in use")), Asked{"457 Key in use in Function Load"});
  EXPECT_EQ(thrown(std::bad_alloc()), Asked{"7 Out of memory in Function Load"});
  EXPECT_EQ(thrown(std::out_of_range("at")), Asked{"51 Internal error: at in Function Load"});
  EXPECT_EQ(thrown(42), Asked{"51 Internal error: unknown in Function Load"});
}

TEST_F(ProcedureTest, PassesAnErrorUpThroughEachProcedureToTheHost) {
  ErrorHandling errors = Answering({}, true);
  const auto inner = [&] { Guarded(errors, "Sub WriteLog", [&] { Attempt(errors, Failing(9)); }); };
  EXPECT_EQ(testing::ErrorOf([&] {
              Guarded(errors, "Function Load", [&] {
                Attempt(errors, inner);
                ADD_FAILURE() << "went on";
              });
            }),
            "53 File not found in cMGB850csv, Sub WriteLog at line number 0\r\n(handled remotely by NuMega FailSafe)"
            " in cMGB850csv, Function Load at line number 0\r\n(handled remotely by NuMega FailSafe)");
  EXPECT_EQ(runs_, 1);
  EXPECT_TRUE(asked_.empty());

  // A caller whose handler is off tests the number instead, and the object works on as before.
  EXPECT_EQ(Guarded(errors, "Function Term", 0,
                    [&](int& result) {
                      const HandlerOff off(errors);
                      EXPECT_FALSE(Attempt(errors, inner));
                      result = errors.Number();
                    }),
            53);
}

TEST_F(ProcedureTest, LetsAnErrorOutsideOfAnyProcedureGoOn) {
  ErrorHandling errors = Answering({});
  EXPECT_THROW(Attempt(errors, Failing(1)), RunTimeError);
  EXPECT_TRUE(asked_.empty());
}

}  // namespace
}  // namespace partnerkit
