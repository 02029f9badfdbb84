//===- tests/platform/FormTextTest.cpp - The text form --------------------===//
#include "tests/platform/StreamingFixtures.h"

#include <gtest/gtest.h>

using namespace formkit;
using namespace formkit::streamtest;

namespace {

struct TFreeRoot {
  TComponent* P;
  ~TFreeRoot() { P->Destroy(); }
};

const char* const RichText =
    "object Form1: TTestForm\n"
    "  Width = 640\n"
    "  Tones = [toLow, toHigh]\n"
    "  Ratio = 1.25\n"
    "  Scale = 0.5\n"
    "  Caption = \"Main \\\"window\\\"\\n\xC3\xA9t\xC3\xA9\"\n"
    "  Big = 5000000000\n"
    "  Buddy = Form1\n"
    "  Value = 7L\n"
    "  Look.Size = 12\n"
    "  Look.Face = \"Sans\"\n"
    "  Rows = <\n"
    "    item\n"
    "      Caption = \"first\"\n"
    "      Width = 30\n"
    "      Link = Ticker1\n"
    "    end\n"
    "    item\n"
    "      Caption = \"second\"\n"
    "    end\n"
    "  >\n"
    "  Blob = {\n"
    "    0001FEFF\n"
    "  }\n"
    "  object Panel1: TTestControl\n"
    "    Left = 8\n"
    "    Top = -4\n"
    "    Tone = toHigh\n"
    "    Enabled = False\n"
    "    Hint = \"h\xC3\xA9\"\n"
    "    object Button1: TTestControl\n"
    "      Small = -7\n"
    "      Letter = 122\n"
    "      Key = 8364\n"
    "      Caption = \"" /* 300 x */;

String Rich() {
  return String(RichText) + String(300, 'x') +
         "\"\n"
         "      Buddy = Button2\n"
         "      Value = null\n"
         "      OnPoke = Poke\n"
         "    end\n"
         "    object Button2: TTestControl\n"
         "      Value = \"text\"\n"
         "      Peer = Panel1\n"
         "    end\n"
         "  end\n"
         "  object Ticker1: TTicker\n"
         "    Interval = 250\n"
         "    Left = 40\n"
         "    Top = 16\n"
         "  end\n"
         "end\n";
}

String ParseError(const String& Text) {
  try {
    TextToBinary(Text);
  } catch (const EParserError& E) {
    return E.Message();
  }
  return "<no error>";
}

} // namespace

TEST(FormText, RichTreeReadsAsExpected) {
  TFreeRoot Form{BuildRichForm()};
  EXPECT_EQ(Rich(), BinaryToText(WriteBytes(Form.P)));
}

TEST(FormText, ConversionsAreExactInverses) {
  TFreeRoot Form{BuildRichForm()};
  std::vector<std::uint8_t> Bytes = WriteBytes(Form.P);
  String Text = BinaryToText(Bytes);
  EXPECT_EQ(Bytes, TextToBinary(Text)) << "binary to text to binary";
  EXPECT_EQ(Text, BinaryToText(TextToBinary(Text))) << "text to binary to text";
  // Values the writer does not produce from properties convert exactly too.
  const String Odd = "inherited inline Frame1: TFrame [3]\n"
                     "  List = (\n"
                     "    1\n"
                     "    -129\n"
                     "    70000\n"
                     "    2.0\n"
                     "    45000.5D\n"
                     "    &True\n"
                     "    ()\n"
                     "  )\n"
                     "  Empty = <>\n"
                     "  NoData = {}\n"
                     "  Counted = <\n"
                     "    item [2]\n"
                     "    end\n"
                     "  >\n"
                     "  Ctl = \"\\x01\\t\\\\\"\n"
                     "end\n";
  EXPECT_EQ(Odd, BinaryToText(TextToBinary(Odd)));
}

TEST(FormText, TextReadsIntoTheSameTree) {
  TFreeRoot Form{BuildRichForm()};
  TFreeRoot Copy{ReadBytes(TextToBinary(Rich()))};
  EXPECT_EQ(WriteBytes(Form.P), WriteBytes(Copy.P));
}

TEST(FormText, ResourceFormsConvertBothWays) {
  TFreeRoot Form{BuildRichForm()};
  TObjectGuard<TBytesStream> Text(new TBytesStream(Rich().data(), Rich().size()));
  TObjectGuard<TMemoryStream> Res(new TMemoryStream);
  ObjectTextToResource(Text.Get(), Res.Get(), "");
  EXPECT_EQ(Text->Size(), Text->Position());
  Res->SetPosition(0);
  EXPECT_EQ(sofBinary, TestStreamFormat(Res.Get()));
  EXPECT_EQ("TTestForm", Res->ReadResHeader()) << "an empty name takes the root's class";
  Res->SetPosition(0);
  TObjectGuard<TMemoryStream> Back(new TMemoryStream);
  ObjectResourceToText(Res.Get(), Back.Get());
  EXPECT_EQ(Rich(), String(reinterpret_cast<const char*>(Back->Memory()), static_cast<std::size_t>(Back->Size())));
  // And the resource read back is the one the writer makes behind a header.
  TObjectGuard<TMemoryStream> Direct(new TMemoryStream);
  std::int64_t Fixup;
  Direct->WriteResourceHeader("TTestForm", Fixup);
  std::vector<std::uint8_t> Bytes = WriteBytes(Form.P);
  Direct->WriteBuffer(Bytes.data(), static_cast<std::int64_t>(Bytes.size()));
  Direct->FixupResourceHeader(Fixup);
  EXPECT_EQ(BytesOf(Direct.Get()), BytesOf(Res.Get()));
}

TEST(FormText, OneObjectAtATimeLikeTheClipboard) {
  const String Two = "object A: TTicker\nend\nobject B: TTicker\n  Interval = 5\nend\n";
  TObjectGuard<TBytesStream> In(new TBytesStream(Two.data(), Two.size()));
  TObjectGuard<TMemoryStream> Bin(new TMemoryStream);
  ObjectTextToBinary(In.Get(), Bin.Get());
  EXPECT_EQ(22, In->Position());
  ObjectTextToBinary(In.Get(), Bin.Get());
  EXPECT_EQ(In->Size(), In->Position());
  Bin->SetPosition(0);
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  ObjectBinaryToText(Bin.Get(), Out.Get());
  ObjectBinaryToText(Bin.Get(), Out.Get());
  EXPECT_EQ(Bin->Size(), Bin->Position());
  EXPECT_EQ(Two, String(reinterpret_cast<const char*>(Out->Memory()), static_cast<std::size_t>(Out->Size())));
}

TEST(FormText, MalformedTextNamesTheLine) {
  EXPECT_EQ("Line 1: 'object', 'inherited' or 'inline' expected", ParseError("thing X: Y\nend\n"));
  EXPECT_EQ("Line 2: '=' expected after 'Width'", ParseError("object X: Y\n  Width 5\nend\n"));
  EXPECT_EQ("Line 2: value expected", ParseError("object X: Y\n  Width = ?\nend\n"));
  EXPECT_EQ("Line 3: 'end' expected", ParseError("object X: Y\n  Width = 5\n"));
  EXPECT_EQ("Line 2: unterminated string", ParseError("object X: Y\n  S = \"abc\nend\n"));
  EXPECT_EQ("Line 2: invalid number", ParseError("object X: Y\n  N = 99999999999999999999\nend\n"));
  EXPECT_EQ("Line 2: hexadecimal digits expected", ParseError("object X: Y\n  B = {0G}\nend\n"));
  EXPECT_EQ("Line 3: property after a nested object", ParseError("object X: Y\n  object Z: Y\n  end W = 1\nend\n"));
  EXPECT_EQ("Line 1: 'end' expected", ParseError("object X: Y"));
  String Deep;
  for (int I = 0; I < 300; ++I) Deep += "object A: B\n";
  EXPECT_EQ("Line 201: nesting too deep", ParseError(Deep));
}

TEST(FormText, MalformedTextLeavesBothStreamsAlone) {
  const String Bad = "object X: Y\n  Width = \n";
  TObjectGuard<TBytesStream> In(new TBytesStream(Bad.data(), Bad.size()));
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  EXPECT_THROW(ObjectTextToBinary(In.Get(), Out.Get()), EReadError);
  EXPECT_EQ(0, In->Position());
  EXPECT_EQ(0, Out->Size());
}

TEST(FormText, BinaryThatTextCannotShowIsRefused) {
  auto Convert = [](std::vector<std::uint8_t> B) {
    try {
      BinaryToText(B);
    } catch (const EReadError& E) {
      return E.Message();
    }
    return String("<no error>");
  };
  EXPECT_EQ("Invalid identifier in stream: '1x'", Convert({'K', 'D', 'S', '1', 0xF0, 2, '1', 'x', 0, 0, 0}));
  EXPECT_EQ("Unknown value tag 99", Convert({'K', 'D', 'S', '1', 0xF0, 1, 'T', 0, 1, 'P', 99}));
  EXPECT_EQ("Invalid floating point value in stream",
            Convert({'K', 'D', 'S', '1', 0xF0, 1, 'T', 0, 1, 'P', vaDouble, 0, 0, 0, 0, 0, 0, 0xF8, 0x7F, 0, 0}));
}
