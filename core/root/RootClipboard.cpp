//===- core/root/RootClipboard.cpp - Copy, paste, delete and undelete ----===//
//
// A selection leaves a module as a selection stream: an optional bounding
// rectangle, the components each after a signature, a zero, the source of
// their handlers, a zero. The same stream goes to the clipboard (with its text),
// to the undelete memory, and comes back through a selection read. Deleting
// keeps such a stream first, so that the deletion can be undone.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"

#include "platform/Filer.h"
#include "platform/ScopeGuard.h"

#include <algorithm>
#include <climits>
#include <set>

namespace formkit {

FK_RESOURCESTRING(sCantDeleteComponent,
                  "Selection cannot be deleted.  Source is either in read only mode or is a resource form");

namespace {
/// How many bytes of plain text `PossibleStream` looks at before each object.
constexpr std::int64_t ObjectPeekSize = 256;

bool IsBlank(char C) { return C == '\t' || C == '\n' || C == '\r' || C == ' '; }

std::vector<std::uint8_t> BytesOf(TStream* Stream) {
  std::vector<std::uint8_t> Bytes(static_cast<std::size_t>(Stream->Size()));
  Stream->SetPosition(0);
  if (!Bytes.empty()) Stream->ReadBuffer(Bytes.data(), static_cast<std::int64_t>(Bytes.size()));
  return Bytes;
}

/// The next byte of `Stream` without consuming it; 0 at the end.
std::uint8_t PeekByte(TStream* Stream) {
  std::uint8_t Byte = 0;
  std::int64_t At = Stream->Position();
  if (Stream->Read(&Byte, 1) != 1) return 0;
  Stream->SetPosition(At);
  return Byte;
}
} // namespace

//===----------------------------------------------------------------------===//
// The selection stream
//===----------------------------------------------------------------------===//

void TComponentRoot::StreamSelection(TStream* Stream, bool WithMethods, TStrings* Units, bool WithRect) {
  TObjectGuard<TWriter> Writer(new TWriter(Stream, 1024));
  FUnitDependencies = Units;
  auto Forget = Finally([this]() noexcept { FUnitDependencies = nullptr; });
  Writer->SetRoot(FRoot);
  Writer->OnFindAncestor = TFindAncestorEvent::Bind<&TComponentRoot::WriterFindAncestor>(this);
  IPtr<ISelections> Items = SelectionItems();
  int Count = FSelections ? FSelections->GetCount() : 0;
  if (WithRect && Items) {
    TRect Bounds{INT_MAX, INT_MAX, -INT_MAX, -INT_MAX};
    for (int I = 0; I < Items->GetCount(); ++I) {
      TRect R = Items->GetItems(I)->GetBoundsRect();
      Bounds = {std::min(Bounds.Left, R.Left), std::min(Bounds.Top, R.Top), std::max(Bounds.Right, R.Right),
                std::max(Bounds.Bottom, R.Bottom)};
    }
    if (!Bounds.IsEmpty()) {
      Writer->WriteInteger(Bounds.Left);
      Writer->WriteInteger(Bounds.Top);
      Writer->WriteInteger(Bounds.Right);
      Writer->WriteInteger(Bounds.Bottom);
    }
  }
  for (int I = 0; I < Count; ++I)
    if (auto* Component = dynamic_cast<TComponent*>(FSelections->GetPersistents(I))) {
      Writer->WriteSignature();
      Writer->WriteComponent(Component);
    }
  Writer->WriteValue(vaNull);
  if (WithMethods && FModule) {
    std::set<String> Names; // sorted by ordinal comparison
    IterateMethods([&](TPersistent* Instance, PPropInfo Prop) {
      TMethod Method = GetMethodProp(Instance, Prop);
      if (Method.Code)
        if (String Name = FRoot->ClassType()->MethodName(Method.Code); !Name.empty()) Names.insert(Name);
      return false;
    });
    for (const String& Name : Names)
      if (String Source = FModule->GetMethodSource(Name); !Source.empty())
        Writer->Write(Source.data(), static_cast<std::int64_t>(Source.size()));
  }
  Writer->WriteValue(vaNull);
}

TRect TComponentRoot::ReadSelectionBounds(TReader* Reader) {
  // A signature's first byte is no integer tag, so the test is exact.
  TValueType Next = Reader->NextValue();
  if (Next != vaInt8 && Next != vaInt16 && Next != vaInt32) return TRect{};
  TRect Bounds;
  Bounds.Left = Reader->ReadInteger();
  Bounds.Top = Reader->ReadInteger();
  Bounds.Right = Reader->ReadInteger();
  Bounds.Bottom = Reader->ReadInteger();
  return Bounds;
}

void TComponentRoot::CopySelectionToStream(TStream* Stream) {
  if (!FSelections || FSelections->GetCount() == 0) return;
  ForceCommonParent();
  StreamSelection(Stream, true, nullptr, true);
}

void TComponentRoot::PasteSelectionFromStream(TStream* Stream, TComponent* Parent, const TRect& Rect) {
  FCreateContainers = true;
  SelectReadStream(Stream, Parent ? Parent : FindCurrentParent(), true, Rect);
  Modified();
}

//===----------------------------------------------------------------------===//
// Deleting and undeleting
//===----------------------------------------------------------------------===//

void TComponentRoot::FreeUndoStream() noexcept {
  FreeAndNil(FUndoStream);
  FUndoParent = nullptr;
}

void TComponentRoot::DeleteSelection(bool AllowNonComponents) {
  if (FSurfaceDesigner) FSurfaceDesigner->CancelDragging();
  IPtr<ISelections> Items = SelectionItems();
  if (!Items || Items->GetCount() == 0 || IsRootSelected()) return;
  if (IsSourceReadOnly()) throw EComponentDesignerException(sCantDeleteComponent);
  bool Undoable = true;
  for (int I = 0; I < Items->GetCount(); ++I) {
    try {
      Items->GetItems(I)->ValidateDeletable();
    } catch (const ECannotDeleteNonComponentException&) {
      if (!AllowNonComponents) Abort();
      Undoable = false;
    }
  }
  if (FModule) FModule->CheckWritable();
  FreeUndoStream();
  if (Undoable) {
    ForceCommonParent();
    IPtr<IItem> ParentItem = Items->GetCount() ? Items->GetItems(0)->GetParent() : nullptr;
    TComponent* Parent = ParentItem ? dynamic_cast<TComponent*>(ExtractPersistent(ParentItem)) : nullptr;
    TObjectGuard<TMemoryStream> Undo(new TMemoryStream);
    StreamSelection(Undo.Get(), false, nullptr, false);
    FUndoStream = Undo.Release();
    FUndoParent = Parent;
  }
  Items->BeginSelections();
  {
    auto End = OnFailure([&]() noexcept { RunIgnoringExceptions([&] { Items->EndSelections(); }); });
    IPtr<IDesignEnvironment> Env = GetEnvironment();
    while (FSelections->GetCount() > 0) {
      TPersistent* X = FSelections->GetPersistents(0);
      if (Env) Env->ItemDeleted(AsDesigner(), X);
      if (auto* Component = dynamic_cast<TComponent*>(X)) {
        if (IsFrame(Component)) InstanceRemoved(Component);
        else
          Component->GetChildren(
              [this](TComponent* Child) {
                if (IsFrame(Child)) InstanceRemoved(Child);
              },
              FRoot);
      }
      int Before = FSelections->GetCount();
      // Nothing tells the module that a persistent which is no component goes.
      if (!dynamic_cast<TComponent*>(X)) InstanceRemoved(X);
      X->Destroy();
      if (FSelections->GetCount() == Before) Items->Remove(Items->GetItems(0)); // never loop on a silent free
    }
  }
  Items->EndSelections();
  if (FSurface)
    if (IPtr<IItem> Next = FSurface->FindNextItem(nullptr, false))
      if (TPersistent* Instance = ExtractPersistent(Next)) Select(Instance, false);
  Modified();
}

void TComponentRoot::DoUndelete() {
  if (!FUndoStream) return;
  FInUndo = true;
  auto Reset = Finally([this]() noexcept { FInUndo = false; });
  FUndoStream->SetPosition(0);
  SelectReadStream(FUndoStream, FUndoParent, false, TRect{});
  FreeUndoStream();
  Modified();
}

//===----------------------------------------------------------------------===//
// Selectable components
//===----------------------------------------------------------------------===//

void TComponentRoot::EnsureSelectableComponents() {
  if (!FSelectableComponents.empty() || !FRoot) return;
  std::size_t Count = 0;
  std::function<void(TComponent*, bool)> Walk = [&](TComponent* Owner, bool Fill) {
    for (int I = 0; I < Owner->ComponentCount(); ++I) {
      if (Fill) FSelectableComponents.push_back(Owner->Components(I));
      else ++Count;
    }
    for (int I = 0; I < Owner->ComponentCount(); ++I)
      if (IsFrame(Owner->Components(I))) Walk(Owner->Components(I), Fill);
  };
  Walk(FRoot, false);
  FSelectableComponents.reserve(Count);
  Walk(FRoot, true);
}

int TComponentRoot::GetSelectableComponentCount() {
  EnsureSelectableComponents();
  return static_cast<int>(FSelectableComponents.size());
}

TComponent* TComponentRoot::GetSelectableComponents(int Index) {
  EnsureSelectableComponents();
  if (Index < 0 || Index >= static_cast<int>(FSelectableComponents.size())) throw EListError(SListIndexError, Index);
  return FSelectableComponents[static_cast<std::size_t>(Index)];
}

//===----------------------------------------------------------------------===//
// The clipboard
//===----------------------------------------------------------------------===//

bool TComponentRoot::PossibleStream(std::string_view Text) {
  std::size_t I = 0;
  while (I < Text.size() && IsBlank(Text[I])) ++I;
  auto StartsWithWord = [&](std::string_view Word) {
    return Text.size() - I >= Word.size() && CompareText(Text.substr(I, Word.size()), Word) == 0;
  };
  return StartsWithWord("OBJECT") || StartsWithWord("INLINE");
}

void TComponentRoot::CopyStreamToClipboard(TStream* Stream) {
  TDesignClipboard& Board = Clipboard();
  Board.Open();
  auto Close = Finally([&]() noexcept { RunIgnoringExceptions([&] { Board.Close(); }); });
  Board.SetBytes(CF_COMPONENTS_NAME, BytesOf(Stream));
  // The text of each component; a leading rectangle has none.
  Stream->SetPosition(0);
  TObjectGuard<TMemoryStream> Text(new TMemoryStream);
  {
    TObjectGuard<TReader> Reader(new TReader(Stream, 1024));
    (void)ReadSelectionBounds(Reader.Get());
  } // the reader leaves the stream right after what it consumed
  while (PeekByte(Stream) != 0) ObjectBinaryToText(Stream, Text.Get());
  Board.SetText(String(reinterpret_cast<const char*>(Text->Memory()), static_cast<std::size_t>(Text->Size())));
}

TMemoryStream* TComponentRoot::GetClipboardStream() {
  TDesignClipboard& Board = Clipboard();
  Board.Open();
  auto Close = Finally([&]() noexcept { RunIgnoringExceptions([&] { Board.Close(); }); });
  TObjectGuard<TMemoryStream> Result(new TMemoryStream);
  if (Board.HasFormat(CF_COMPONENTS_NAME)) {
    std::vector<std::uint8_t> Bytes = Board.GetBytes(CF_COMPONENTS_NAME);
    if (!Bytes.empty()) Result->WriteBuffer(Bytes.data(), static_cast<std::int64_t>(Bytes.size()));
  } else {
    String Text = Board.HasText() ? Board.GetText() : String();
    TObjectGuard<TMemoryStream> Source(new TMemoryStream);
    if (!Text.empty()) Source->WriteBuffer(Text.data(), static_cast<std::int64_t>(Text.size()));
    Source->SetPosition(0);
    for (;;) {
      std::int64_t At = Source->Position();
      std::string_view Ahead(Text.data() + At, static_cast<std::size_t>(std::min(ObjectPeekSize, Source->Size() - At)));
      if (!PossibleStream(Ahead)) break;
      ObjectTextToBinary(Source.Get(), Result.Get());
    }
    std::uint8_t Zero = 0;
    Result->WriteBuffer(&Zero, 1);
  }
  Result->SetPosition(0);
  return Result.Release();
}

} // namespace formkit
