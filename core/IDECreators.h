//===- core/IDECreators.h - What a wizard hands the host for a new module -===//
//
// The file, string and creator interfaces of new modules. They live in their
// own namespace because the root's file interface of the design core is also
// called `IFile`.
//
// Example:
//   String Source = IDECreators::FileToString(File);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/TypInfo.h"

namespace formkit::IDECreators {

/// The whole content of a new file as one string.
struct FK_API IString : IInterface {
  FK_INTERFACE(IString, IInterface, "{17392073-5590-5740-AF4A-5D6474EB9D25}")
  virtual String GetString() = 0;
};

/// The content of a new file, read in units of one byte.
struct FK_API IFile : IInterface {
  FK_INTERFACE(IFile, IInterface, "{BB5CB63B-EF8C-55CB-974D-04EB8211CF1C}")
  virtual void Close() = 0;
  virtual std::int64_t GetSize() = 0;
  /// Reads up to `Count` units into `Buffer`; returns how many were read.
  virtual std::int64_t Read(void* Buffer, std::int64_t Count) = 0;
  virtual void Open() = 0;
};

/// A new file with an age; `GetAge` gives it as an integer (-1 when unknown).
struct FK_API IFileAge : IFile {
  FK_INTERFACE(IFileAge, IFile, "{5B5234DB-E96D-54C1-A75B-6E3BB7365A9B}")
  virtual String GetFileName() = 0;
  virtual bool GetIsReadOnly() = 0;
  virtual int GetAge() = 0;
  virtual void SetAge(int Age) = 0;
};

/// The files a creator of a new module brings for its views.
struct FK_API IDesignerViewsCreator : IInterface {
  FK_INTERFACE(IDesignerViewsCreator, IInterface, "{ED718967-0615-57E3-B829-4ED4CA3C0FB0}")
  /// True: views that the module's list names and that bring no file are created too.
  virtual bool GetAddListedViews() = 0;
  virtual int GetViewCount() = 0;
  virtual void GetViewName(int Index, String& Name) = 0;
  /// The view's content; it answers to `IFileAge`.
  virtual void GetViewFile(int Index, IPtr<IInterface>& File) = 0;
};

// The interfaces of the host's side; nothing in this library calls them.
struct FK_API IOptionsInitializer : IInterface {
  FK_INTERFACE(IOptionsInitializer, IInterface, "{92ED97F8-AA2F-53A3-9C6E-38A00BC42647}")
};
struct FK_API IFileFormat : IFile {
  FK_INTERFACE(IFileFormat, IFile, "{2610F845-FCC5-5D36-BA71-C2CF3F0F8B88}")
};
struct FK_API ISourceCreator : IInterface {
  FK_INTERFACE(ISourceCreator, IInterface, "{AC343F4D-85B7-5363-A99A-EE1B1A378F05}")
};
struct FK_API ISourceCreatorWithDirectory : IInterface {
  FK_INTERFACE(ISourceCreatorWithDirectory, IInterface, "{108EF757-C8D1-5602-8341-99E5D43FCAA8}")
};
struct FK_API IExtendedSourceCreator : IInterface {
  FK_INTERFACE(IExtendedSourceCreator, IInterface, "{9CE9C4B3-F8E1-5286-BEE5-F9D5C024D7E5}")
};
struct FK_API IDesignerGetter : IInterface {
  FK_INTERFACE(IDesignerGetter, IInterface, "{5C111A91-0F08-5A03-B8A1-41D7900543F1}")
};
struct FK_API IModuleCreator : ISourceCreator {
  FK_INTERFACE(IModuleCreator, ISourceCreator, "{551E737E-72F3-5F9D-9309-68EDB560A73E}")
};
struct FK_API IDsnModuleCreator : IModuleCreator {
  FK_INTERFACE(IDsnModuleCreator, IModuleCreator, "{15EDCA75-47B7-54F7-9B15-0ED1409290C7}")
};
struct FK_API IDesignViewCreator : IInterface {
  FK_INTERFACE(IDesignViewCreator, IInterface, "{B1D13412-82D6-51F9-B1DD-317E258EBDAE}")
};
struct FK_API IToolSourceCreator : IInterface {
  FK_INTERFACE(IToolSourceCreator, IInterface, "{4A9C1BDC-0D4B-5166-BDAA-CC3A1A11E156}")
};
struct FK_API IToolModuleCreator : IModuleCreator {
  FK_INTERFACE(IToolModuleCreator, IModuleCreator, "{BFE834D9-FD65-5A52-A32E-3FB8DA1FC9ED}")
};
struct FK_API IAdditionalFilesCreator : IInterface {
  FK_INTERFACE(IAdditionalFilesCreator, IInterface, "{044EFF41-76C5-52B0-8ADD-447455530B17}")
};

/// The content of `File` as text: its `IString` when it has one, else read whole.
FK_API String FileToString(const IPtr<IFile>& File);
/// The content of `File` as bytes.
FK_API std::vector<std::uint8_t> FileToBytes(const IPtr<IFile>& File);

} // namespace formkit::IDECreators
