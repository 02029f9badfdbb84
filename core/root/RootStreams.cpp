//===- core/root/RootStreams.cpp - Streams lent to the host ---------------===//
#include "core/root/RootStreams.h"

#include "core/root/ComponentRoot.h"

namespace formkit {

FK_IMPLEMENT(TDatedStreamAdapter, "ComponentDesigner") {}
FK_IMPLEMENT(TRootStream, "ComponentDesigner") {}

void TDatedStreamAdapter::BeforeDestruction() {
  if (FOwnership == soOwned) FreeAndNil(FStream);
  inherited::BeforeDestruction();
}

std::int64_t TDatedStreamAdapter::Read(void* Buffer, std::int64_t Count) { return FStream->Read(Buffer, Count); }

std::int64_t TDatedStreamAdapter::Write(const void* Buffer, std::int64_t Count) {
  return FStream->Write(Buffer, Count);
}

std::int64_t TDatedStreamAdapter::Seek(std::int64_t Offset, int Origin) {
  return FStream->Seek(Offset, static_cast<TSeekOrigin>(Origin));
}

void TDatedStreamAdapter::SetSize(std::int64_t NewSize) { FStream->SetSize64(NewSize); }

/// The size of the buffer of a dormant module's copy.
constexpr std::int64_t DormantCopyBufferSize = 1048576;

TRootStream::TRootStream(TComponentRoot* Root) : FRoot(Root), FRootRef(QueryAs<IInterface>(Root->AsRoot())) {
  FDate = Root->GetModifyTime();
  if (Root->IsDormant()) {
    auto* Copy = new TMemoryStream;
    FStream = Copy;
    FOwnership = soOwned;
    Copy->CopyFrom(Root->GetRootStream(), 0, DormantCopyBufferSize);
    Copy->SetPosition(0);
    return;
  }
  FStream = Root->GetRootStream();
  Root->LendRootStream();
}

void TRootStream::BeforeDestruction() {
  if (FOwnership == soReference && FStream) {
    auto* Image = static_cast<TMemoryStream*>(FStream);
    FStream = nullptr;
    if (!FRoot->TakeBackRootStream(Image, FDate)) Image->Destroy();
  }
  inherited::BeforeDestruction();
  FRootRef = nullptr;
}

} // namespace formkit
