//===- inheritance/UpdateFiler.cpp - Defined properties that follow an ancestor -===//
#include "inheritance/UpdateFiler.h"

#include "inheritance/UpdateObjects.h"
#include "platform/ScopeGuard.h"

namespace formkit {

namespace {
FK_RESOURCESTRING(SUnknownProperty, "Property %s does not exist");

/// The buffer of the reader and writer that carry values over.
constexpr int CarryBufferSize = 1024;

std::uint32_t ReadLength(TReader* Reader) {
  std::uint8_t Bytes[4];
  Reader->Read(Bytes, sizeof Bytes);
  return std::uint32_t(Bytes[0]) | std::uint32_t(Bytes[1]) << 8 | std::uint32_t(Bytes[2]) << 16 |
         std::uint32_t(Bytes[3]) << 24;
}
} // namespace

FK_IMPLEMENT(TUpdateFiler, "UpdateFiler") {}

TUpdateFiler::TUpdateFiler(TUpdateObject* UpdateObject, bool Compare)
    : TFiler(nullptr, 0), FPropertyList(new TStringList), FUpdateObject(UpdateObject), FCompare(Compare) {
  Filter();
  FCompare = true;
}

void TUpdateFiler::Filter() {
  if (FFiltered && Empty()) return;
  SetRoot(FUpdateObject->ObjectOwner());
  SetAncestor(FUpdateObject->Ancestor());
  FState = usFilter;
  FUpdateObject->Object()->DefineProperties(this);
  FFiltered = true;
}

void TUpdateFiler::FilterProp(const String& Name, bool HasData) {
  if (!FFiltered) FPropertyList->Add(Name);
  if (FCompare && HasData) {
    int Index = FPropertyList->IndexOf(Name);
    if (Index >= 0) FPropertyList->Delete(Index);
  }
}

void TUpdateFiler::Update() {
  // Without a twin (a sub-object the ancestor does not hold) there is nothing to carry.
  if (Empty() || !FUpdateObject->Ancestor()) return;
  // Most updates find every defined value equal; streaming them over would only cost.
  if (!AncestorWouldWrite()) {
    FCompare = true;
    return;
  }
  TObjectGuard<TMemoryStream> Stream(new TMemoryStream);
  WriteAncestorValues(Stream.Get());
  Stream->SetPosition(0);
  ReadIntoObject(Stream.Get());
  FCompare = true;
}

bool TUpdateFiler::PassesWriteGate(const String& Name, bool HasWriter) const {
  return (HasWriter && !FCompare) || Follows(Name);
}

bool TUpdateFiler::AncestorWouldWrite() {
  SetAncestor(FUpdateObject->Object());
  SetRoot(FUpdateObject->AncestorOwner());
  FState = usProbing;
  FWouldWrite = false;
  FUpdateObject->Ancestor()->DefineProperties(this);
  return FWouldWrite;
}

void TUpdateFiler::WriteAncestorValues(TStream* Stream) {
  TObjectGuard<TWriter> Writer(new TWriter(Stream, CarryBufferSize));
  FWriter = Writer.Get();
  auto Clear = Finally([this]() noexcept { FWriter = nullptr; });
  // The ancestor's callbacks compute what differs against the descendant's object.
  SetAncestor(FUpdateObject->Object());
  SetRoot(FUpdateObject->AncestorOwner());
  FState = usWriting;
  FUpdateObject->Ancestor()->DefineProperties(this);
  FWriter->WriteValue(vaNull);
  FWriter->WriteValue(vaNull);
  FWriter->FlushBuffer();
}

void TUpdateFiler::ReadIntoObject(TStream* Stream) {
  TObjectGuard<TReader> Reader(new TReader(Stream, CarryBufferSize));
  FReader = Reader.Get();
  auto Clear = Finally([this]() noexcept {
    FReader->EndReferences();
    FReader = nullptr;
  });
  FReader->SetAncestor(nullptr);
  FReader->SetRoot(FUpdateObject->ObjectOwner());
  FReader->BeginReferences();
  FState = usReading;
  while (!FReader->EndOfList()) {
    FPropName = FReader->ReadStr();
    String Name = FPropName;
    FUpdateObject->Object()->DefineProperties(this);
    // A value that no callback consumed would be read as the next name.
    if (!FPropName.empty()) throw EReadError(SUnknownProperty, Name);
  }
}

void TUpdateFiler::DefineProperty(const String& Name, const TReaderProc& ReadData, const TWriterProc& WriteData,
                                  bool HasData) {
  switch (FState) {
  case usFilter: FilterProp(Name, HasData); break;
  case usReading:
    if (ReadData && !FPropName.empty() && CompareText(Name, FPropName) == 0) {
      FPropName.clear();
      ReadData(FReader);
    }
    break;
  case usWriting:
    if (PassesWriteGate(Name, bool(WriteData))) FWriter->DefineProperty(Name, ReadData, WriteData, HasData);
    break;
  case usProbing: FWouldWrite = FWouldWrite || (HasData && WriteData && PassesWriteGate(Name, true)); break;
  }
}

void TUpdateFiler::DefineBinaryProperty(const String& Name, const TStreamProc& ReadData,
                                        const TStreamProc& WriteData, bool HasData) {
  switch (FState) {
  case usFilter: FilterProp(Name, HasData); break;
  case usReading:
    if (!FPropName.empty() && CompareText(Name, FPropName) == 0) {
      FPropName.clear();
      ReadBinary(ReadData);
    }
    break;
  case usWriting:
    if (Follows(Name)) FWriter->DefineBinaryProperty(Name, ReadData, WriteData, HasData);
    break;
  case usProbing: FWouldWrite = FWouldWrite || (HasData && WriteData && Follows(Name)); break;
  }
}

void TUpdateFiler::ReadBinary(const TStreamProc& ReadData) {
  FReader->ReadValue();
  std::int64_t Length = ReadLength(FReader);
  TObjectGuard<TMemoryStream> Data(new TMemoryStream);
  Data->SetSize(Length);
  FReader->Read(Data->Memory(), Length);
  Data->SetPosition(0);
  if (ReadData) ReadData(Data.Get());
}

} // namespace formkit
