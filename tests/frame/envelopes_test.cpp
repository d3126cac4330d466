#include "frame/envelopes.h"

#include <gtest/gtest.h>

#include <string>

#include "frame/file_name.h"

namespace partnerkit {
namespace {

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
    std::string_view className, set, isaVersion, group, end;
  };
  const EDIDoc document = Definition("ACME", "RETAIL");
  Partner partner;
  partner.Translator = "B2BE";
  for (const auto& [className, set, isaVersion, group, end] : {
           Case{"clsMGB850ansix12", "997", "00200", "GS*FA*ACME*EQ850*060308*1018*58*X*002040VICS", "\r\n"},
           Case{"clsMGB852ansix12", "997", "00200", "GS*FA*ACME*EQ850*060308*1018*58*X*002040VICS", "\r\n"},
           Case{"clsTarget850ansix12", "997", "00200", "GS*FA*ACME*RETAIL*060308*1018*58*X*003020", "\r\n"},
           Case{"clsGHPL850ansix12", "997", "00200", "GS*FA*ACME*RETAIL*060308*1018*58*X*003020", "\r\n"},
           Case{"clsKMart850ansix12", "997", "00204", "GS*FA*ACME*RETAIL*060308*1018*58*X*003020", "\r\n"},
           Case{"clsKMart820ansix12", "997", "00204", "GS*FA*ACME*RETAIL*060308*1018*58*X*003010", "\r\n"},
           Case{"clsMGB856ansix12", "856", "00200", "GS*SH*ACME*EQ856*060308*1018*58*X*003020", "~\r\n"},
           Case{"clsTarget856ansix12", "856", "00200", "GS*SH*ACME*RETAIL*060308*1018*58*X*003020", "~\r\n"},
           Case{"clsKMart856ansix12", "856", "00200", "GS*SH*ACME*RETAIL*060308*1018*58*X*003020", "~\r\n"},
           Case{"clsKMart855POAansix12", "855", "00200", "GS*PR*ACME*RETAIL*060308*1018*58*X*003020", "\r\n"},
           Case{"clsMGB855ansix12", "855", "00200", "GS*PR*ACME*RETAIL*060308*1018*58*X*003020", "\r\n"},
       }) {
    const X12Envelope* const row = X12EnvelopeOf(className, set);
    ASSERT_NE(row, nullptr) << className;
    TickingClock clock("2006-03-08T10:15:00");
    EXPECT_EQ(Isa(*row, document, clock, 471).substr(84, 5), isaVersion) << className;
    EXPECT_EQ(Gs(*row, document, clock, 58), group) << className;
    EXPECT_EQ(St(*row, 3), "ST*" + std::string(set) + "*0003") << className;
    EXPECT_EQ(SegmentEnd(*row, partner), end) << className;
  }
  EXPECT_EQ(X12EnvelopeOf("clsMGB850ansix12", "856"), nullptr);
  EXPECT_EQ(X12EnvelopeOf("clsAcme850ansix12", "997"), nullptr);
  EXPECT_EQ(Se(12, 3), "SE*12*0003");
  EXPECT_EQ(Ge(3, 58), "GE*3*58");
  EXPECT_EQ(Iea(471), "IEA*1*000000471");
}

TEST(Envelopes, OfX12HaveAHeaderThatIsReadByPosition) {
  struct Case {
    EDIDoc document;
    std::string_view text;
  };
  const X12Envelope& row = *X12EnvelopeOf("clsKMart850ansix12", "997");
  for (const auto& [document, text] : {
           Case{Definition("ACME", "MGBSTORES", true),
                "ISA*00*          *00*          *ZZ*ACME           *ZZ*MGBSTORES      "
                "*061231*0000*U*00204*000000007*0*T*>"},
           Case{Definition("", ""),
                "ISA*00*          *00*          *ZZ*               *ZZ*               "
                "*061231*0000*U*00204*000000007*0*P*>"},
           Case{Definition("ABCDEFGHIJKLMNOP", "123456789012345678"),
                "ISA*00*          *00*          "
                "*ZZ*ABCDEFGHIJKLMNO*ZZ*123456789012345*061231*0000*U*00204*000000007*0*P*>"},
       }) {
    TickingClock clock("2006-12-31T23:59:30");
    EXPECT_EQ(Isa(row, document, clock, 7), text);
  }
  TickingClock clock("2006-12-31T09:04:30");
  EXPECT_EQ(Gs(row, Definition("ABCDEFGHIJKLMNOP", "123456789012345678"), clock, 1234567),
            "GS*FA*ABCDEFGHIJKL*123456789012*061231*0905*1234567*X*003020");
}

TEST(Envelopes, OfX12EndTheirSegmentsAsThePartnersTranslatorWants) {
  struct Case {
    std::string_view className;
    Text translator;
    std::string_view end;
  };
  for (const auto& [className, translator, end] : {
           Case{"clsMGB856ansix12", "b2bE", "~\r\n"},
           Case{"clsMGB856ansix12", "MINCOM", "\r\n"},
           Case{"clsMGB856ansix12", "LEADTEC", "\r\n"},
           Case{"clsMGB856ansix12", {}, "\r\n"},
           Case{"clsTarget856ansix12", "Mincom", "~"},
           Case{"clsTarget856ansix12", "leadtec", "\n"},
           Case{"clsTarget856ansix12", "B2BE ", "\r\n"},
           Case{"clsTarget856ansix12", {}, "\r\n"},
           Case{"clsKMart856ansix12", "MINCOM", "~"},
       }) {
    Partner partner;
    partner.Translator = translator;
    EXPECT_EQ(SegmentEnd(*X12EnvelopeOf(className, "856"), partner), end) << className << ' ' << Str(translator);
  }
}

TEST(Envelopes, OfEancomFollowTheWritersRow) {
  // Behind the UNB's time.
  constexpr std::string_view kUsual = "+000000471++++1'", kUsualPlain = "+471++++1'", kLong = "+000000471++++1++'";
  constexpr std::string_view kTest = "+000000471++++1++1'", kTestPlain = "+471++++1++1'", kBare = "+471'";
  struct Case {
    std::string_view className, message, unbTail, testTail, trailer;
    bool una;
    // Where lines come: without options, "#%CRLF", "#%crlf", "#%X #%CRLF".
    std::string_view lines;
  };
  constexpr std::string_view kNine = "UNZ+2+000000471'", kPlain = "UNZ+2+471'";
  for (const auto& [className, message, unbTail, testTail, trailer, una, lines] : {
           Case{"clsOfficePOeancom", "CONTRL:2:2:UN:EAN002", kUsual, kTest, kNine, true, "-YY-"},
           Case{"clsMGBPOeancom", "CONTRL:2:2:UN:EAN002", kUsual, kTest, kNine, true, "----"},
           Case{"clsMGBBTPOeancom", "CONTRL:2:2:UN:EAN002", kUsual, kTest, kNine, true, "----"},
           Case{"clsARAPOd01b", "CONTRL:2:2:UN:EAN002", kUsual, kTest, kNine, true, "----"},
           Case{"clsMyerORDERSd01b", "CONTRL:2:2:UN:EAN002", kUsual, kTest, kNine, true, "----"},
           Case{"clsOfficeRCTIeancom", "CONTRL:2:2:UN:EAN002", kUsual, kTest, kNine, true, "----"},
           Case{"clsCMLFLFRCTId01b", "CONTRL:2:2:UN:EAN002", kUsual, kTest, kNine, true, "----"},
           Case{"clsTargetRCTId01b", "CONTRL:2:2:UN:EAN002", kUsual, kTest, kNine, true, "----"},
           Case{"clsARARCTId01b", "CONTRL:2:2:UN:EAN002", kUsual, kTest, kNine, true, "----"},
           Case{"clsCMLFLFREMADVd01b", "CONTRL:2:2:UN:EAN002", kUsual, kTest, kNine, true, "----"},
           Case{"clsGHPLPOeancom", "CONTRL:2:2:UN:EAN002", kUsualPlain, kTestPlain, kPlain, true, "-Y--"},
           Case{"clsCMLFLFORDERSd01b", "CONTRL:D:3:UN:EAN004", kBare, kBare, kPlain, false, "YYYY"},
           Case{"clsTargetBulkORDERSd01b", "CONTRL:D:3:UN:EAN004", kBare, kBare, kPlain, false, "YYYY"},
           Case{"clsOfficeDAeancom", "DESADV:D:96A:UN:EAN005", kUsual, kTest, kNine, false, "-Y--"},
           Case{"clsARADA96a", "DESADV:D:96A:UN:EAN005", kUsual, kTest, kNine, false, "-Y--"},
           Case{"clsMGBDAeancom", "DESADV:D:96A:UN:EAN005", kLong, kTest, kNine, false, "----"},
           Case{"clsMGBBTDAeancom", "DESADV:D:96A:UN:EAN005", kLong, kTest, kNine, false, "-Y-Y"},
           Case{"clsARADAd01b", "DESADV:D:01B:UN:EAN007", kUsual, kTest, kNine, false, "-Y--"},
           Case{"clsCMLFLFDESADVd01b", "DESADV:D:01B:UN:EAN007", kUsualPlain, kTestPlain, kPlain, false, "-Y-Y"},
           Case{"clsTargetBulkDESADVd01b", "DESADV:D:01B:UN:EAN007", kUsualPlain, kTestPlain, kPlain, false, "-Y-Y"},
           Case{"clsMyerDESADVd01b", "DESADV:D:01B:UN:EAN007", kLong, kTest, kNine, false, "----"},
           Case{"clsOfficePOAeancom", "ORDRSP:D:96A:UN:EAN005", kUsual, kTest, kNine, false, "YYYY"},
           Case{"clsARAPOAd01b", "ORDRSP:D:01B:UN:EAN007", kUsual, kTest, kNine, false, "YYYY"},
           Case{"clsMyerORDRSPd01b", "ORDRSP:D:01B:UN:EAN007", kUsual, kTest, kNine, false, "YYYY"},
           Case{"clsCMLFLFORDRSPd01b", "ORDRSP:D:01B:UN:EAN007", kUsualPlain, kTestPlain, kPlain, false, "YYYY"},
           Case{"clsCMLFLFDESADVd01b", "INVOIC:D:01B:UN:EAN010", kUsualPlain, kTestPlain, kPlain, true, "-Y-Y"},
       }) {
    SCOPED_TRACE(std::string(className).append(" ").append(message));
    const EancomEnvelope* const row = EancomEnvelopeOf(className, message.substr(0, 6));
    ASSERT_NE(row, nullptr);
    TickingClock clock("2006-03-08T10:15:00");
    EDIDoc document = Definition("ACMETOYS", "RETAIL");
    EXPECT_EQ(Unb(*row, document, clock, 471), "UNB+UNOA:3+ACMETOYS:ZZ+RETAIL:ZZ+060308:1016" + std::string(unbTail));
    document.TestMode = true;
    EXPECT_EQ(Unb(*row, document, clock, 471), "UNB+UNOA:3+ACMETOYS:ZZ+RETAIL:ZZ+060308:1018" + std::string(testTail));
    EXPECT_EQ(Unh(*row, 58), "UNH+58+" + std::string(message) + "'");
    EXPECT_EQ(Unz(*row, 2, 471), trailer);
    EXPECT_EQ(row->una, una);
    std::string got;
    for (const Text& options : {Text(), Text("#%CRLF"), Text("#%crlf"), Text("#%X #%CRLF")}) {
      document.ReadOptions = options;
      const std::string_view end = SegmentEnd(*row, document);
      got += end == "\r\n" ? 'Y' : end.empty() ? '-' : '?';
    }
    EXPECT_EQ(got, lines);
  }
  EXPECT_EQ(EancomEnvelopeOf("clsOfficePOeancom", "DESADV"), nullptr);
  EXPECT_EQ(EancomEnvelopeOf("clsAcmePOeancom", "CONTRL"), nullptr);
  TickingClock clock("2006-12-31T23:59:30");
  EXPECT_EQ(Unb(*EancomEnvelopeOf("clsMGBDAeancom", "DESADV"), Definition("A", "123456789012345678"), clock, 7),
            "UNB+UNOA:3+A:ZZ+123456789012345678:ZZ+061231:0000+000000007++++1++'");
  EXPECT_EQ(Una(), "UNA:+.? '");
  EXPECT_EQ(Unt(3, 58), "UNT+3+58'");
}

TEST(FileNamePart, KeepsAReferenceInItsFolder) {
  using namespace std::string_view_literals;
  struct Case {
    std::string_view reference, part;
  };
  for (const auto& [reference, part] : {
           Case{"4711", "4711"},
           Case{"", ""},
           Case{"../../etc/passwd", ".._.._etc_passwd"},
           Case{"..\\C:\\X", ".._C:_X"},
           Case{"a\0b\x1F\x7F\r\n\tc"sv, "a_b_____c"},
           Case{"Gr\xC3\xBC\xC3\x9F \xFF", "Gr\xC3\xBC\xC3\x9F \xFF"},
       }) {
    EXPECT_EQ(FileNamePart(reference), part);
  }
  EXPECT_EQ(FileNamePart(std::string(99, '/') + "xy"), std::string(99, '_') + "x");
}

}  // namespace
}  // namespace partnerkit
