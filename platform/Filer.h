//===- platform/Filer.h - Reader and writer of form streams --------------===//
//
// A form stream is a resource header, the signature "KDS1" and component data.
// `TWriter` turns a component tree into that data, as a whole or as its
// difference against an ancestor tree; `TReader` builds or completes a tree from
// it, with hooks through which a designer resolves classes, methods, names and
// errors. The text form is a readable equivalent, converted both ways exactly.
// References to components of roots that are not loaded yet stay as fixups until
// `GlobalFixupReferences` finds them.
//
// Component data, after the signature (integers little-endian; a short string
// is a length byte and that many UTF-8 bytes):
//
//   component  := prefix classname:short name:short property* 0 component* 0
//   prefix     := 0xF0|flags [value]      flags: 1 inherited, 2 child position
//                                         (the value follows), 4 inline
//   property   := name:short value
//   value      := tag payload             (see `TValueType`)
//
// The text form of the same data:
//
//   object Form1: TMainForm
//     Caption = "Main"
//     Shades = [shLight, shDark]
//     Items = <
//       item
//         Text = "first"
//       end
//     >
//     inherited Panel1: TPanel [0]
//       Width = 120
//     end
//   end
//
// Example:
//   TObjectGuard<TWriter> Writer(new TWriter(Stream, 4096));
//   Writer->WriteDescendent(Root, Ancestor);   // only what differs from Ancestor
//   Writer.Release()->Destroy();               // flushes
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Classes.h"
#include "platform/Streams.h"

namespace formkit {

class TReader;
class TWriter;
class TStrings;

FK_EXCEPTION(EParserError, EReadError);

//===----------------------------------------------------------------------===//
// Encoding
//===----------------------------------------------------------------------===//

/// The one-byte tags of values. 0, 2, 3 and 4 are fixed: the core writes and tests them.
enum TValueType : std::uint8_t {
  vaNull = 0,       ///< ends a list
  vaList = 1,       ///< values up to vaNull
  vaInt8 = 2,       ///< 1-byte signed integer
  vaInt16 = 3,      ///< 2-byte signed integer
  vaInt32 = 4,      ///< 4-byte signed integer
  vaDouble = 5,     ///< 8-byte IEEE double
  vaString = 6,     ///< short UTF-8 string (length byte)
  vaIdent = 7,      ///< short identifier: enumeration names, references, method names
  vaFalse = 8,
  vaTrue = 9,
  vaBinary = 10,    ///< 4-byte length and that many bytes
  vaSet = 11,       ///< short element names up to an empty one
  vaLString = 12,   ///< 4-byte length and UTF-8 bytes
  vaNil = 13,       ///< no object, no method, an empty variant
  vaCollection = 14,///< items (each vaList and properties up to vaNull) up to vaNull
  vaInt64 = 15,     ///< 8-byte signed integer
  vaVarNull = 16,   ///< the null variant
  vaDate = 17,      ///< 8-byte IEEE double, a date
};
/// The highest tag in use.
inline constexpr std::uint8_t vaMaxTag = vaDate;

/// The four bytes that begin component data.
inline constexpr char FilerSignature[4] = {'K', 'D', 'S', '1'};

FK_ENUM(TFilerFlag, std::uint8_t, ffInherited, ffChildPos, ffInline)
FK_SET(TFilerFlags, TFilerFlag)

/// What `TestStreamFormat` finds: 0 unknown, 1 binary, 2 and up a text form.
enum TStreamOriginalFormat : std::uint8_t { sofUnknown = 0, sofBinary = 1, sofText = 2, sofUTF8Text = 3 };

/// Deepest nesting of components, lists and collections a stream may have; deeper
/// input is refused as malformed rather than risking the stack.
inline constexpr int MaxStreamNesting = 200;

//===----------------------------------------------------------------------===//
// Hooks
//===----------------------------------------------------------------------===//

FK_EVENT(TFindMethodEvent, void(TReader* Reader, const String& MethodName, void*& Address, bool& Error));
FK_EVENT(TSetNameEvent, void(TReader* Reader, TComponent* Component, String& Name));
FK_EVENT(TReferenceNameEvent, void(TReader* Reader, String& Name));
FK_EVENT(TAncestorNotFoundEvent, void(TReader* Reader, const String& ComponentName, TClass ComponentClass, TComponent*& Component));
FK_EVENT(TReaderError, void(TReader* Reader, const String& Message, bool& Handled));
FK_EVENT(TFindComponentClassEvent, void(TReader* Reader, const String& ClassName, TClass& ComponentClass));
FK_EVENT(TCreateComponentEvent, void(TReader* Reader, TClass ComponentClass, TComponent*& Component));
FK_EVENT(TFindAncestorEvent, void(TWriter* Writer, TComponent* Component, const String& Name, TComponent*& Ancestor, TComponent*& RootAncestor));

/// Callbacks of defined properties.
using TReaderProc = std::function<void(TReader* Reader)>;
using TWriterProc = std::function<void(TWriter* Writer)>;
using TStreamProc = std::function<void(TStream* Stream)>;
/// Called by `ReadComponents` for each component once it is complete.
using TReadComponentsProc = std::function<void(TComponent* Component)>;

//===----------------------------------------------------------------------===//
// TFiler
//===----------------------------------------------------------------------===//

/// The common base of reader and writer: a stream, a buffer, the root and the ancestor
/// being compared with, and the definition of non-published properties.
class FK_API TFiler : public TObject {
  FK_CLASS(TFiler, TObject)

  /// `Stream` is not owned and may be null for a filer that only collects definitions.
  TFiler(TStream* Stream, int BufSize);

  TStream* Stream() const noexcept { return FStream; }
  /// The root whose components are being read or written.
  TComponent* Root() const noexcept { return FRoot; }
  /// Sets `Root` and `LookupRoot`.
  virtual void SetRoot(TComponent* Value);
  /// The root under which names are looked up: `Root`, or a nested root while its
  /// components are being handled.
  TComponent* LookupRoot() const noexcept { return FLookupRoot; }
  void SetLookupRoot(TComponent* Value) noexcept { FLookupRoot = Value; }
  /// The object that the current one is compared with; null when written in full.
  TPersistent* Ancestor() const noexcept { return FAncestor; }
  void SetAncestor(TPersistent* Value) noexcept { FAncestor = Value; }
  bool IgnoreChildren() const noexcept { return FIgnoreChildren; }
  void SetIgnoreChildren(bool Value) noexcept { FIgnoreChildren = Value; }

  /// Declares a property that the object streams itself; `HasData` says whether the
  /// writer needs to write it (usually: it differs from `Ancestor`'s).
  virtual void DefineProperty(const String& Name, const TReaderProc& ReadData,
                              const TWriterProc& WriteData, bool HasData) = 0;
  /// The same for a block of bytes.
  virtual void DefineBinaryProperty(const String& Name, const TStreamProc& ReadData,
                                    const TStreamProc& WriteData, bool HasData) = 0;
  /// Brings the stream up to date with the buffer.
  virtual void FlushBuffer() = 0;

protected:
  TStream* FStream = nullptr;
  std::vector<std::uint8_t> FBuffer;
  std::int64_t FBufPos = 0;
  std::int64_t FBufEnd = 0;
  TComponent* FRoot = nullptr;
  TComponent* FLookupRoot = nullptr;
  TPersistent* FAncestor = nullptr;
  bool FIgnoreChildren = false;
};

//===----------------------------------------------------------------------===//
// TReader
//===----------------------------------------------------------------------===//

namespace detail {
struct TReaderState;
struct TLoadedEntry;
struct TChildList;
} // namespace detail

/// Reads component data. Failures raise `EReadError` (or a descendant) after they were
/// offered to `OnError`; a handled failure skips the property or component and reading
/// goes on. Destroying the reader leaves the stream right after what was consumed.
class FK_API TReader : public TFiler {
  FK_CLASS(TReader, TFiler)

  TReader(TStream* Stream, int BufSize);
  void BeforeDestruction() override;

  // Hooks -------------------------------------------------------------------
  TFindMethodEvent OnFindMethod;
  TSetNameEvent OnSetName;
  TReferenceNameEvent OnReferenceName;
  TAncestorNotFoundEvent OnAncestorNotFound;
  TReaderError OnError;
  TFindComponentClassEvent OnFindComponentClass;
  TCreateComponentEvent OnCreateComponent;

  // Context -----------------------------------------------------------------
  /// The owner of components being created.
  TComponent* Owner() const noexcept { return FOwner; }
  void SetOwner(TComponent* Value) noexcept { FOwner = Value; }
  /// The parent of components being read.
  TComponent* Parent() const noexcept { return FParent; }
  void SetParent(TComponent* Value) noexcept { FParent = Value; }
  /// The name of the defined property that the stream holds next, while definitions run.
  const String& PropName() const noexcept { return FPropName; }

  // Primitives --------------------------------------------------------------
  /// Reads exactly `Count` bytes or raises "Stream read error".
  void Read(void* Buffer, std::int64_t Count);
  /// The position in the stream of the next byte the reader will hand out.
  std::int64_t Position() const;
  /// Moves to an absolute position in the stream; the buffer is dropped.
  void SetPosition(std::int64_t Value);
  /// The number of bytes between the position and the end of the stream.
  std::int64_t Remaining() const;
  /// Consumes and returns the next tag.
  TValueType ReadValue();
  /// The next tag, not consumed.
  TValueType NextValue();
  /// True when the next tag ends a list (not consumed).
  bool EndOfList();
  void ReadListBegin();
  void ReadListEnd();
  /// Reads "KDS1" or raises "Invalid stream format".
  void ReadSignature();
  /// Reads a component's prefix: its flags and, with `ffChildPos`, its position.
  void ReadFilerFlags(TFilerFlags& Flags, int& Position);
  /// A short string without a tag: names of classes, components and properties.
  String ReadStr();
  /// Typed values; each raises "Invalid property value" for a tag it does not accept.
  std::int32_t ReadInteger();
  std::int64_t ReadInt64();
  double ReadFloat();
  double ReadDate();
  bool ReadBoolean();
  String ReadString();
  String ReadIdent();
  TVariant ReadVariant();
  /// Reads one whole value of any kind and drops it.
  void SkipValue();
  /// Reads a property name and its value and drops them.
  void SkipProperty();
  /// Drops a component with its children; with `SkipHeader` its prefix and names too.
  void SkipComponent(bool SkipHeader);

  // Components --------------------------------------------------------------
  /// Reads signature, prefix, class name and the rest of a root into `Root`, an
  /// existing instance; with `Root` null creates the root from the class name. Loaded
  /// is called (or deferred to `NotifyGlobalLoading`) and fixups are resolved.
  TComponent* ReadRootComponent(TComponent* Root);
  /// Reads (signature, component) pairs up to the end of the list, each created with
  /// `AOwner` and `AParent`, and calls `Proc` for each when it is complete.
  void ReadComponents(TComponent* AOwner, TComponent* AParent, const TReadComponentsProc& Proc);
  /// Reads one component (prefix onward) into `Component`, or a new or inherited one
  /// when null. Returns null when a handled error skipped it.
  TComponent* ReadComponent(TComponent* Component);
  /// Reads the properties and children of `Instance`; `TComponent::ReadState` calls it.
  void ReadData(TComponent* Instance);
  /// Reads one property of `Instance` (name and value).
  void ReadProperty(TPersistent* Instance);
  /// Reads a collection's items into `Collection`, replacing the ones it has.
  void ReadCollection(TCollection* Collection);
  /// Starts collecting loaded components and unresolved references.
  void BeginReferences();
  /// Resolves the references collected and calls `Loaded` on the components read.
  void FixupReferences();
  /// Drops what `BeginReferences` collected.
  void EndReferences() noexcept;

  void DefineProperty(const String& Name, const TReaderProc& ReadData, const TWriterProc& WriteData,
                      bool HasData) override;
  void DefineBinaryProperty(const String& Name, const TStreamProc& ReadData, const TStreamProc& WriteData,
                            bool HasData) override;
  /// Moves the stream back to the reader's position and drops the buffer.
  void FlushBuffer() override;

  /// Offers `Message` to `OnError`; true when the handler said to go on.
  [[nodiscard]] virtual bool Error(const String& Message);
  /// The code of method `Name` of `Root`, through `OnFindMethod`; null when absent.
  virtual void* FindMethod(TComponent* Root, const String& MethodName);
  /// The class named `ClassName`: the registry, then `OnFindComponentClass`; raises
  /// "Class %s not found".
  TClass FindComponentClass(const String& ClassName);

protected:
  ~TReader() override;

private:
  friend struct detail::TReaderState;
  void ReadBufferFill(std::int64_t Min);
  std::uint8_t ReadByte();
  void ReadDataInner(TComponent* Instance);
  void ReadPropValue(TPersistent* Instance, PPropInfo Prop);
  /// A class or interface property: nil, a reference by name (fixed up later), or the
  /// items of a collection.
  void ReadObjectValue(TPersistent* Instance, PPropInfo Prop, TTypeKind Kind);
  void CheckLength(std::int64_t Length);
  void EnterNesting();
  void DoFixupReferences();
  /// Frees what this read created from `LoadedIndex` on, after putting back what it found
  /// and moved; their pending references go too.
  void DropCreatedAfter(std::size_t LoadedIndex) noexcept;
  /// `ReadFloat` for a value given to an object: a non-finite number is an invalid value.
  double ReadFiniteFloat();
  void ReadFloatProp(TPersistent* Instance, PPropInfo Prop);
  static void RestoreParent(const detail::TLoadedEntry& Entry) noexcept;
  /// Takes the loading and reading flags off everything this read holds, after a failure.
  void ClearLoadingFlags() noexcept;
  /// Drops the pending references into items of `Collection`, which is about to be cleared.
  void ForgetFixupsInto(TCollection* Collection);

  TComponent* FOwner = nullptr;
  TComponent* FParent = nullptr;
  TComponent* FCurrent = nullptr;
  String FPropName;
  /// The root's name as the stream has it: references to it (or through it) mean the
  /// root being read, whatever that is named now.
  String FStreamRootName;
  bool FCanHandleExcepts = false;
  bool FErrorRefused = false;
  int FNesting = 0;
  std::unique_ptr<detail::TReaderState> FState;
};

//===----------------------------------------------------------------------===//
// TWriter
//===----------------------------------------------------------------------===//

/// Writes component data; only what differs from the default or from `Ancestor`.
/// Destroying the writer flushes its buffer.
class FK_API TWriter : public TFiler {
  FK_CLASS(TWriter, TFiler)

  TWriter(TStream* Stream, int BufSize);
  void BeforeDestruction() override;

  /// Called for each component before it is written; may supply the component to
  /// compare with and the root that holds it.
  TFindAncestorEvent OnFindAncestor;
  /// The ancestor of the root being written.
  TComponent* RootAncestor() const noexcept { return FRootAncestor; }
  void SetRootAncestor(TComponent* Value) noexcept { FRootAncestor = Value; }

  // Primitives --------------------------------------------------------------
  void Write(const void* Buffer, std::int64_t Count);
  /// The position in the stream of the next byte written, buffer included.
  std::int64_t Position() const;
  /// Flushes, then moves the stream.
  void SetPosition(std::int64_t Value);
  void FlushBuffer() override;
  void WriteValue(TValueType Value);
  void WriteSignature();
  void WriteFilerFlags(TFilerFlags Flags, int Position);
  void WriteListBegin() { WriteValue(vaList); }
  void WriteListEnd() { WriteValue(vaNull); }
  /// A short string without a tag; raises `EWriteError` beyond 255 bytes.
  void WriteStr(std::string_view Value);
  /// An integer with the smallest tag that holds it.
  void WriteInteger(std::int64_t Value);
  /// An integer always tagged `vaInt64`.
  void WriteInt64(std::int64_t Value);
  void WriteFloat(double Value);
  void WriteDate(double Value);
  void WriteBoolean(bool Value);
  /// A string: `vaString` up to 255 bytes, else `vaLString`.
  void WriteString(std::string_view Value);
  void WriteIdent(std::string_view Value);
  void WriteVariant(const TVariant& Value);
  /// A property name as it stands in the stream (with the path of sub-objects).
  void WritePropName(std::string_view Name);

  // Components --------------------------------------------------------------
  /// Writes the signature and `Root` with its tree; with `Ancestor` only what differs
  /// from it, with `ffInherited` on the components the ancestor has.
  void WriteDescendent(TComponent* Root, TComponent* Ancestor);
  /// The same as `WriteDescendent(Root, nullptr)`.
  void WriteRootComponent(TComponent* Root) { WriteDescendent(Root, nullptr); }
  /// Writes one component in full under the writer's `Root` (no signature).
  void WriteComponent(TComponent* Component);
  /// Writes prefix, names, properties and children; `TComponent::WriteState` calls it.
  void WriteData(TComponent* Instance);
  /// Writes the published and defined properties of `Instance` that differ from
  /// `Ancestor` (or from the defaults when it is null).
  void WriteProperties(TPersistent* Instance);
  /// Writes a collection's items in full.
  void WriteCollection(TCollection* Value);

  void DefineProperty(const String& Name, const TReaderProc& ReadData, const TWriterProc& WriteData,
                      bool HasData) override;
  void DefineBinaryProperty(const String& Name, const TStreamProc& ReadData, const TStreamProc& WriteData,
                            bool HasData) override;

private:
  void WriteFloatTagged(TValueType Tag, double Value);
  void WriteProperty(TPersistent* Instance, PPropInfo Prop);
  /// A class property: a collection's items, a sub-object's properties, or a reference.
  void WriteObjectProperty(TPersistent* Instance, PPropInfo Prop);
  /// The properties of a sub-object, named through the property that holds it.
  void WriteSubProperties(TPersistent* Sub, PPropInfo Prop);
  void WriteInterfaceProperty(TPersistent* Instance, PPropInfo Prop);
  void WriteMethodProperty(TPersistent* Instance, PPropInfo Prop);
  /// An ordinal, set, float, string or variant property.
  void WriteValueProperty(TPersistent* Instance, PPropInfo Prop);
  void WriteChild(TComponent* Child);
  /// Whether a reader would have `Instance` elsewhere among its parent's children, so
  /// that its position must be written; keeps the order the reader will have.
  bool TakesChildPosition(TComponent* Instance);
  /// The children of `Instance`, each compared with the ancestor's child of its name.
  void WriteChildren(TComponent* Instance);

  TComponent* FRootAncestor = nullptr;
  String FPropPath;
  /// The ancestor's children of the component whose children are being written, and
  /// the order a reader will have them in, to decide on `ffChildPos`.
  detail::TChildList* FChildren = nullptr;
  std::size_t FChildPos = 0;
  /// The component being written is inherited, but stands under another parent than in
  /// the ancestor: the reader will move it, like a new child, to the end of this parent.
  bool FAncestorMoved = false;
  /// The component being written is one the ancestor has: its ancestor came from the
  /// ancestor's tree, not from `OnFindAncestor` (which gives a nested frame its module).
  bool FAncestorInherited = false;
};

//===----------------------------------------------------------------------===//
// Conversions and comparison
//===----------------------------------------------------------------------===//

/// Converts one component (signature onward) from `Input`'s position to text at
/// `Output`'s position; `Input` is left after the component.
FK_API void ObjectBinaryToText(TStream* Input, TStream* Output);
/// Converts one component of text to binary data with its signature; `Input` is left
/// after the component's `end` and its line break. Raises `EParserError` with the line.
FK_API void ObjectTextToBinary(TStream* Input, TStream* Output);
/// A resource-headed binary stream to text.
FK_API void ObjectResourceToText(TStream* Input, TStream* Output);
/// Text to a resource-headed binary stream; an empty `Name` names the header after the
/// class of the text's root.
FK_API void ObjectTextToResource(TStream* Input, TStream* Output, const String& Name);
/// Looks at the stream without moving it: binary (with or without header), text, unknown.
FK_API TStreamOriginalFormat TestStreamFormat(TStream* Stream);

/// Whether two collections stream to the same content, references resolved against
/// `Owner1` and `Owner2`.
FK_API bool CollectionsEqual(TCollection* C1, TCollection* C2, TComponent* Owner1, TComponent* Owner2);

/// Whether a value may be compared with `Ancestor`: there is one, there is a root
/// ancestor, and `Root` is of the root ancestor's class or descends from it.
FK_API bool AncestorIsValid(TPersistent* Ancestor, TComponent* Root, TComponent* RootAncestor);

/// Supplies what a value is compared with: the ancestor object and the roots.
using TGetLookupInfoEvent = std::function<void(TPersistent*& Ancestor, TComponent*& Root,
                                               TComponent*& LookupRoot, TComponent*& RootAncestor)>;
/// Names a component value for comparison; empty to use the default naming.
using TFindComponentValueEvent = std::function<String(TComponent* Component)>;
/// True when a writer would not write property `Prop` of `Instance`: the value equals
/// the default, or the ancestor's value given by `OnGetLookupInfo`.
FK_API bool IsDefaultPropertyValue(TObject* Instance, PPropInfo Prop,
                                   const TGetLookupInfoEvent& OnGetLookupInfo = {},
                                   TWriter* Writer = nullptr,
                                   const TFindComponentValueEvent& OnFindComponentValue = {});

//===----------------------------------------------------------------------===//
// Global loading and fixups
//===----------------------------------------------------------------------===//

/// Opens a loading bracket; readers record the components they load in it and leave
/// their `Loaded` to `NotifyGlobalLoading`. Brackets nest.
FK_API void BeginGlobalLoading();
/// Calls `Loaded` on what the innermost bracket recorded.
FK_API void NotifyGlobalLoading();
/// Closes the innermost bracket; call it in a finally path.
FK_API void EndGlobalLoading();
/// True inside a bracket.
FK_API bool IsGlobalLoading();

/// Finds a loaded root by name for cross-root references.
using TFindGlobalComponent = std::function<TComponent*(const String& Name)>;
/// Adds a finder of roots by name; returns a token for `UnregisterFindGlobalComponentProc`.
[[nodiscard]] FK_API int RegisterFindGlobalComponentProc(TFindGlobalComponent Proc);
FK_API void UnregisterFindGlobalComponentProc(int Token);
/// The root of that name: the registered finders (last first), then the roots of the
/// open loading brackets; null when none.
FK_API TComponent* FindGlobalComponent(const String& Name);

/// Retries every unresolved cross-root reference by looking up its root now.
FK_API void GlobalFixupReferences();
/// The names of the roots to which `Root` holds unresolved references, each once.
FK_API void GetFixupReferenceNames(TComponent* Root, std::vector<String>& Names);
/// The component paths that `Root` expects in the root named `ReferenceRootName`.
FK_API void GetFixupInstanceNames(TComponent* Root, const String& ReferenceRootName,
                                  std::vector<String>& Names);
/// The same two lists into a string list (names added that it does not hold yet).
FK_API void GetFixupReferenceNames(TComponent* Root, TStrings* Names);
FK_API void GetFixupInstanceNames(TComponent* Root, const String& ReferenceRootName, TStrings* Names);
/// Retargets `Root`'s unresolved references from one root name to another and retries.
FK_API void RedirectFixupReferences(TComponent* Root, const String& OldRootName,
                                    const String& NewRootName);
/// Drops `Root`'s unresolved references to `RootName` (all of them when empty); a null
/// `Root` stands for every root.
FK_API void RemoveFixupReferences(TComponent* Root, const String& RootName);

namespace detail {
/// Records an unresolved reference of `Instance` (held under `Root`) to `Path`, whose
/// first step names a root.
FK_API void AddGlobalFixup(TComponent* Root, TPersistent* Instance, TComponent* Holder,
                           PPropInfo Prop, const String& Path);
/// Sets a reference property (class or interface) to `Target`.
FK_API void SetReferenceProp(TPersistent* Instance, PPropInfo Prop, TComponent* Target);
/// The component that `Path` names below `LookupRoot` (or `LookupRoot` itself).
FK_API TComponent* FindReference(TComponent* LookupRoot, const String& Path);
/// Records components loaded by a reader in the innermost bracket; false outside one.
[[nodiscard]] FK_API bool AddGlobalLoaded(const std::vector<TComponent*>& Components);
/// Forgets `Components` in every bracket (after a failed read).
FK_API void RemoveGlobalLoaded(const std::vector<TComponent*>& Components);
} // namespace detail

} // namespace formkit
