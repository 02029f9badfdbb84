//===- fuzz/support/StreamChecks.cpp - What every form stream must satisfy -===//
#include "fuzz/support/StreamChecks.h"

#include "platform/ScopeGuard.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <unordered_set>

namespace formkit::fuzzing {

namespace {

/// The class name in the head of component data (signature onward).
String RootClassOf(const TBytes& Data) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Data));
  TObjectGuard<TReader> R(new TReader(In.Get(), 64));
  R->ReadSignature();
  TFilerFlags Flags;
  int Pos;
  R->ReadFilerFlags(Flags, Pos);
  return R->ReadStr();
}

/// `Data` behind a resource header naming `Name`.
TBytes WithResourceHeader(const std::uint8_t* Data, std::size_t Size, const String& Name) {
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  std::int64_t Fixup = 0;
  Out->WriteResourceHeader(Name, Fixup);
  Out->WriteBuffer(Data, static_cast<std::int64_t>(Size));
  Out->FixupResourceHeader(Fixup);
  return BytesOf(Out.Get());
}

/// The components `Root` owns now.
std::unordered_set<TComponent*> OwnedBy(TComponent* Root) {
  std::unordered_set<TComponent*> Owned;
  if (Root)
    for (int I = 0; I < Root->ComponentCount(); ++I) Owned.insert(Root->Components(I));
  return Owned;
}

/// A read that failed frees what it created, never what it found: everything `Root`
/// owned before is still there. Only addresses are compared, so nothing freed is touched.
void RequireStillOwned(TComponent* Root, const std::unordered_set<TComponent*>& Before) {
  std::unordered_set<TComponent*> Now = OwnedBy(Root);
  for (TComponent* C : Before)
    Require(Now.count(C) != 0, "a failed read freed or took away a component it did not create");
}

String TextOf(TMemoryStream* S) {
  return String(reinterpret_cast<const char*>(S->Memory()), static_cast<std::size_t>(S->Size()));
}

/// Text that the library made converts back, and back again to the same text.
TBytes RequireTextConverts(const String& Text) {
  TBytes Data;
  try {
    Data = TextToData(Text);
  } catch (const EReadError& E) {
    Finding("text made from component data does not convert back", E.Message());
  }
  Require(DataToText(Data) == Text, "text converted to data and back is not the same text");
  return Data;
}

/// Binary data to text: what converts gives text that converts back exactly, and the
/// same data behind a resource header gives the same text.
void CheckBinaryToText(const std::uint8_t* Data, std::size_t Size) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Data, Size));
  TObjectGuard<TMemoryStream> Text(new TMemoryStream);
  bool Converted = true;
  try {
    ObjectBinaryToText(In.Get(), Text.Get());
  } catch (const EReadError&) {
    Converted = false;
    Require(Text->Size() == 0, "a failed conversion to text wrote part of the text");
  }

  TBytes Resource = WithResourceHeader(Data, Size, "TFuzzInput");
  String FromResource;
  bool ResourceConverted = true;
  try {
    FromResource = ResourceToText(Resource);
  } catch (const EReadError&) {
    ResourceConverted = false;
  }
  Require(Converted == ResourceConverted, "a resource header changes whether data converts to text");
  if (!Converted) return;
  String Text1 = TextOf(Text.Get());
  Require(FromResource == Text1, "a resource header changes the text of the data behind it");
  TBytes Canonical = RequireTextConverts(Text1);
  CheckCanonicalConversions(Canonical);
}

/// Text to binary data: what converts gives data that converts back to the same data,
/// and a resource made from the text names the root's class and gives the same text.
void CheckTextToBinary(const std::uint8_t* Data, std::size_t Size) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Data, Size));
  TObjectGuard<TMemoryStream> Bin(new TMemoryStream);
  try {
    ObjectTextToBinary(In.Get(), Bin.Get());
  } catch (const EReadError&) {
    Require(In->Position() == 0 && Bin->Size() == 0, "a failed conversion to data moved or wrote");
    return;
  }
  TBytes Data1 = BytesOf(Bin.Get());
  String Text;
  try {
    Text = DataToText(Data1);
  } catch (const EReadError& E) {
    Finding("data made from text does not convert back to text", E.Message());
  }
  Require(RequireTextConverts(Text) == Data1, "data converted to text and back is not the same data");

  TObjectGuard<TBytesStream> Again(new TBytesStream(Data, Size));
  TObjectGuard<TMemoryStream> Resource(new TMemoryStream);
  ObjectTextToResource(Again.Get(), Resource.Get(), "");
  TBytes ResourceBytes = BytesOf(Resource.Get());
  Require(ResourceToText(ResourceBytes) == Text, "text through a resource is not the same text");
  Resource->SetPosition(0);
  Require(Resource->ReadResHeader() == RootClassOf(Data1), "a resource made from text does not name its class");
}

/// Resource-headed data to text: the text converts to a resource of the same name that
/// gives the same text.
void CheckResourceToText(const std::uint8_t* Data, std::size_t Size) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Data, Size));
  String Name;
  TObjectGuard<TMemoryStream> Text(new TMemoryStream);
  try {
    Name = In->ReadResHeader();
    In->SetPosition(0);
    ObjectResourceToText(In.Get(), Text.Get());
  } catch (const EReadError&) {
    Require(Text->Size() == 0, "a failed conversion of a resource wrote part of the text");
    return;
  }
  String Text1 = TextOf(Text.Get());
  RequireTextConverts(Text1);
  TBytes Resource = TextToResource(Text1, Name);
  Require(ResourceToText(Resource) == Text1, "a resource made from text does not give the same text");
  TObjectGuard<TBytesStream> Head(new TBytesStream(Resource));
  Require(Head->ReadResHeader() == Name, "a resource made from text does not keep the name given");
}

} // namespace

void Finding(const char* What, const String& Detail) {
  std::fprintf(stderr, "\n==== FINDING: %s\n", What);
  if (!Detail.empty()) std::fprintf(stderr, "==== %s\n", Detail.c_str());
  std::fflush(stderr);
  std::abort();
}

std::uint32_t InputHash(const std::uint8_t* Data, std::size_t Size) noexcept {
  std::uint32_t H = 2166136261u;
  for (std::size_t I = 0; I < Size; ++I) H = (H ^ Data[I]) * 16777619u;
  return H;
}

TBytes BytesOf(TMemoryStream* Stream) {
  return TBytes(Stream->Memory(), Stream->Memory() + Stream->Size());
}

TBytes WriteRoot(TComponent* Root, TComponent* Ancestor) {
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  {
    TObjectGuard<TWriter> W(new TWriter(S.Get(), 4096));
    W->WriteDescendent(Root, Ancestor);
    W->FlushBuffer();
  }
  return BytesOf(S.Get());
}

TBytes WriteComponents(TComponent* Root, std::initializer_list<const char*> Names) {
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  {
    TObjectGuard<TWriter> W(new TWriter(S.Get(), 4096));
    W->SetRoot(Root);
    for (const char* Name : Names) {
      TComponent* C = FindNestedComponent(Root, Name);
      if (!C) Finding("a component to write is missing");
      W->WriteSignature();
      W->WriteComponent(C);
    }
    W->WriteListEnd();
    W->FlushBuffer();
  }
  return BytesOf(S.Get());
}

String DataToText(const TBytes& Data) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Data));
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  ObjectBinaryToText(In.Get(), Out.Get());
  return TextOf(Out.Get());
}

TBytes TextToData(std::string_view Text) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Text.data(), Text.size()));
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  ObjectTextToBinary(In.Get(), Out.Get());
  return BytesOf(Out.Get());
}

TBytes TextToResource(std::string_view Text, const String& Name) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Text.data(), Text.size()));
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  ObjectTextToResource(In.Get(), Out.Get(), Name);
  return BytesOf(Out.Get());
}

String ResourceToText(const TBytes& Resource) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Resource));
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  ObjectResourceToText(In.Get(), Out.Get());
  return TextOf(Out.Get());
}

bool ComponentData(const std::uint8_t* Data, std::size_t Size, TBytes& Out) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Data, Size));
  TStreamOriginalFormat Format = TestStreamFormat(In.Get());
  try {
    if (Format >= sofText) {
      Out = TextToData(std::string_view(reinterpret_cast<const char*>(Data), Size));
      return true;
    }
    if (Size >= 4 && std::memcmp(Data, ResourceHeaderMagic, 4) == 0) In->ReadResHeader();
  } catch (const EReadError&) {
    return false;
  }
  Out.assign(Data + In->Position(), Data + Size);
  return true;
}

bool ComponentListData(const std::uint8_t* Data, std::size_t Size, TBytes& Out) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Data, Size));
  if (TestStreamFormat(In.Get()) < sofText) {
    Out.assign(Data, Data + Size);
    return true;
  }
  TObjectGuard<TMemoryStream> List(new TMemoryStream);
  try {
    while (TestStreamFormat(In.Get()) >= sofText) ObjectTextToBinary(In.Get(), List.Get());
  } catch (const EReadError&) {
    return false;
  }
  const std::uint8_t End = vaNull;
  List->WriteBuffer(&End, 1);
  Out = BytesOf(List.Get());
  return true;
}

void CheckCanonicalConversions(const TBytes& Canonical) {
  String Text;
  try {
    Text = DataToText(Canonical);
  } catch (const EReadError& E) {
    Finding("data the writer made does not convert to text", E.Message());
  }
  Require(RequireTextConverts(Text) == Canonical, "written data through text is not the same data");
  Require(ResourceToText(TextToResource(Text)) == Text, "written data through a resource is not the same text");
}

void CheckConversions(const std::uint8_t* Data, std::size_t Size) {
  CheckBinaryToText(Data, Size);
  CheckTextToBinary(Data, Size);
  if (Size >= 4 && std::memcmp(Data, ResourceHeaderMagic, 4) == 0) CheckResourceToText(Data, Size);
}

TComponent* ReadRoot(const TBytes& Data, const TNewRoot& NewRoot) {
  TComponent* Root = NewRoot ? NewRoot() : nullptr;
  auto Free = OnFailure([&]() noexcept {
    if (Root) Root->Destroy();
  });
  TObjectGuard<TBytesStream> In(new TBytesStream(Data));
  TObjectGuard<TReader> R(new TReader(In.Get(), 4096));
  Root = R->ReadRootComponent(Root);
  return Root;
}

TBytes CheckRoundTrip(TComponent* Root, const TNewRoot& NewRoot, TComponent* Ancestor) {
  TBytes Written = WriteRoot(Root, Ancestor);
  CheckCanonicalConversions(Written);
  TComponent* Copy = nullptr;
  try {
    Copy = ReadRoot(Written, NewRoot);
  } catch (const EReadError& E) {
    Finding("what the writer wrote does not read back", E.Message());
  }
  TObjectGuard<TComponent> Free(Copy);
  TBytes Again = WriteRoot(Copy, Ancestor);
  if (Again != Written)
    Finding("a tree read back does not write the same bytes",
            "written:\n" + DataToText(Written) + "read back and written:\n" + DataToText(Again));
  return Written;
}

void CheckRootRead(const TBytes& Data, const TNewRoot& NewRoot, bool Skip, TComponent* Ancestor) {
  TObjectGuard<TComponent> Root(NewRoot ? NewRoot() : nullptr);
  TObjectGuard<TBytesStream> In(new TBytesStream(Data));
  TObjectGuard<TReader> R(new TReader(In.Get(), 4096));
  TSkipErrors Errors;
  if (Skip) Errors.Attach(R.Get());
  std::unordered_set<TComponent*> Before = OwnedBy(Root.Get());
  TComponent* Read = nullptr;
  try {
    Read = R->ReadRootComponent(Root.Get());
  } catch (const EReadError&) {
    RequireStillOwned(Root.Get(), Before);
    return;
  }
  Require(!Root.Get() || Read == Root.Get(), "a root read into an instance gives another");
  TObjectGuard<TComponent> Created(Root.Get() ? nullptr : Read);
  CheckRoundTrip(Read, NewRoot, Ancestor);
}

void CheckPaste(const TBytes& List, TComponent* Host, TComponent* Parent, bool Skip, const TNewRoot& NewRoot) {
  TObjectGuard<TBytesStream> In(new TBytesStream(List));
  TObjectGuard<TReader> R(new TReader(In.Get(), 4096));
  TSkipErrors Errors;
  if (Skip) Errors.Attach(R.Get());
  std::unordered_set<TComponent*> Before = OwnedBy(Host);
  try {
    R->ReadComponents(Host, Parent, [&](TComponent* C) {
      Require(C->Owner() == Host, "a pasted component is not owned by the root it was pasted into");
    });
  } catch (const EReadError&) {
    RequireStillOwned(Host, Before);
    return;
  }
  CheckRoundTrip(Host, NewRoot);
}

FK_IMPLEMENT(TSkipErrors, "FuzzSupport") {}

void TSkipErrors::Skip(TReader*, const String&, bool& Handled) {
  ++Count;
  Handled = true;
}

void TSkipErrors::Attach(TReader* Reader) { Reader->OnError = TReaderError::Bind<&TSkipErrors::Skip>(this); }

} // namespace formkit::fuzzing
