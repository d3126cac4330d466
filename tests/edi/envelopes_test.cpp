#include "edi/envelopes.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "files/file_name.h"

namespace partnerkit {
namespace {

// Of classes that write the same envelope.
using Classes = std::vector<std::string_view>;

// A minute later at each reading.
class TickingClock : public Clock {
 public:
  explicit TickingClock(std::string_view first) : next_(DateTime::FromIso(first).value()) {}
  DateTime Now() override {
    const DateTime now = next_;
    next_ = DateTime::FromSeconds(now.Seconds() + 60);
    return now;
  }

 private:
  DateTime next_;
};

EDIDoc Definition(std::string own, std::string partner, bool testMode = false) {
  EDIDoc document;
  document.CompanyEDIAddr = std::move(own);
  document.PartnerEDIAddr = std::move(partner);
  document.TestMode = testMode;
  return document;
}

TEST(Envelopes, OfX12FollowTheWritersRow) {
  struct Case {
    Classes classes;
    std::string_view set, isaVersion, group;
  };
  for (const Case& c : {
           Case{{"clsMGB850ansix12", "clsMGB852ansix12"}, "997", "00200", "FA*ACME*EQ850*060308*1017*58*X*002040VICS"},
           Case{{"clsTarget850ansix12", "clsGHPL850ansix12"}, "997", "00200", "FA*ACME*ANY*060308*1017*58*X*003020"},
           Case{{"clsKMart850ansix12"}, "997", "00204", "FA*ACME*ANY*060308*1017*58*X*003020"},
           Case{{"clsKMart820ansix12"}, "997", "00204", "FA*ACME*ANY*060308*1017*58*X*003010"},
           Case{{"clsMGB856ansix12"}, "856", "00200", "SH*ACME*EQ856*060308*1017*58*X*003020"},
           Case{{"clsTarget856ansix12", "clsKMart856ansix12"}, "856", "00200", "SH*ACME*ANY*060308*1017*58*X*003020"},
           Case{{"clsKMart855POAansix12", "clsMGB855ansix12"}, "855", "00200", "PR*ACME*ANY*060308*1017*58*X*003020"},
       }) {
    for (const std::string_view name : c.classes) {
      const X12Envelope* const row = X12EnvelopeOf(name, c.set);
      ASSERT_NE(row, nullptr) << name;
      TickingClock clock("2006-03-08T10:16:00");
      EXPECT_EQ(row->isaVersion, c.isaVersion) << name;
      EXPECT_EQ(Gs(*row, Definition("ACME", "ANY"), clock, 58), "GS*" + std::string(c.group)) << name;
    }
  }
}

TEST(Envelopes, OfX12HaveAHeaderThatIsReadByPosition) {
  const X12Envelope& row = *X12EnvelopeOf("clsKMart850ansix12", "997");
  EXPECT_EQ(X12EnvelopeOf("clsKMart850ansix12", "856"), nullptr);
  EXPECT_EQ(X12EnvelopeOf("clsAcme850ansix12", "997"), nullptr);
  const EDIDoc longer = Definition("ABCDEFGHIJKLMNOP", "123456789012345678");
  TickingClock clock("2006-12-31T23:59:30");
  EXPECT_EQ(Isa(row, Definition("ACME", "", true), clock, 7),
            "ISA*00*          *00*          *ZZ*ACME           *ZZ*               "
            "*061231*0000*U*00204*000000007*0*T*>");
  EXPECT_EQ(Isa(row, longer, clock, 7),
            "ISA*00*          *00*          "
            "*ZZ*ABCDEFGHIJKLMNO*ZZ*123456789012345*070101*0002*U*00204*000000007*0*P*>");
  EXPECT_EQ(Gs(row, longer, clock, 1234567), "GS*FA*ABCDEFGHIJKL*123456789012*070101*0004*1234567*X*003020");
  EXPECT_EQ(St(*X12EnvelopeOf("clsMGB855ansix12", "855"), 3), "ST*855*0003");
}

TEST(Envelopes, OfX12EndTheirSegmentsAsThePartnersTranslatorWants) {
  struct Case {
    std::string_view className, set;
    std::vector<std::string_view> ends;  // for the translators below
  };
  for (const auto& [className, set, ends] : {
           Case{"clsMGB850ansix12", "997", {"\r\n", "\r\n", "\r\n", "\r\n", "\r\n"}},
           Case{"clsMGB856ansix12", "856", {"~\r\n", "\r\n", "\r\n", "\r\n", "\r\n"}},
           Case{"clsTarget856ansix12", "856", {"~\r\n", "~", "\n", "\r\n", "\r\n"}},
       }) {
    std::vector<std::string_view> got;
    for (const Text& translator : {Text("b2bE"), Text("Mincom"), Text("leadtec"), Text("B2BE "), Text()}) {
      Partner partner;
      partner.Translator = translator;
      got.push_back(SegmentEnd(*X12EnvelopeOf(className, set), partner));
    }
    EXPECT_EQ(got, ends) << className;
  }
}

TEST(Envelopes, OfEancomFollowTheWritersRow) {
  struct Case {
    Classes classes;
    std::string message;
    // The UNB's number and what follows it, in production and in test.
    std::string tail, testTail;
    // Where lines come: without options, "#%CRLF", "#%crlf", "#%X #%CRLF".
    std::string_view lines;
    bool una;
  };
  const std::string nine = "000000471++++1", front = "UNB+UNOA:3+A:ZZ+123456789012345678:ZZ+";
  const std::string tail = nine + "'", longer = nine + "++'", test = nine + "++1'";
  const std::string plain = "471++++1'", plainTest = "471++++1++1'", bare = "471'";
  const Classes answering = {"clsMGBPOeancom",    "clsMGBBTPOeancom",    "clsARAPOd01b",
                             "clsMyerORDERSd01b", "clsOfficeRCTIeancom", "clsCMLFLFRCTId01b",
                             "clsTargetRCTId01b", "clsARARCTId01b",      "clsCMLFLFREMADVd01b"};
  for (const Case& c : {
           Case{answering, "CONTRL:2:2:UN:EAN002", tail, test, "----", true},
           Case{{"clsOfficePOeancom"}, "CONTRL:2:2:UN:EAN002", tail, test, "-YY-", true},
           Case{{"clsGHPLPOeancom"}, "CONTRL:2:2:UN:EAN002", plain, plainTest, "-Y--", true},
           Case{{"clsCMLFLFORDERSd01b", "clsTargetBulkORDERSd01b"}, "CONTRL:D:3:UN:EAN004", bare, bare, "YYYY", false},
           Case{{"clsOfficeDAeancom", "clsARADA96a"}, "DESADV:D:96A:UN:EAN005", tail, test, "-Y--", false},
           Case{{"clsMGBDAeancom"}, "DESADV:D:96A:UN:EAN005", longer, test, "----", false},
           Case{{"clsMGBBTDAeancom"}, "DESADV:D:96A:UN:EAN005", longer, test, "-Y-Y", false},
           Case{{"clsARADAd01b"}, "DESADV:D:01B:UN:EAN007", tail, test, "-Y--", false},
           Case{{"clsCMLFLFDESADVd01b", "clsTargetBulkDESADVd01b"},
                "DESADV:D:01B:UN:EAN007",
                plain,
                plainTest,
                "-Y-Y",
                false},
           Case{{"clsMyerDESADVd01b"}, "DESADV:D:01B:UN:EAN007", longer, test, "----", false},
           Case{{"clsOfficePOAeancom"}, "ORDRSP:D:96A:UN:EAN005", tail, test, "YYYY", false},
           Case{{"clsARAPOAd01b", "clsMyerORDRSPd01b"}, "ORDRSP:D:01B:UN:EAN007", tail, test, "YYYY", false},
           Case{{"clsCMLFLFORDRSPd01b"}, "ORDRSP:D:01B:UN:EAN007", plain, plainTest, "YYYY", false},
           Case{{"clsCMLFLFDESADVd01b"}, "INVOIC:D:01B:UN:EAN010", plain, plainTest, "-Y-Y", true},
       }) {
    for (const std::string_view name : c.classes) {
      SCOPED_TRACE(std::string(name) + " " + c.message);
      const EancomEnvelope* const row = EancomEnvelopeOf(name, c.message.substr(0, 6));
      ASSERT_NE(row, nullptr);
      TickingClock clock("2006-12-31T23:59:30");
      // No address is cut.
      EDIDoc document = Definition("A", "123456789012345678");
      EXPECT_EQ(Unb(*row, document, clock, 471), front + "061231:0000+" + c.tail);
      document.TestMode = true;
      EXPECT_EQ(Unb(*row, document, clock, 471), front + "070101:0002+" + c.testTail);
      EXPECT_EQ(Unh(*row, 58), "UNH+58+" + c.message + "'");
      EXPECT_EQ(Unz(*row, 2, 471), c.tail.starts_with("0") ? "UNZ+2+000000471'" : "UNZ+2+471'");
      EXPECT_EQ(row->una, c.una);
      std::string got;
      for (const Text& options : {Text(), Text("#%CRLF"), Text("#%crlf"), Text("#%X #%CRLF")}) {
        document.ReadOptions = options;
        const std::string_view end = SegmentEnd(*row, document);
        got += end == "\r\n" ? 'Y' : end.empty() ? '-' : '?';
      }
      EXPECT_EQ(got, c.lines);
    }
  }
  EXPECT_EQ(EancomEnvelopeOf("clsOfficePOeancom", "DESADV"), nullptr);
  EXPECT_EQ(EancomEnvelopeOf("clsAcmePOeancom", "CONTRL"), nullptr);
  EXPECT_EQ(Unt(3, 58), "UNT+3+58'");
}

TEST(FileNamePart, KeepsAReferenceInItsFolder) {
  using namespace std::string_view_literals;
  EXPECT_EQ(FileNamePart("..\\C:/X"), ".._C:_X");
  EXPECT_EQ(FileNamePart("a\0b\x1F\x7F\r\n\tc \xFF"sv), "a_b_____c \xFF");
  EXPECT_EQ(FileNamePart(std::string(99, '/') + "xy"), std::string(99, '_') + "x");
}

}  // namespace
}  // namespace partnerkit
