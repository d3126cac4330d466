#include <cups/cups.h>
#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>

#include "platform/posix_calls.h"
#include "spool/destination.h"

namespace partnerkit::spool {

namespace {

struct Release {
  void operator()(http_t* http) const { httpClose(http); }
  void operator()(ipp_t* message) const { ippDelete(message); }
};
using Connection = std::unique_ptr<http_t, Release>;
using Message = std::unique_ptr<ipp_t, Release>;

constexpr std::int32_t kMostJobs = 999;

class CupsQueue : public Destination {
 public:
  CupsQueue(const std::string& queue, const TimeOuts& timeOuts) : queue_(queue), timeOuts_(timeOuts) {}

  // One request with the whole job: a connection that breaks leaves nothing in the queue.
  std::string Deliver(std::string_view bytes, Content content, const std::string& document) override {
    Message request = Request(IPP_OP_PRINT_JOB);
    ippAddString(request.get(), IPP_TAG_OPERATION, IPP_TAG_NAME, "job-name", nullptr, document.c_str());
    ippAddString(request.get(), IPP_TAG_OPERATION, IPP_TAG_MIMETYPE, "document-format", nullptr,
                 content == Content::kPdf ? CUPS_FORMAT_PDF : CUPS_FORMAT_RAW);
    const Message answer = Ask(std::move(request), InMemory(bytes));
    return Name() + "/" + std::to_string(Number(answer, "job-id", IPP_TAG_INTEGER));
  }

  void Check() override {
    const Message state = State();
    const ipp_attribute_t* accepting = ippFindAttribute(state.get(), "printer-is-accepting-jobs", IPP_TAG_BOOLEAN);
    if (accepting != nullptr && ippGetBoolean(const_cast<ipp_attribute_t*>(accepting), 0) == 0) {
      Fail("The queue takes no jobs" + StateMessage(state));
    }
    if (Number(state, "printer-state", IPP_TAG_ENUM) == IPP_PSTATE_STOPPED) {
      Fail("The queue is stopped" + StateMessage(state));
    }
  }

  std::int32_t JobCount() override { return std::min(Number(State(), "queued-job-count", IPP_TAG_INTEGER), kMostJobs); }

 private:
  std::string Name() const { return "cups:" + queue_; }
  [[noreturn]] void Fail(const std::string& cause) const { platform::Raise(run_time::kPrinter, Name(), cause); }

  Connection Connect() {
    // The library would ask for a password at the terminal.
    cupsSetPasswordCB2([](const char*, http_t*, const char*, const char*, void*) -> const char* { return nullptr; },
                       nullptr);
    Connection made(httpConnect2(cupsServer(), ippPort(), nullptr, AF_UNSPEC, cupsEncryption(), 1,
                                 static_cast<int>(timeOuts_.connect.count()), nullptr));
    if (made == nullptr) Fail("No connection to the print server " + std::string(cupsServer()));
    stalled_ = false;
    httpSetTimeout(
        made.get(), static_cast<double>(timeOuts_.stall.count()) / 1000,
        [](http_t*, void* stalled) {
          *static_cast<bool*>(stalled) = true;
          return 0;
        },
        &stalled_);
    return made;
  }

  Message Request(ipp_op_t operation) const {
    Message request(ippNewRequest(operation));
    std::array<char, HTTP_MAX_URI> uri{};
    httpAssembleURIf(HTTP_URI_CODING_ALL, uri.data(), static_cast<int>(uri.size()), "ipp", nullptr, "localhost",
                     ippPort(), "/printers/%s", queue_.c_str());
    ippAddString(request.get(), IPP_TAG_OPERATION, IPP_TAG_URI, "printer-uri", nullptr, uri.data());
    ippAddString(request.get(), IPP_TAG_OPERATION, IPP_TAG_NAME, "requesting-user-name", nullptr, cupsUser());
    return request;
  }

  Message Ask(Message request, const platform::Descriptor& data = {}) {
    const Connection server = Connect();
    const std::string resource = "/printers/" + queue_;
    Message answer(cupsDoIORequest(server.get(), request.release(), resource.c_str(), data.Number(), -1));
    if (stalled_) Fail("The print server gave no answer for " + InSeconds(timeOuts_.stall));
    if (answer == nullptr || cupsLastError() > IPP_STATUS_OK_CONFLICTING) Fail(cupsLastErrorString());
    return answer;
  }

  Message State() { return Ask(Request(IPP_OP_GET_PRINTER_ATTRIBUTES)); }

  static int Number(const Message& answer, const char* name, ipp_tag_t tag) {
    ipp_attribute_t* attribute = ippFindAttribute(answer.get(), name, tag);
    return attribute == nullptr ? 0 : ippGetInteger(attribute, 0);
  }

  static std::string StateMessage(const Message& state) {
    ipp_attribute_t* attribute = ippFindAttribute(state.get(), "printer-state-message", IPP_TAG_TEXT);
    const char* text = attribute == nullptr ? nullptr : ippGetString(attribute, 0, nullptr);
    return text == nullptr || *text == '\0' ? "" : ": " + std::string(text);
  }

  // The library takes a document from a file only.
  platform::Descriptor InMemory(std::string_view bytes) const {
    platform::Descriptor file(memfd_create("job", MFD_CLOEXEC));
    if (!file.IsOpen() || write(file.Number(), bytes.data(), bytes.size()) != static_cast<ssize_t>(bytes.size()) ||
        lseek(file.Number(), 0, SEEK_SET) != 0) {
      platform::RaiseCause(errno, Name(), run_time::kOutOfMemory);
    }
    return file;
  }

  std::string queue_;
  TimeOuts timeOuts_;
  bool stalled_ = false;
};

}  // namespace

std::unique_ptr<Destination> MakeCupsQueue(const std::string& queue, const TimeOuts& timeOuts) {
  return std::make_unique<CupsQueue>(queue, timeOuts);
}

}  // namespace partnerkit::spool
