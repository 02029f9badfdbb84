//===- core/Events.h - Multicast events ----------------------------------===//
//
// `TEvent`: a list of method pointers called from the last to the first, so a
// handler may remove itself while it is called; typed descendants for the
// root-activated and component-renamed events. `TEventT`/`TEvent1`: a second,
// typed kind called in registration order. And the four global events of the
// design core, null before the core starts and after it stops.
//
// Example:
//   if (EvDesignerDeactivated) EvDesignerDeactivated->Add(TNotifyEvent::Bind<&TMyWindow::Deactivated>(this));
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"

namespace formkit {

/// A multicast list of method pointers; one allocated record per handler.
class FK_API TEvent : public TObject {
  FK_CLASS(TEvent, TObject)

  /// Adds `Handler` unless the same code and object are already listed.
  void Add(const TMethod& Handler);
  /// Adds `Handler` even when it is listed already.
  void ForceAdd(const TMethod& Handler);
  /// The index of `Handler`, searched from the end; -1 when absent.
  virtual int IndexOf(const TMethod& Handler);
  /// Removes the last occurrence of `Handler`; nothing when absent.
  void Remove(const TMethod& Handler);
  /// Calls each handler with `Sender`, from the last to the first.
  void Send(TObject* Sender);
  void Clear();
  int Count() const noexcept { return static_cast<int>(FList.size()); }
  /// True once `Send` has run; never reset.
  bool Executed() const noexcept { return FExecuted; }

  void Add(const TNotifyEvent& Handler) { Add(Handler.Method()); }
  void ForceAdd(const TNotifyEvent& Handler) { ForceAdd(Handler.Method()); }
  int IndexOf(const TNotifyEvent& Handler) { return IndexOf(Handler.Method()); }
  void Remove(const TNotifyEvent& Handler) { Remove(Handler.Method()); }

  void BeforeDestruction() override;

protected:
  /// Calls `Call` on each record from the last to the first; a handler that removes
  /// itself neither skips nor repeats another.
  void ForEachFromLast(const std::function<void(const TMethod&)>& Call);
  void MarkExecuted() noexcept { FExecuted = true; }

private:
  std::vector<TMethod*> FList; // owned records
  bool FExecuted = false;
};

FK_EVENT(TRootActivatedEvent, void(TObject* Sender, const IPtr<ICustomModule>& CustomModule));
FK_EVENT(TComponentRenamedEvent, void(TObject* Sender, const String& CurName, const String& NewName));

/// The palette context name present while a designer of this library is active.
inline constexpr const char* NativeDesignerActiveContext = "NativeDesignerActive";
/// The palette context name of the code editor, removed when a root is activated.
inline constexpr const char* CodeEditorActiveContext = "CodeEditorActive";

/// Sent when the active root of the active designer changed.
class FK_API TEvRootActivatedEvent : public TEvent {
  FK_CLASS(TEvRootActivatedEvent, TEvent)
  using TEvent::Add;
  using TEvent::IndexOf;
  using TEvent::Remove;
  void Add(const TRootActivatedEvent& Handler) { TEvent::Add(Handler.Method()); }
  int IndexOf(const TRootActivatedEvent& Handler) { return TEvent::IndexOf(Handler.Method()); }
  void Remove(const TRootActivatedEvent& Handler) { TEvent::Remove(Handler.Method()); }
  /// In a batch of the palette services: sets the native context by whether
  /// `CustomModule` is given, drops the code editor's, then calls the handlers.
  void Send(TObject* Sender, const IPtr<ICustomModule>& CustomModule);
  /// Calls the handlers only, without touching the palette.
  void SendWithoutPalette(TObject* Sender, const IPtr<ICustomModule>& CustomModule);
};

/// Sent when a component was renamed.
class FK_API TEvComponentRenamedEvent : public TEvent {
  FK_CLASS(TEvComponentRenamedEvent, TEvent)
  using TEvent::Add;
  using TEvent::IndexOf;
  using TEvent::Remove;
  void Add(const TComponentRenamedEvent& Handler) { TEvent::Add(Handler.Method()); }
  int IndexOf(const TComponentRenamedEvent& Handler) { return TEvent::IndexOf(Handler.Method()); }
  void Remove(const TComponentRenamedEvent& Handler) { TEvent::Remove(Handler.Method()); }
  void Send(TObject* Sender, const String& CurName, const String& NewName);
};

//===----------------------------------------------------------------------===//
// Typed events in registration order
//===----------------------------------------------------------------------===//

/// A list of method pointers without records or duplicate checks.
class FK_API TEventT {
public:
  void Add(const TMethod& Handler) { FList.push_back(Handler); }
  /// Removes the first occurrence; nothing when absent.
  void Remove(const TMethod& Handler);
  void Clear() noexcept { FList.clear(); }
  int Count() const noexcept { return static_cast<int>(FList.size()); }

protected:
  std::vector<TMethod> FList;
};

/// A typed event with one argument, called in order of registration.
template <class P> class TEvent1 : public TEventT {
public:
  using THandler = TEventPtr<void(P)>;
  void Add(const THandler& Handler) { TEventT::Add(Handler.Method()); }
  void Remove(const THandler& Handler) { TEventT::Remove(Handler.Method()); }
  void Send(P Arg) {
    // A snapshot: handlers added or removed during the call take effect next time.
    std::vector<TMethod> Snapshot = FList;
    for (const TMethod& M : Snapshot) THandler{M}(Arg);
  }
};

//===----------------------------------------------------------------------===//
// The global events
//===----------------------------------------------------------------------===//

FK_API extern TEvRootActivatedEvent* EvRootActivatedEvent;
FK_API extern TEvent* EvActiveRootModifiedEvent;
FK_API extern TEvComponentRenamedEvent* EvComponentRenamedEvent;
FK_API extern TEvent* EvDesignerDeactivated;

/// Creates the four global events (the core's start does this).
FK_API void CreateGlobalEvents();
/// Frees them and sets them null.
FK_API void FreeGlobalEvents() noexcept;

} // namespace formkit
