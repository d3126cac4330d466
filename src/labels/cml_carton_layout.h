// The carton label of CML, 6.00 by 4.00 inches: address blocks at the top, the barcode of destination and final
// location above the middle, the SSCC's at the foot; a component's label has its number and style there instead.
#pragma once

#include "labels/label_layout.h"
#include "render/label_drawing.h"

namespace partnerkit::labels {

// clang-format off
inline constexpr PacketRecord kCmlCartonFormat[] = {
    {R"(T,1,50,V,578,57,0,1,1,1,O,L,0,0,0|)"},
    {R"(C,578,5,0,1,1,1,O,L,0,0,"FROM:"|)"},
    {R"(T,2,50,V,563,5,0,1,1,1,O,L,0,0,0|)"},
    {R"(T,3,50,V,563,130,0,1,1,1,O,L,0,0,0|)"},
    {R"(C,578,188,0,1,1,1,O,L,0,0,"CARRIER:"|)"},
    {R"(T,4,50,V,578,267,0,1,1,1,O,L,0,0,0|)"},
    {R"(C,565,188,0,1,1,1,O,L,0,0,"CON:"|)"},
    {R"(T,5,50,V,565,227,0,1,2,1,O,L,0,0,0|)"},
    {R"(C,520,5,0,1,2,1,O,L,0,0,"TO:"|)"},
    {R"(T,6,50,V,520,32,0,1,2,1,O,L,0,0,0|)"},
    {R"(T,7,50,V,493,5,0,1,2,1,O,L,0,0,0|)"},
    {R"(T,8,50,V,472,5,0,1,2,1,O,L,0,0,0|)"},
    {R"(T,9,50,V,514,125,0,1,3,1,O,L,0,0,0|)"},
    {R"(C,500,188,0,1,2,1,O,L,0,0,"FOR:"|)"},
    {R"(T,10,50,V,500,221,0,1,2,1,O,L,0,0,0|)"},
    {R"(T,11,50,V,470,188,0,1,1,1,O,L,0,0,0|)"},
    {R"(T,12,50,V,455,188,0,1,1,1,O,L,0,0,0|)"},
    {R"(T,13,50,V,455,342,0,1,1,1,O,L,0,0,0|)"},
    {R"(T,14,50,V,505,323,0,3,3,1,O,L,0,0,0|)"},
    {R"(B,15,27,V,182,40,8,4,152,8,L,0|)"},
    {R"(T,16,50,V,167,50,0,1,1,1,B,L,0,0,0|)"},
    {R"(T,17,50,V,422,5,0,1,2,1,B,L,0,0,0|)"},
    {R"(T,18,25,V,422,160,0,1,2,1,B,R,0,0,0|)"},
    {R"(T,19,50,V,381,36,0,3,2,1,B,L,0,0,0|)"},
    {R"(T,20,50,V,345,22,0,3,2,1,B,L,0,0,0|)"},
    {R"(T,21,50,V,382,100,0,3,1,1,B,L,0,0,0|)"},
    {R"(T,22,50,V,20,100,0,3,2,2,B,L,0,0,0|)", Use::kComponent},
    {R"(T,23,50,V,70,50,0,3,1,1,B,L,0,0,0|)", Use::kComponent},
    {R"(B,24,21,V,25,40,8,4,135,8,L,0|)", Use::kCarton},
    {R"(T,25,50,V,10,50,0,1,1,1,B,L,0,0,0|)", Use::kCarton},
    {R"(T,26,50,V,356,100,0,1,2,1,B,L,0,0,0|)"},
    {R"(T,27,50,V,336,100,0,1,2,1,B,L,0,0,0|)"},
    {R"(T,28,6,V,378,270,0,1,2,2,B,L,0,0,0|)"},
    {R"(T,29,20,V,484,188,0,1,1,1,O,L,0,0,0|)"},
};

// "~201" is FNC1 to the printer and to the barcode builder.
inline constexpr PacketRecord kCmlCartonBatch[] = {
    {R"(1,"`FromName`"|)"},
    {R"(2,"`FromSuburb`"|)"},
    {R"(3,"`FromState`"|)"},
    {R"(4,"`CarrierName`"|)"},
    {R"(5,"`ConNoteNo`"|)"},
    {R"(6,"`ToName`"|)"},
    {R"(7,"`ToAddress`"|)"},
    {R"(8,"`ToSuburb` `ToPostcode`"|)"},
    {R"(9,"`ToLocnNo`"|)"},
    {R"(10,"`ForName`"|)"},
    {R"(11,"`ForAddress`"|)"},
    {R"(12,"`ForSuburb`"|)"},
    {R"(13,"`ForPostcode`"|)"},
    {R"(14,"`ForLocnNo`"|)"},
    {R"(15,"~201421`CountryCode``ToPostcode`~20190`FinalLocnNo`"|)"},
    {R"(16,"(421)`CountryCode``ToPostcode`(90)`FinalLocnNo`"|)"},
    {R"(17,"(00)`SSCCText`"|)"},
    {R"(18,"`POText`"|)"},
    {R"(19,"`ADFlag`"|)"},
    {R"(20,"`ADDate`"|)"},
    {R"(21,"`DeptCapitals`"|)"},
    {R"(22,"`ComponentItem` OF `ComponentCount`"|)", Use::kComponent},
    {R"(23,"`ComponentStyle`"|)", Use::kComponent},
    {R"(24,"~20100`SSCCText`"|)", Use::kCarton},
    {R"(25,"(00)`SSCCText`"|)", Use::kCarton},
    {R"(26,"`User1`"|)"},
    {R"(27,"`User2`"|)"},
    {R"(28,"`PalletText`"|)"},
    {R"(29,"`ForLocnName`"|)"},
};

// Where an ordinary printer's texts go instead, so that they stand as the label printer's do.
inline constexpr render::FieldMove kCmlCartonFieldMoves[] = {
    { .number = 1,  .rows = 20,  .cols = 8 },
    { .number = 2,  .rows = 15             },
    { .number = 3,  .rows = 15             },
    { .number = 4,  .rows = 20,  .cols = 10},
    { .number = 5,  .rows = 15,  .cols = 10},
    { .number = 6,  .rows = -10, .cols = 8 },
    { .number = 9,  .rows = 30,              .font = 3},
    { .number = 10,              .cols = 12},
    { .number = 14, .rows = 48             },
    { .number = 17, .rows = 10             },
    { .number = 18, .rows = 10             },
    { .number = 19, .rows = 45             },
    { .number = 20, .rows = 35             },
    { .number = 21,              .cols = 50},
    { .number = 26,              .cols = 50},
    { .number = 27,              .cols = 50},
};
inline constexpr render::FieldMove kCmlCartonConstantMoves[] = {
    { .number = 2, .rows = 20  },
    { .number = 5, .rows = 20  },
    { .number = 7, .rows = 15  },
    { .number = 9, .rows = -10 },
};
// clang-format on

inline constexpr PacketLayout kCmlCarton{
    .header = R"(,A,R,E,600,400,"CMLDC"|)", .format = kCmlCartonFormat, .batch = kCmlCartonBatch};

}  // namespace partnerkit::labels
