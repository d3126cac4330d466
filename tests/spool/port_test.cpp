#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "spool/fake_printer.h"
#include "spool/spool_test.h"

namespace partnerkit::spool {
namespace {

std::string Deliver(const std::string& port, std::string_view bytes) {
  return MakePort(port, kShort)->Deliver(bytes, Content::kRaw, "job");
}

TEST(PortTest, ADeviceGetsEveryByteBehindWhatItHas) {
  TempFolder folder;
  folder.Write("port", "before ");
  EXPECT_EQ(Deliver(folder / "port", "^XA1^XZ"), "port:" + folder / "port");
  Deliver(folder / "port", std::string("\0^XA2^XZ", 8));
  EXPECT_EQ(folder.Read("port"), std::string("before ^XA1^XZ\0^XA2^XZ", 22));
  MakePort(folder / "port", kShort)->Check();
  EXPECT_EQ(ErrorOf([&] { Deliver(folder / "none", "^XA"); }),
            "53 File not found: " + folder / "none" + ": No such file or directory");
  EXPECT_FALSE(folder.Has("none"));
  EXPECT_EQ(ErrorOf([] { Deliver("/dev/full", "^XA"); }), "61 Disk full: /dev/full: No space left on device");
}

TEST(PortTest, ALineThatNobodyReadsIsNotWaitedForLong) {
  TempFolder folder;
  const std::string line = folder / "line";
  ASSERT_EQ(mkfifo(line.c_str(), 0600), 0);
  EXPECT_EQ(ErrorOf([&] { Deliver(line, "^XA"); }), "57 Device I/O error: " + line + ": No such device or address");
  const int reader = open(line.c_str(), O_RDONLY | O_NONBLOCK);
  EXPECT_EQ(ErrorOf([&] { Deliver(line, std::string(1'000'000, 'x')); }),
            "57 Device I/O error: " + line + ": The port has taken nothing for 0.3 s, after 65536 bytes");
  std::string read(65536, ' ');
  EXPECT_EQ(::read(reader, read.data(), read.size()), 65536);
  EXPECT_EQ(Deliver(line, "^XA"), "port:" + line);
  EXPECT_EQ(::read(reader, read.data(), read.size()), 3);
  close(reader);
}

TEST(PortTest, PortsOfOldHaveTheirNamesHere) {
  const auto checked = [](const std::string& port) { return ErrorOf([&] { MakePort(port, kShort)->Check(); }); };
  EXPECT_EQ(checked("LPT9"), "53 File not found: /dev/lp8: No such file or directory");
  EXPECT_EQ(checked("LPT8:"), "53 File not found: /dev/lp7: No such file or directory");
  EXPECT_THAT(checked("COM9"), HasSubstr("/dev/ttyS8: "));
  EXPECT_THAT(checked("LPT10.invalid"), HasSubstr("tcp:LPT10.invalid:9100"));
  std::string read;
  {
    FakePrinter printer([&](int connection) { read = FakePrinter::Read(connection, std::string::npos); });
    EXPECT_EQ(Deliver(printer.Target(), "^XA"), "tcp:" + printer.Target());
  }
  EXPECT_EQ(read, "^XA");
}

}  // namespace
}  // namespace partnerkit::spool
