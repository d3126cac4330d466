#include <future>

#include "spool/fake_printer.h"
#include "spool/spool_test.h"

namespace partnerkit::spool {
namespace {

constexpr std::size_t kEverything = std::string::npos;

std::string Job(std::size_t size) {
  std::string bytes(size, '\0');
  for (std::size_t i = 0; i < size; ++i) bytes[i] = static_cast<char>(i * 31 >> 3);
  return bytes;
}

void Tell(int connection, std::string_view answer) {
  static_cast<void>(send(connection, answer.data(), answer.size(), MSG_NOSIGNAL));
}

TEST(Socket, DeliversEveryByteToPrintersOfManyManners) {
  struct Case {
    const char* manner;
    int family;
    std::size_t size;
    std::function<void(int connection, std::string& read)> serve;
  };
  const Case table[] = {
      {"reads all, then closes", AF_INET, 3'000'000,
       [](int c, std::string& read) { read = FakePrinter::Read(c, kEverything); }},
      {"by the newer address", AF_INET6, 70,
       [](int c, std::string& read) { read = FakePrinter::Read(c, kEverything); }},
      {"tells its state all the while", AF_INET, 500'000,
       [](int c, std::string& read) {
         for (std::size_t before = 1; before != read.size();) {
           Tell(c, "PAPER OK\r\n");
           before = read.size();
           read += FakePrinter::Read(c, 50'000);
         }
       }},
      {"rests in between", AF_INET, 600'000,
       [](int c, std::string& read) {
         for (int rest = 0; rest < 4; ++rest) {
           std::this_thread::sleep_for(200ms);
           read += FakePrinter::Read(c, 100'000);
         }
         read += FakePrinter::Read(c, kEverything);
       }},
      {"ends its own side at once", AF_INET, 400'000,
       [](int c, std::string& read) {
         shutdown(c, SHUT_WR);
         read = FakePrinter::Read(c, kEverything);
       }},
      {"keeps the connection", AF_INET, 8'000,
       [](int c, std::string& read) {
         read = FakePrinter::Read(c, kEverything);
         std::this_thread::sleep_for(700ms);
       }},
  };
  for (const Case& c : table) {
    SCOPED_TRACE(c.manner);
    std::string read;
    {
      FakePrinter printer([&](int connection) { c.serve(connection, read); }, c.family);
      EXPECT_EQ(MakeSocket(printer.Target(), kShort)->Deliver(Job(c.size), Content::kRaw, "job"),
                "tcp:" + printer.Target());
    }
    EXPECT_TRUE(read == Job(c.size)) << read.size();
  }
}

TEST(Socket, SaysWhatThePrinterTookBeforeItFailed) {
  struct Case {
    const char* manner;
    std::size_t size;
    std::function<void(int connection)> serve;
    const char* cause;
  };
  std::promise<void> over;
  const auto untilOver = [ended = over.get_future().share()] { ended.wait(); };
  const Case table[] = {
      {"stalls", 9'000'000, [&](int c) { FakePrinter::Read(c, 5'000), untilOver(); }, "It took no more for 0.3 s"},
      {"talks and never listens", 9'000'000,
       [&](int c) {
         for (int i = 0; i < 100; ++i) Tell(c, "PAPER OUT\r\n");
         untilOver();
       },
       "It took no more for 0.3 s"},
      {"hangs up", 9'000'000, [](int c) { FakePrinter::Read(c, 60'000); }, "Connection reset by peer"},
  };
  std::vector<std::unique_ptr<FakePrinter>> printers;
  for (const Case& c : table) {
    SCOPED_TRACE(c.manner);
    printers.push_back(std::make_unique<FakePrinter>(c.serve));
    const std::string target = printers.back()->Target();
    const auto start = std::chrono::steady_clock::now();
    const std::string error = ErrorOf([&] { MakeSocket(target, kShort)->Deliver(Job(c.size), Content::kRaw, "job"); });
    EXPECT_LT(std::chrono::steady_clock::now() - start, 3s);
    EXPECT_THAT(error, ::testing::MatchesRegex("482 Printer error: tcp:" + target +
                                               ": It took [1-9][0-9]+ of 9000000 bytes, then failed: .*"));
    EXPECT_THAT(error, HasSubstr(c.cause));
    EXPECT_THAT(error, ::testing::Not(HasSubstr("took 9000000")));
  }
  over.set_value();
}

TEST(Socket, FailsAJobThatThePrinterTookButNeverRead) {
  FakePrinter printer([](int c) {
    FakePrinter::Read(c, 10);
    std::this_thread::sleep_for(100ms);
  });
  EXPECT_EQ(ErrorOf([&] { MakeSocket(printer.Target(), kShort)->Deliver(Job(1'000), Content::kRaw, "job"); }),
            "482 Printer error: tcp:" + printer.Target() +
                ": It took 1000 of 1000 bytes, then failed: Connection reset by peer");
}

TEST(Socket, SaysWhyThereIsNoConnection) {
  // Full: one connection waits to be taken, and the next ones aren't answered.
  FakePrinter full({}, AF_INET, 0);
  MakeSocket(full.Target(), kShort)->Check();
  std::string gone;
  {
    FakePrinter printer;
    gone = printer.Target();
  }
  const auto expect = [](const std::string& target, const std::string& error) {
    EXPECT_THAT(ErrorOf([&] { MakeSocket(target, kShort)->Deliver("job", Content::kRaw, "job"); }),
                ::testing::StartsWith("482 Printer error: tcp:" + error));
  };
  const auto start = std::chrono::steady_clock::now();
  expect(gone, gone + ": No connection: Connection refused");
  expect(full.Target(), full.Target() + ": No connection: Connection timed out");
  expect("ff02::9100:1", "[ff02::9100:1]:9100: No connection: ");
  expect("no host", "no host:9100: No connection: Its name cannot be found: ");
  for (const std::string odd :
       {":9100", "warehouse:", "warehouse:0", "warehouse:65536", "warehouse:91x", "[::1", "[::1]9100"}) {
    expect(odd, odd + ": The target is not a host, or host:port");
  }
  EXPECT_LT(std::chrono::steady_clock::now() - start, 4s);
}

}  // namespace
}  // namespace partnerkit::spool
