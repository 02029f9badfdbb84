//===- tests/platform/StreamsTest.cpp - Streams, adapters, headers --------===//
#include "platform/Filer.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstring>
#include <unistd.h>

using namespace formkit;

namespace {
String Message(const std::function<void()>& F) {
  try {
    F();
  } catch (const Exception& E) {
    return String(E.ClassName()) + ": " + E.Message();
  }
  return "<no error>";
}
} // namespace

TEST(MemoryStream, ReadsWritesSeeksAndGrows) {
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  S->WriteBuffer("hello", 5);
  EXPECT_EQ(5, S->Size());
  S->SetPosition(10);
  S->WriteBuffer("!", 1);
  EXPECT_EQ(11, S->Size());
  EXPECT_EQ(0, S->Memory()[7]) << "a gap is filled with zeros";
  char Buf[5];
  S->SetPosition(0);
  S->ReadBuffer(Buf, 5);
  EXPECT_EQ(0, std::memcmp(Buf, "hello", 5));
  EXPECT_EQ(9, S->Seek(-2, soEnd));
  EXPECT_EQ(2, S->Read(Buf, 5)) << "a read stops at the end";
  EXPECT_EQ(0, S->Read(Buf, 5));
  EXPECT_EQ("EReadError: Stream read error", Message([&] { S->ReadBuffer(Buf, 1); }));
  S->SetSize(3);
  EXPECT_EQ(3, S->Position());
  S->Clear();
  EXPECT_EQ(0, S->Size());
}

TEST(MemoryStream, CopyFromWholeOrCounted) {
  TObjectGuard<TBytesStream> Src(new TBytesStream(std::vector<std::uint8_t>{1, 2, 3, 4, 5, 6, 7}));
  Src->SetPosition(5);
  TObjectGuard<TMemoryStream> Dst(new TMemoryStream);
  EXPECT_EQ(7, Dst->CopyFrom(Src.Get(), 0, 2)) << "a count of 0 copies all from position 0";
  EXPECT_EQ(7, Dst->Size());
  Src->SetPosition(1);
  EXPECT_EQ(3, Dst->CopyFrom(Src.Get(), 3, 1048576));
  EXPECT_EQ((std::vector<std::uint8_t>{1, 2, 3, 4, 5, 6, 7, 2, 3, 4}),
            std::vector<std::uint8_t>(Dst->Memory(), Dst->Memory() + Dst->Size()));
  EXPECT_EQ("EReadError: Stream read error", Message([&] { Dst->CopyFrom(Src.Get(), 10); }));
}

TEST(ResourceHeader, CarriesTheNameAndTheDataSize) {
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  std::int64_t Fixup = -1;
  S->WriteResourceHeader("TMainForm", Fixup);
  std::int64_t DataStart = S->Position();
  S->WriteBuffer("KDS1abc", 7);
  S->FixupResourceHeader(Fixup);
  EXPECT_EQ(DataStart + 7, S->Position()) << "the fixup keeps the position";
  EXPECT_EQ(7, S->Memory()[Fixup]);
  S->SetPosition(0);
  EXPECT_EQ("TMainForm", S->ReadResHeader());
  EXPECT_EQ(DataStart, S->Position());

  TObjectGuard<TMemoryStream> Empty(new TMemoryStream);
  Empty->WriteResourceHeader("", Fixup);
  Empty->FixupResourceHeader(Fixup);
  Empty->SetPosition(0);
  EXPECT_EQ("", Empty->ReadResHeader());

  TObjectGuard<TBytesStream> Bad(new TBytesStream("KDS1", 4));
  EXPECT_EQ("EReadError: Invalid stream format", Message([&] { Bad->ReadResHeader(); }));
  TObjectGuard<TBytesStream> Short(new TBytesStream("\xFFRH\x01\x05TM", 7));
  EXPECT_EQ("EReadError: Invalid stream format", Message([&] { Short->ReadResHeader(); }));
  EXPECT_EQ("EWriteError: Resource name too long: " + String(256, 'N'),
            Message([&] { S->WriteResourceHeader(String(256, 'N'), Fixup); }));
}

TEST(FileStream, WritesAndReadsAFile) {
  char Name[] = "/tmp/fkstreamXXXXXX";
  int Fd = mkstemp(Name);
  ASSERT_GE(Fd, 0);
  close(Fd);
  {
    TObjectGuard<TFileStream> F(new TFileStream(Name, fmCreate));
    F->WriteBuffer("0123456789", 10);
    F->SetSize(4);
    EXPECT_EQ(4, F->Size());
  }
  TObjectGuard<TMemoryStream> M(new TMemoryStream);
  M->LoadFromFile(Name);
  EXPECT_EQ(4, M->Size());
  EXPECT_EQ(0, std::memcmp(M->Memory(), "0123", 4));
  std::remove(Name);
  EXPECT_EQ(String("EFOpenError: Cannot open file \"") + Name + "\". No such file or directory",
            Message([&] { TObjectGuard<TFileStream> F(new TFileStream(Name, fmOpenRead)); }));
}

TEST(StreamAdapters, BothDirectionsForwardAndOwn) {
  auto* Mem = new TMemoryStream;
  {
    IPtr<IStream> Host = New<TStreamAdapter>(Mem, soReference);
    TObjectGuard<TOleStream> Back(new TOleStream(Host));
    Back->WriteBuffer("abcdef", 6);
    EXPECT_EQ(6, Mem->Size());
    Back->SetSize(4);
    EXPECT_EQ(4, Mem->Size());
    EXPECT_EQ(1, Back->Seek(1, soBeginning));
    char C;
    Back->ReadBuffer(&C, 1);
    EXPECT_EQ('b', C);
    EXPECT_EQ(4, Back->Size());
  }
  EXPECT_EQ(4, Mem->Size()) << "a referencing adapter leaves the stream alive";
  // An owning adapter frees the stream with itself (the leak checker watches).
  IPtr<IStream> Owned = New<TStreamAdapter>(Mem, soOwned);
  EXPECT_EQ(4, Owned->Seek(0, 2));
  Owned = nullptr;
}

TEST(StreamFormat, TellsBinaryTextAndUnknownWithoutMoving) {
  auto Format = [](const String& Data) {
    TObjectGuard<TBytesStream> S(new TBytesStream(Data.data(), Data.size()));
    S->SetPosition(0);
    TStreamOriginalFormat F = TestStreamFormat(S.Get());
    EXPECT_EQ(0, S->Position());
    return F;
  };
  EXPECT_EQ(sofBinary, Format("KDS1\xF0"));
  EXPECT_EQ(sofBinary, Format(String("\xFFRH\x01\x00", 5)));
  EXPECT_EQ(sofText, Format("object A: B\nend\n"));
  EXPECT_EQ(sofText, Format(" \r\n\tINLINE A: B\nend\n"));
  EXPECT_EQ(sofText, Format("inherited A: B\nend\n"));
  EXPECT_EQ(sofUTF8Text, Format("\xEF\xBB\xBFobject A: B\nend\n"));
  EXPECT_EQ(sofUnknown, Format("objection"));
  EXPECT_EQ(sofUnknown, Format(""));
  EXPECT_EQ(sofUnknown, Format("KDS"));
}
