//===- platform/FormText.cpp - The text form of component data ------------===//
//
// The text form shows each component as a head, its properties one a line in
// stream order, its children nested two spaces deeper, and `end`:
//
//   object   := head NL property* object* "end" NL
//   head     := ("object" | "inherited" | "inline" | "inherited inline")
//               [Name ":"] Class ["[" Integer "]"]
//   property := DottedName "=" value NL
//   value    := Integer ["L"]            integer; "L" forces the 64-bit tag
//             | Float ["D"]              has "." or "e"; "D" marks a date
//             | String                   "..." with \\ \" \n \r \t \xHH
//             | DottedName | "&" DottedName     an identifier ("&" escapes a keyword)
//             | "True" | "False" | "nil" | "null"
//             | "[" [Name {"," Name}] "]"            a set
//             | "(" value* ")"                       a list
//             | "<" {"item" ["[" Integer "]"] property* "end"} ">"   a collection
//             | "{" HexDigits "}"                    binary data
//
// The binary data decides the text and the text the binary data, one to one:
// a canonical stream (as the writer makes it) converts to text and back to the
// same bytes, and text made from it converts back to the same text.
//
//===----------------------------------------------------------------------===//
#include "platform/Filer.h"

#include <charconv>
#include <cmath>
#include <cstring>

namespace formkit {

namespace {
FK_RESOURCESTRING(SLineError, "Line %d: %s");
FK_RESOURCESTRING(SInvalidIdentifier, "Invalid identifier in stream: '%s'");
FK_RESOURCESTRING(SInvalidStreamFloat, "Invalid floating point value in stream");
FK_RESOURCESTRING(SUnknownValueTag, "Unknown value tag %d");
FK_RESOURCESTRING(SNestingTooDeep, "Stream nesting too deep");
FK_RESOURCESTRING(SInvalidLength, "Length %d runs past the end of the stream");

bool IsIdentStart(char C) { return (C >= 'A' && C <= 'Z') || (C >= 'a' && C <= 'z') || C == '_'; }
bool IsIdentChar(char C) { return IsIdentStart(C) || (C >= '0' && C <= '9'); }

/// A name of the text form: identifiers joined by dots.
bool IsDottedIdent(std::string_view S) {
  if (S.empty()) return false;
  bool Start = true;
  for (char C : S) {
    if (C == '.') {
      if (Start) return false;
      Start = true;
    } else if (Start ? !IsIdentStart(C) : !IsIdentChar(C)) {
      return false;
    } else {
      Start = false;
    }
  }
  return !Start;
}

bool IsValueKeyword(std::string_view S) {
  return SameText(S, "True") || SameText(S, "False") || SameText(S, "nil") || SameText(S, "null");
}

const char HexDigits[] = "0123456789ABCDEF";

//===----------------------------------------------------------------------===//
// Binary to text
//===----------------------------------------------------------------------===//

class TTextWriter {
public:
  explicit TTextWriter(TReader& R) : FR(R) {}

  void Object(int Indent) {
    Nest Guard(FDepth);
    TFilerFlags Flags;
    int Pos;
    FR.ReadFilerFlags(Flags, Pos);
    String Class = FR.ReadStr();
    String Name = FR.ReadStr();
    CheckPlainIdent(Class);
    if (!Name.empty()) CheckPlainIdent(Name);
    Pad(Indent);
    if (Flags.Contains(ffInherited) && Flags.Contains(ffInline)) Out += "inherited inline ";
    else if (Flags.Contains(ffInline)) Out += "inline ";
    else if (Flags.Contains(ffInherited)) Out += "inherited ";
    else Out += "object ";
    if (!Name.empty()) {
      Out += Name;
      Out += ": ";
    }
    Out += Class;
    if (Flags.Contains(ffChildPos)) {
      Out += " [";
      Out += IntToStr(Pos);
      Out += ']';
    }
    Out += '\n';
    Properties(Indent + 1);
    while (!FR.EndOfList()) Object(Indent + 1);
    FR.ReadListEnd();
    Pad(Indent);
    Out += "end\n";
  }

  String Out;

private:
  struct Nest {
    explicit Nest(int& D) : Depth(D) {
      if (++Depth > MaxStreamNesting) {
        --Depth;
        throw EReadError(SNestingTooDeep);
      }
    }
    ~Nest() { --Depth; }
    int& Depth;
  };

  static void CheckIdent(const String& S) {
    if (!IsDottedIdent(S)) throw EReadError(SInvalidIdentifier, S);
  }
  /// Class, component and set element names have no dots.
  static void CheckPlainIdent(const String& S) {
    if (!IsDottedIdent(S) || S.find('.') != String::npos) throw EReadError(SInvalidIdentifier, S);
  }

  void Pad(int Indent) { Out.append(static_cast<std::size_t>(Indent) * 2, ' '); }

  void Properties(int Indent) {
    while (!FR.EndOfList()) {
      String Name = FR.ReadStr();
      CheckIdent(Name);
      Pad(Indent);
      Out += Name;
      Out += " = ";
      Value(Indent);
      Out += '\n';
    }
    FR.ReadListEnd();
  }

  void Float(double V, const char* Suffix) {
    if (!std::isfinite(V)) throw EReadError(SInvalidStreamFloat);
    char Buf[64];
    auto Res = std::to_chars(Buf, Buf + sizeof Buf, V);
    std::string_view S(Buf, static_cast<std::size_t>(Res.ptr - Buf));
    Out += S;
    if (S.find_first_of(".e") == std::string_view::npos) Out += ".0";
    Out += Suffix;
  }

  void Quote(const String& S) {
    Out += '"';
    for (char C : S) {
      auto U = static_cast<unsigned char>(C);
      switch (C) {
      case '\\': Out += "\\\\"; break;
      case '"': Out += "\\\""; break;
      case '\n': Out += "\\n"; break;
      case '\r': Out += "\\r"; break;
      case '\t': Out += "\\t"; break;
      default:
        if (U < 0x20 || U == 0x7F) {
          Out += "\\x";
          Out += HexDigits[U >> 4];
          Out += HexDigits[U & 15];
        } else {
          Out += C;
        }
      }
    }
    Out += '"';
  }

  void Integer() {
    TValueType T = FR.NextValue();
    std::int64_t V = FR.ReadInt64();
    Out += IntToStr(V);
    if (T == vaInt64 && V >= INT32_MIN && V <= INT32_MAX) Out += 'L';
  }

  void Value(int Indent) {
    TValueType T = FR.NextValue();
    switch (T) {
    case vaList: List(Indent); break;
    case vaInt8:
    case vaInt16:
    case vaInt32:
    case vaInt64: Integer(); break;
    case vaDouble: Float(FR.ReadFloat(), ""); break;
    case vaDate: Float(FR.ReadFloat(), "D"); break;
    case vaString:
    case vaLString: Quote(FR.ReadString()); break;
    case vaIdent: Ident(); break;
    case vaFalse: FR.ReadValue(); Out += "False"; break;
    case vaTrue: FR.ReadValue(); Out += "True"; break;
    case vaNil: FR.ReadValue(); Out += "nil"; break;
    case vaVarNull: FR.ReadValue(); Out += "null"; break;
    case vaBinary: Binary(Indent); break;
    case vaSet: Set(); break;
    case vaCollection: Collection(Indent); break;
    default: FR.ReadValue(); throw EReadError(SUnknownValueTag, static_cast<int>(T));
    }
  }

  /// "()" or one value a line between "(" and ")".
  void List(int Indent) {
    Nest Guard(FDepth);
    FR.ReadValue();
    if (FR.EndOfList()) {
      FR.ReadListEnd();
      Out += "()";
      return;
    }
    Out += "(\n";
    while (!FR.EndOfList()) {
      Pad(Indent + 1);
      Value(Indent + 1);
      Out += '\n';
    }
    FR.ReadListEnd();
    Pad(Indent);
    Out += ')';
  }

  /// An identifier; "&" in front of one that reads like a keyword value.
  void Ident() {
    String Id = FR.ReadIdent();
    CheckIdent(Id);
    if (IsValueKeyword(Id)) Out += '&';
    Out += Id;
  }

  /// "{}" or lines of 32 bytes in hexadecimal between "{" and "}".
  void Binary(int Indent) {
    FR.ReadValue();
    std::uint8_t L[4];
    FR.Read(L, 4);
    std::int64_t Len = std::int64_t(L[0]) | std::int64_t(L[1]) << 8 | std::int64_t(L[2]) << 16 | std::int64_t(L[3]) << 24;
    if (Len > FR.Remaining()) throw EReadError(SInvalidLength, static_cast<long long>(Len));
    std::vector<std::uint8_t> Data(static_cast<std::size_t>(Len));
    FR.Read(Data.data(), Len);
    if (Data.empty()) {
      Out += "{}";
      return;
    }
    Out += "{\n";
    for (std::size_t I = 0; I < Data.size(); I += 32) {
      Pad(Indent + 1);
      for (std::size_t J = I; J < Data.size() && J < I + 32; ++J) {
        Out += HexDigits[Data[J] >> 4];
        Out += HexDigits[Data[J] & 15];
      }
      Out += '\n';
    }
    Pad(Indent);
    Out += '}';
  }

  /// The element names between "[" and "]", separated by ", ".
  void Set() {
    FR.ReadValue();
    Out += '[';
    bool First = true;
    for (String E = FR.ReadStr(); !E.empty(); E = FR.ReadStr()) {
      CheckPlainIdent(E);
      if (!First) Out += ", ";
      Out += E;
      First = false;
    }
    Out += ']';
  }

  /// "<>" or the items between "<" and ">", each "item" (with its index when the data
  /// has one), its properties and "end".
  void Collection(int Indent) {
    Nest Guard(FDepth);
    FR.ReadValue();
    if (FR.EndOfList()) {
      FR.ReadListEnd();
      Out += "<>";
      return;
    }
    Out += "<\n";
    while (!FR.EndOfList()) {
      Pad(Indent + 1);
      Out += "item";
      TValueType N = FR.NextValue();
      if (N == vaInt8 || N == vaInt16 || N == vaInt32 || N == vaInt64) {
        Out += " [";
        Integer();
        Out += ']';
      }
      Out += '\n';
      FR.ReadListBegin();
      Properties(Indent + 2);
      Pad(Indent + 1);
      Out += "end\n";
    }
    FR.ReadListEnd();
    Pad(Indent);
    Out += '>';
  }

  TReader& FR;
  int FDepth = 0;
};

//===----------------------------------------------------------------------===//
// Text to binary
//===----------------------------------------------------------------------===//

class TTextParser {
public:
  TTextParser(std::string_view Text, TWriter& W) : FText(Text), FW(W) {}

  /// Parses one object; returns its class name.
  String Object() {
    if (FText.size() >= 3 && std::memcmp(FText.data(), "\xEF\xBB\xBF", 3) == 0) FPos = 3;
    SkipSpace();
    String Keyword = Ident("'object', 'inherited' or 'inline' expected");
    if (!IsObjectKeyword(Keyword)) Fail("'object', 'inherited' or 'inline' expected");
    return ObjectAfter(Keyword);
  }

  /// Steps over blanks and one line break after the object.
  std::size_t End() {
    while (FPos < FText.size() && (FText[FPos] == ' ' || FText[FPos] == '\t')) ++FPos;
    if (FPos < FText.size() && FText[FPos] == '\r') ++FPos;
    if (FPos < FText.size() && FText[FPos] == '\n') ++FPos;
    return FPos;
  }

private:
  static bool IsObjectKeyword(std::string_view S) {
    return SameText(S, "object") || SameText(S, "inherited") || SameText(S, "inline");
  }

  [[noreturn]] void Fail(const String& What) const {
    throw EParserError(Format(LoadResString(SLineError), FLine, What));
  }

  char Peek() const { return FPos < FText.size() ? FText[FPos] : '\0'; }

  void SkipBlanks() {
    while (FPos < FText.size() && (FText[FPos] == ' ' || FText[FPos] == '\t')) ++FPos;
  }

  void SkipSpace() {
    while (FPos < FText.size()) {
      char C = FText[FPos];
      if (C == '\n') ++FLine;
      else if (C != ' ' && C != '\t' && C != '\r') break;
      ++FPos;
    }
  }

  void Expect(char C) {
    SkipSpace();
    if (Peek() != C) Fail(Format("'%s' expected", String(1, C)));
    ++FPos;
  }

  String Ident(const char* What) {
    if (!IsIdentStart(Peek())) Fail(What);
    std::size_t Start = FPos;
    while (FPos < FText.size() && IsIdentChar(FText[FPos])) ++FPos;
    if (FPos - Start > 255) Fail("identifier too long");
    return String(FText.substr(Start, FPos - Start));
  }

  String DottedIdent(const char* What) {
    String S = Ident(What);
    while (Peek() == '.') {
      ++FPos;
      S += '.';
      S += Ident("identifier expected after '.'");
    }
    if (S.size() > 255) Fail("identifier too long");
    return S;
  }

  struct Nest {
    Nest(int& D, const TTextParser& P) : Depth(D) {
      if (++Depth > MaxStreamNesting) {
        --Depth;
        P.Fail("nesting too deep");
      }
    }
    ~Nest() { --Depth; }
    int& Depth;
  };

  String ObjectAfter(const String& Keyword) {
    Nest Guard(FDepth, *this);
    TFilerFlags Flags;
    if (SameText(Keyword, "inline")) Flags.Include(ffInline);
    if (SameText(Keyword, "inherited")) Flags.Include(ffInherited);
    SkipBlanks();
    String First = Ident("name or class expected");
    SkipBlanks();
    if (Flags.Contains(ffInherited) && SameText(First, "inline") && IsIdentStart(Peek())) {
      Flags.Include(ffInline);
      First = Ident("name or class expected");
      SkipBlanks();
    }
    String Name, Class = First;
    if (Peek() == ':') {
      ++FPos;
      SkipBlanks();
      Name = First;
      Class = Ident("class name expected");
      SkipBlanks();
    }
    int Pos = -1;
    if (Peek() == '[') {
      ++FPos;
      SkipBlanks();
      std::int64_t V = Number();
      if (V < 0 || V > INT32_MAX) Fail("invalid child position");
      Pos = static_cast<int>(V);
      Expect(']');
      Flags.Include(ffChildPos);
    }
    FW.WriteFilerFlags(Flags, Pos);
    FW.WriteStr(Class);
    FW.WriteStr(Name);
    bool PropsClosed = false;
    for (;;) {
      SkipSpace();
      if (FPos >= FText.size()) Fail("'end' expected");
      String Id = DottedIdent("property, object or 'end' expected");
      SkipBlanks();
      if (Peek() == '=') {
        if (PropsClosed) Fail("property after a nested object");
        ++FPos;
        FW.WriteStr(Id);
        Value();
        continue;
      }
      if (!PropsClosed) {
        FW.WriteListEnd();
        PropsClosed = true;
      }
      if (SameText(Id, "end")) break;
      if (!IsObjectKeyword(Id)) Fail(Format("'=' expected after '%s'", Id));
      ObjectAfter(Id);
    }
    FW.WriteListEnd();
    return Class;
  }

  /// A decimal integer without suffix.
  std::int64_t Number() {
    std::size_t Start = FPos;
    if (Peek() == '-') ++FPos;
    while (FPos < FText.size() && FText[FPos] >= '0' && FText[FPos] <= '9') ++FPos;
    std::int64_t V = 0;
    auto Res = std::from_chars(FText.data() + Start, FText.data() + FPos, V);
    if (Res.ec != std::errc() || Res.ptr != FText.data() + FPos) Fail("invalid number");
    return V;
  }

  void NumberValue() {
    std::size_t Start = FPos;
    if (Peek() == '-') ++FPos;
    bool IsFloat = false;
    while (FPos < FText.size()) {
      char C = FText[FPos];
      if (C >= '0' && C <= '9') {
        ++FPos;
      } else if (C == '.' || C == 'e' || C == 'E') {
        IsFloat = true;
        ++FPos;
        if ((C == 'e' || C == 'E') && (Peek() == '+' || Peek() == '-')) ++FPos;
      } else {
        break;
      }
    }
    std::string_view Tok = FText.substr(Start, FPos - Start);
    char Suffix = IsIdentStart(Peek()) ? FText[FPos++] : '\0';
    if (IsIdentChar(Peek())) Fail("invalid number");
    if (IsFloat) {
      double V = 0;
      auto Res = std::from_chars(Tok.data(), Tok.data() + Tok.size(), V);
      if (Res.ec != std::errc() || Res.ptr != Tok.data() + Tok.size() || !std::isfinite(V)) Fail("invalid number");
      if (Suffix == 'D') FW.WriteDate(V);
      else if (Suffix == '\0') FW.WriteFloat(V);
      else Fail("invalid number");
      return;
    }
    std::int64_t V = 0;
    auto Res = std::from_chars(Tok.data(), Tok.data() + Tok.size(), V);
    if (Res.ec != std::errc() || Res.ptr != Tok.data() + Tok.size()) Fail("invalid number");
    if (Suffix == 'L') FW.WriteInt64(V);
    else if (Suffix == '\0') FW.WriteInteger(V);
    else Fail("invalid number");
  }

  static int HexValue(char C) {
    if (C >= '0' && C <= '9') return C - '0';
    if (C >= 'A' && C <= 'F') return C - 'A' + 10;
    if (C >= 'a' && C <= 'f') return C - 'a' + 10;
    return -1;
  }

  void StringValue() {
    ++FPos;
    String S;
    for (;;) {
      if (FPos >= FText.size() || FText[FPos] == '\n') Fail("unterminated string");
      char C = FText[FPos++];
      if (C == '"') break;
      if (C != '\\') {
        S += C;
        continue;
      }
      char E = Peek();
      ++FPos;
      switch (E) {
      case '\\': S += '\\'; break;
      case '"': S += '"'; break;
      case 'n': S += '\n'; break;
      case 'r': S += '\r'; break;
      case 't': S += '\t'; break;
      case 'x': {
        int Hi = HexValue(Peek());
        int Lo = FPos + 1 < FText.size() ? HexValue(FText[FPos + 1]) : -1;
        if (Hi < 0 || Lo < 0) Fail("invalid escape in string");
        FPos += 2;
        S += static_cast<char>(Hi * 16 + Lo);
        break;
      }
      default: Fail("invalid escape in string");
      }
    }
    FW.WriteString(S);
  }

  void Value() {
    SkipSpace();
    char C = Peek();
    if (C == '"') {
      StringValue();
    } else if (C == '-' || (C >= '0' && C <= '9')) {
      NumberValue();
    } else if (C == '&') {
      ++FPos;
      FW.WriteIdent(DottedIdent("identifier expected"));
    } else if (IsIdentStart(C)) {
      IdentValue();
    } else if (C == '[') {
      SetValue();
    } else if (C == '(') {
      ListValue();
    } else if (C == '<') {
      CollectionValue();
    } else if (C == '{') {
      BinaryValue();
    } else {
      Fail("value expected");
    }
  }

  /// A keyword value, or an identifier.
  void IdentValue() {
    String Id = DottedIdent("value expected");
    if (SameText(Id, "True")) FW.WriteValue(vaTrue);
    else if (SameText(Id, "False")) FW.WriteValue(vaFalse);
    else if (SameText(Id, "nil")) FW.WriteValue(vaNil);
    else if (SameText(Id, "null")) FW.WriteValue(vaVarNull);
    else FW.WriteIdent(Id);
  }

  void SetValue() {
    ++FPos;
    FW.WriteValue(vaSet);
    SkipSpace();
    if (Peek() != ']') {
      for (;;) {
        SkipSpace();
        FW.WriteStr(Ident("set element expected"));
        SkipSpace();
        if (Peek() == ']') break;
        Expect(',');
      }
    }
    ++FPos;
    FW.WriteStr("");
  }

  void ListValue() {
    Nest Guard(FDepth, *this);
    ++FPos;
    FW.WriteListBegin();
    for (SkipSpace(); Peek() != ')'; SkipSpace()) {
      if (FPos >= FText.size()) Fail("')' expected");
      Value();
    }
    ++FPos;
    FW.WriteListEnd();
  }

  void CollectionValue() {
    Nest Guard(FDepth, *this);
    ++FPos;
    FW.WriteValue(vaCollection);
    for (SkipSpace(); Peek() != '>'; SkipSpace()) {
      if (FPos >= FText.size()) Fail("'>' expected");
      String Item = Ident("'item' expected");
      if (!SameText(Item, "item")) Fail("'item' expected");
      SkipBlanks();
      if (Peek() == '[') {
        ++FPos;
        SkipBlanks();
        NumberValue();
        Expect(']');
      }
      FW.WriteListBegin();
      ItemProperties();
      FW.WriteListEnd();
    }
    ++FPos;
    FW.WriteListEnd();
  }

  /// The properties of a collection item, up to its "end".
  void ItemProperties() {
    for (;;) {
      SkipSpace();
      String Id = DottedIdent("property or 'end' expected");
      SkipBlanks();
      if (Peek() != '=') {
        if (!SameText(Id, "end")) Fail(Format("'=' expected after '%s'", Id));
        return;
      }
      ++FPos;
      FW.WriteStr(Id);
      Value();
    }
  }

  void BinaryValue() {
    ++FPos;
    std::vector<std::uint8_t> Data;
    for (;;) {
      SkipSpace();
      if (Peek() == '}') break;
      int Hi = HexValue(Peek());
      int Lo = FPos + 1 < FText.size() ? HexValue(FText[FPos + 1]) : -1;
      if (Hi < 0 || Lo < 0) Fail("hexadecimal digits expected");
      Data.push_back(static_cast<std::uint8_t>(Hi * 16 + Lo));
      FPos += 2;
    }
    ++FPos;
    FW.WriteValue(vaBinary);
    std::uint32_t N = static_cast<std::uint32_t>(Data.size());
    std::uint8_t L[4] = {static_cast<std::uint8_t>(N), static_cast<std::uint8_t>(N >> 8),
                         static_cast<std::uint8_t>(N >> 16), static_cast<std::uint8_t>(N >> 24)};
    FW.Write(L, 4);
    FW.Write(Data.data(), static_cast<std::int64_t>(Data.size()));
  }

  std::string_view FText;
  TWriter& FW;
  std::size_t FPos = 0;
  int FLine = 1;
  int FDepth = 0;
};

/// Converts one object of text at `Input`'s position into `Output` (signature first);
/// nothing reaches `Output` and `Input` does not move when the text is malformed.
String TextToBinary(TStream* Input, TStream* Output) {
  std::int64_t Start = Input->Position();
  std::int64_t Size = Input->Size() - Start;
  String Text(static_cast<std::size_t>(std::max<std::int64_t>(Size, 0)), '\0');
  Input->ReadBuffer(Text.data(), static_cast<std::int64_t>(Text.size()));
  Input->SetPosition(Start);
  TObjectGuard<TMemoryStream> Bin(new TMemoryStream);
  String Class;
  std::size_t Used;
  {
    TObjectGuard<TWriter> W(new TWriter(Bin.Get(), 4096));
    TTextParser Parser(Text, *W.Get());
    W->WriteSignature();
    Class = Parser.Object();
    Used = Parser.End();
    W->FlushBuffer();
  }
  Output->WriteBuffer(Bin->Memory(), Bin->Size());
  Input->SetPosition(Start + static_cast<std::int64_t>(Used));
  return Class;
}

} // namespace

//===----------------------------------------------------------------------===//
// Conversions
//===----------------------------------------------------------------------===//

void ObjectBinaryToText(TStream* Input, TStream* Output) {
  String Text;
  {
    TObjectGuard<TReader> R(new TReader(Input, 4096));
    R->ReadSignature();
    TTextWriter W(*R.Get());
    W.Object(0);
    Text = std::move(W.Out);
  }
  Output->WriteBuffer(Text.data(), static_cast<std::int64_t>(Text.size()));
}

void ObjectTextToBinary(TStream* Input, TStream* Output) { TextToBinary(Input, Output); }

void ObjectResourceToText(TStream* Input, TStream* Output) {
  Input->ReadResHeader();
  ObjectBinaryToText(Input, Output);
}

void ObjectTextToResource(TStream* Input, TStream* Output, const String& Name) {
  TObjectGuard<TMemoryStream> Bin(new TMemoryStream);
  String Class = TextToBinary(Input, Bin.Get());
  std::int64_t Fixup = 0;
  Output->WriteResourceHeader(Name.empty() ? Class : Name, Fixup);
  Output->WriteBuffer(Bin->Memory(), Bin->Size());
  Output->FixupResourceHeader(Fixup);
}

TStreamOriginalFormat TestStreamFormat(TStream* Stream) {
  std::int64_t Pos = Stream->Position();
  std::uint8_t Buf[64];
  std::int64_t N = Stream->Read(Buf, sizeof Buf);
  Stream->SetPosition(Pos);
  if (N >= 4 && (std::memcmp(Buf, ResourceHeaderMagic, 4) == 0 || std::memcmp(Buf, FilerSignature, 4) == 0))
    return sofBinary;
  std::int64_t I = 0;
  TStreamOriginalFormat Text = sofText;
  if (N >= 3 && Buf[0] == 0xEF && Buf[1] == 0xBB && Buf[2] == 0xBF) {
    I = 3;
    Text = sofUTF8Text;
  }
  while (I < N && (Buf[I] == ' ' || Buf[I] == '\t' || Buf[I] == '\r' || Buf[I] == '\n')) ++I;
  std::int64_t WordStart = I;
  while (I < N && IsIdentChar(static_cast<char>(Buf[I]))) ++I;
  std::string_view Word(reinterpret_cast<const char*>(Buf) + WordStart, static_cast<std::size_t>(I - WordStart));
  if (SameText(Word, "object") || SameText(Word, "inherited") || SameText(Word, "inline")) return Text;
  return sofUnknown;
}

} // namespace formkit
