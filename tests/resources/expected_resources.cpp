// The bytes the module's resources must hold, built from the published tables.
#include "expected_resources.h"

namespace ResourceTest {
namespace {

ExpectedProperty Property(std::string key, const ByteWriter& data) {
  return {std::move(key), data.Data()};
}

}  // namespace

std::vector<ExpectedProperty> ExpectedProperties() {
  std::vector<ExpectedProperty> list;
  list.push_back(Property("nabo", ByteWriter().U32(1)));
  list.push_back(Property("kind", ByteWriter().Code("9ZFM")));
  list.push_back(Property("name", ByteWriter().PString("Fringe").PadTo(4)));
  list.push_back(Property("catg", ByteWriter().PString("**Hidden**").PadTo(4)));
  list.push_back(Property("vers", ByteWriter().U32(0x00040000)));
  // The entry-point property is 16 bytes: the 12 of the string and terminator,
  // then a further word of zeros.
  list.push_back(Property("8664", ByteWriter().CString("ENTRYPOINT1").Zeros(4)));
  list.push_back(Property("mode", ByteWriter().U8(0x40 | 0x10).U8(0).U8(0).U8(0)));
  list.push_back(Property("flly", ByteWriter().U8(0x80).U8(0).U8(0).U8(0)));
  list.push_back(Property(
      "enbl", ByteWriter().CString("in (RXAPP_ImageMode, GrayScaleMode, RGBMode)").PadTo(4)));
  struct Case {
    std::uint8_t input, output, flags1, flags2;
  };
  const Case cases[7] = {{4, 4, 0x06, 0}, {4, 4, 0x06, 0}, {4, 4, 0x0E, 0}, {1, 1, 0x06, 0},
                         {1, 1, 0x06, 0}, {1, 1, 0x06, 0}, {1, 1, 0x06, 0}};
  ByteWriter fici;
  for (const Case& c : cases) fici.U8(c.input).U8(c.output).U8(c.flags1).U8(c.flags2);
  list.push_back(Property("fici", fici));
  list.push_back(Property(
      "hstm",
      ByteWriter().U32(0).Code("Fltr").Code("fRNG").U16(128).CString("Fringe0001").PadTo(4)));
  return list;
}

Bytes ExpectedPropertyList() {
  const std::vector<ExpectedProperty> properties = ExpectedProperties();
  ByteWriter out;
  out.U16(1).U32(0).U32(static_cast<std::uint32_t>(properties.size()));
  for (const ExpectedProperty& p : properties) {
    out.Code("9ZKT").Code(p.key).U32(0).U32(static_cast<std::uint32_t>(p.data.size()));
    out.Append(p.data);
  }
  return out.Data();
}

Bytes ExpectedTerminology() {
  ByteWriter out;
  out.U16(1).U8(1).U8(0).U16(0).U16(0).U16(1);
  out.PString("$$$/AETE/Common/Rastrix=Rastrix").PString("").Code("RSTX").U16(0).U16(0).U16(1);
  out.PString("$$$/HaldenPlugin/Fringe/DialogName/Name=Fringe").PString("");
  out.Code("Fltr").Code("fRNG");
  out.Code("null").PString("").U16(0);
  out.Code("#ImR").PString("").U16(0xB000);
  out.U16(0);
  out.U16(0).U16(0).U16(0);
  return out.Data();
}

}  // namespace ResourceTest
