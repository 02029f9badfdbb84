//===- frameworks/kiln/KilnPictures.cpp - Graphics, pictures and their controls ===//
#include "frameworks/kiln/KilnPictures.h"

#include "platform/Filer.h"
#include "platform/ScopeGuard.h"
#include "platform/Streams.h"

#include <png.h>

#include <array>
#include <cstring>

namespace formkit {

namespace {

/// A side beyond this is refused before anything is allocated for it.
constexpr int MaxGraphicSide = 16384;

void CheckSize(int Width, int Height) {
  if (Width < 0 || Height < 0 || Width > MaxGraphicSide || Height > MaxGraphicSide)
    throw EInvalidGraphic(SGraphicTooLarge, Width, Height);
}

std::vector<std::uint8_t> ReadRest(TStream* Stream) {
  std::int64_t Count = Stream->Size() - Stream->Position();
  std::vector<std::uint8_t> Bytes(static_cast<std::size_t>(std::max<std::int64_t>(Count, 0)));
  if (!Bytes.empty()) Stream->ReadBuffer(Bytes.data(), static_cast<std::int64_t>(Bytes.size()));
  return Bytes;
}

//===----------------------------------------------------------------------===//
// The registered formats
//===----------------------------------------------------------------------===//

struct TFileFormat {
  const char* Extension;
  const char* Description;
  TGraphicClass (*GraphicClass)();
};

const std::array<TFileFormat, 2>& FileFormats() {
  static const std::array<TFileFormat, 2> Formats{{
      {"bmp", "Bitmaps", &TBmpImage::StaticClass},
      {"png", "Portable Network Graphics", &TPngImage::StaticClass},
  }};
  return Formats;
}

/// The graphic class of a stored class name, among the registered formats.
TGraphicClass GraphicClassNamed(const String& Name) {
  for (const TFileFormat& F : FileFormats())
    if (F.GraphicClass()->ClassNameIs(Name)) return F.GraphicClass();
  return nullptr;
}

[[nodiscard]] TObjectGuard<TGraphic> NewGraphic(TGraphicClass Class) {
  return TObjectGuard<TGraphic>(static_cast<TGraphic*>(Class->NewInstance()));
}

//===----------------------------------------------------------------------===//
// Bitmap files
//===----------------------------------------------------------------------===//

constexpr std::size_t BmpFileHeaderSize = 14;
constexpr std::size_t BmpInfoHeaderSize = 40;

std::uint32_t Le32(const std::vector<std::uint8_t>& B, std::size_t At) {
  return static_cast<std::uint32_t>(B[At]) | static_cast<std::uint32_t>(B[At + 1]) << 8 |
         static_cast<std::uint32_t>(B[At + 2]) << 16 | static_cast<std::uint32_t>(B[At + 3]) << 24;
}
std::uint16_t Le16(const std::vector<std::uint8_t>& B, std::size_t At) {
  return static_cast<std::uint16_t>(B[At] | B[At + 1] << 8);
}
void PutLe32(std::vector<std::uint8_t>& B, std::uint32_t V) {
  for (int I = 0; I < 4; ++I) B.push_back(static_cast<std::uint8_t>(V >> (8 * I)));
}
void PutLe16(std::vector<std::uint8_t>& B, std::uint16_t V) {
  B.push_back(static_cast<std::uint8_t>(V));
  B.push_back(static_cast<std::uint8_t>(V >> 8));
}

[[noreturn]] void BadBitmap(const char* Why) { throw EInvalidGraphic(SInvalidBitmapImage, Why); }

} // namespace

//===----------------------------------------------------------------------===//
// TGraphic
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TGraphic, "KilnPictures") {}

void TGraphic::SetSize(int Width, int Height) {
  CheckSize(Width, Height);
  FRgba.assign(static_cast<std::size_t>(Width) * static_cast<std::size_t>(Height) * 4, 0);
  FWidth = Width;
  FHeight = Height;
}

std::uint32_t TGraphic::Pixel(int X, int Y) const {
  if (X < 0 || Y < 0 || X >= FWidth || Y >= FHeight) throw EListError(SPixelOutOfRange, X, Y);
  const std::uint8_t* P = &FRgba[(static_cast<std::size_t>(Y) * static_cast<std::size_t>(FWidth) + X) * 4];
  return static_cast<std::uint32_t>(P[3]) << 24 | static_cast<std::uint32_t>(P[0]) << 16 |
         static_cast<std::uint32_t>(P[1]) << 8 | P[2];
}

void TGraphic::SetPixel(int X, int Y, std::uint32_t Argb) {
  if (X < 0 || Y < 0 || X >= FWidth || Y >= FHeight) throw EListError(SPixelOutOfRange, X, Y);
  std::uint8_t* P = &FRgba[(static_cast<std::size_t>(Y) * static_cast<std::size_t>(FWidth) + X) * 4];
  P[0] = static_cast<std::uint8_t>(Argb >> 16);
  P[1] = static_cast<std::uint8_t>(Argb >> 8);
  P[2] = static_cast<std::uint8_t>(Argb);
  P[3] = static_cast<std::uint8_t>(Argb >> 24);
}

void TGraphic::LoadFromStream(TStream* Stream) {
  int W = 0, H = 0;
  std::vector<std::uint8_t> Pixels;
  Decode(ReadRest(Stream), W, H, Pixels);
  FRgba = std::move(Pixels);
  FWidth = W;
  FHeight = H;
}

void TGraphic::SaveToStream(TStream* Stream) {
  std::vector<std::uint8_t> Bytes = Encode();
  Stream->WriteBuffer(Bytes.data(), static_cast<std::int64_t>(Bytes.size()));
}

void TGraphic::LoadFromFile(const String& FileName) {
  TObjectGuard<TFileStream> File(new TFileStream(FileName, fmOpenRead | fmShareDenyNone));
  LoadFromStream(File.Get());
}

void TGraphic::SaveToFile(const String& FileName) {
  // Encoded first, so that a failure leaves no half-written file behind.
  std::vector<std::uint8_t> Bytes = Encode();
  TObjectGuard<TFileStream> File(new TFileStream(FileName, fmCreate));
  File->WriteBuffer(Bytes.data(), static_cast<std::int64_t>(Bytes.size()));
}

bool TGraphic::Equals(const TGraphic* Other) const noexcept {
  return Other && Other->ClassType() == ClassType() && Other->FWidth == FWidth && Other->FHeight == FHeight &&
         Other->FRgba == FRgba;
}

void TGraphic::Assign(TPersistent* Source) {
  if (!Source) {
    FRgba.clear();
    FWidth = FHeight = 0;
    return;
  }
  auto* From = dynamic_cast<TGraphic*>(Source);
  if (!From) return inherited::Assign(Source);
  FRgba = From->FRgba;
  FWidth = From->FWidth;
  FHeight = From->FHeight;
}

void TGraphic::Draw(TCanvas* Canvas, const TRect& R) const {
  if (R.Width() == FWidth && R.Height() == FHeight)
    Canvas->Draw(R.Left, R.Top, ClassName());
  else
    Canvas->StretchDraw(R, ClassName());
}

//===----------------------------------------------------------------------===//
// TPngImage
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TPngImage, "KilnPictures") {}

void TPngImage::Decode(const std::vector<std::uint8_t>& Bytes, int& Width, int& Height,
                       std::vector<std::uint8_t>& Rgba) const {
  png_image Image;
  std::memset(&Image, 0, sizeof Image);
  Image.version = PNG_IMAGE_VERSION;
  if (!png_image_begin_read_from_memory(&Image, Bytes.data(), Bytes.size()))
    throw EInvalidGraphic(SInvalidPngImage, String(Image.message));
  auto Free = OnFailure([&]() noexcept { png_image_free(&Image); });
  CheckSize(static_cast<int>(std::min<png_uint_32>(Image.width, MaxGraphicSide + 1)),
            static_cast<int>(std::min<png_uint_32>(Image.height, MaxGraphicSide + 1)));
  Image.format = PNG_FORMAT_RGBA;
  std::vector<std::uint8_t> Pixels(PNG_IMAGE_SIZE(Image));
  Free.Dismiss();
  // Reading to the end frees the image whether it succeeds or not.
  if (!png_image_finish_read(&Image, nullptr, Pixels.data(), 0, nullptr))
    throw EInvalidGraphic(SInvalidPngImage, String(Image.message));
  Width = static_cast<int>(Image.width);
  Height = static_cast<int>(Image.height);
  Rgba = std::move(Pixels);
}

std::vector<std::uint8_t> TPngImage::Encode() const {
  png_image Image;
  std::memset(&Image, 0, sizeof Image);
  Image.version = PNG_IMAGE_VERSION;
  Image.width = static_cast<png_uint_32>(Width());
  Image.height = static_cast<png_uint_32>(Height());
  Image.format = PNG_FORMAT_RGBA;
  png_alloc_size_t Size = 0;
  // The first pass measures, the second writes.
  if (!png_image_write_to_memory(&Image, nullptr, &Size, 0, Rgba().data(), 0, nullptr))
    throw EInvalidGraphic(SInvalidPngImage, String(Image.message));
  std::vector<std::uint8_t> Bytes(Size);
  if (!png_image_write_to_memory(&Image, Bytes.data(), &Size, 0, Rgba().data(), 0, nullptr))
    throw EInvalidGraphic(SInvalidPngImage, String(Image.message));
  Bytes.resize(Size);
  return Bytes;
}

//===----------------------------------------------------------------------===//
// TBmpImage
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TBmpImage, "KilnPictures") {}

void TBmpImage::Decode(const std::vector<std::uint8_t>& Bytes, int& Width, int& Height,
                       std::vector<std::uint8_t>& Rgba) const {
  const std::size_t Length = Bytes.size();
  if (Length < BmpFileHeaderSize + BmpInfoHeaderSize) BadBitmap("the file is too short");
  if (Bytes[0] != 'B' || Bytes[1] != 'M') BadBitmap("no bitmap signature");
  std::uint32_t FileSize = Le32(Bytes, 2);
  std::uint32_t Offset = Le32(Bytes, 10);
  std::uint32_t InfoSize = Le32(Bytes, 14);
  if (FileSize != 0 && FileSize > Length) BadBitmap("the file is shorter than its header says");
  if (InfoSize < BmpInfoHeaderSize || InfoSize > Length - BmpFileHeaderSize) BadBitmap("unknown header size");
  auto W = static_cast<std::int32_t>(Le32(Bytes, 18));
  auto H = static_cast<std::int32_t>(Le32(Bytes, 22));
  std::uint16_t Planes = Le16(Bytes, 26);
  std::uint16_t Bits = Le16(Bytes, 28);
  std::uint32_t Compression = Le32(Bytes, 30);
  if (Planes != 1) BadBitmap("more than one plane");
  if (Bits != 24 && Bits != 32) BadBitmap("only 24 and 32 bits a pixel are read");
  if (Compression != 0) BadBitmap("compressed bitmaps are not read");
  if (W <= 0 || H == 0 || H == INT32_MIN) BadBitmap("no pixels");
  bool TopDown = H < 0;
  if (TopDown) H = -H;
  CheckSize(W, H);
  std::size_t Stride = (static_cast<std::size_t>(W) * Bits / 8 + 3) & ~std::size_t{3};
  if (Offset < BmpFileHeaderSize + InfoSize || Offset > Length ||
      (Length - Offset) / Stride < static_cast<std::size_t>(H))
    BadBitmap("the pixels lie outside the file");
  std::vector<std::uint8_t> Pixels(static_cast<std::size_t>(W) * static_cast<std::size_t>(H) * 4);
  bool AnyAlpha = false;
  const std::size_t Step = Bits / 8;
  for (std::int32_t Y = 0; Y < H; ++Y) {
    const std::uint8_t* Row = &Bytes[Offset + Stride * static_cast<std::size_t>(TopDown ? Y : H - 1 - Y)];
    std::uint8_t* Out = &Pixels[static_cast<std::size_t>(Y) * static_cast<std::size_t>(W) * 4];
    for (std::int32_t X = 0; X < W; ++X, Row += Step, Out += 4) {
      Out[0] = Row[2];
      Out[1] = Row[1];
      Out[2] = Row[0];
      Out[3] = Step == 4 ? Row[3] : 0xFF;
      AnyAlpha = AnyAlpha || Out[3] != 0;
    }
  }
  // A 32-bit bitmap that leaves every alpha byte 0 means opaque pixels.
  if (!AnyAlpha)
    for (std::size_t I = 3; I < Pixels.size(); I += 4) Pixels[I] = 0xFF;
  Width = W;
  Height = H;
  Rgba = std::move(Pixels);
}

std::vector<std::uint8_t> TBmpImage::Encode() const {
  const std::size_t PixelBytes = static_cast<std::size_t>(Width()) * static_cast<std::size_t>(Height()) * 4;
  const auto Offset = static_cast<std::uint32_t>(BmpFileHeaderSize + BmpInfoHeaderSize);
  std::vector<std::uint8_t> B;
  B.reserve(Offset + PixelBytes);
  B.push_back('B');
  B.push_back('M');
  PutLe32(B, static_cast<std::uint32_t>(Offset + PixelBytes));
  PutLe32(B, 0);
  PutLe32(B, Offset);
  PutLe32(B, BmpInfoHeaderSize);
  PutLe32(B, static_cast<std::uint32_t>(Width()));
  PutLe32(B, static_cast<std::uint32_t>(Height()));
  PutLe16(B, 1);
  PutLe16(B, 32);
  for (int I = 0; I < 6; ++I) PutLe32(B, 0); // uncompressed; size, resolution and palette left to readers
  for (int Y = Height() - 1; Y >= 0; --Y)
    for (int X = 0; X < Width(); ++X) {
      const std::uint8_t* P = &Rgba()[(static_cast<std::size_t>(Y) * static_cast<std::size_t>(Width()) + X) * 4];
      B.insert(B.end(), {P[2], P[1], P[0], P[3]});
    }
  return B;
}

//===----------------------------------------------------------------------===//
// File formats
//===----------------------------------------------------------------------===//

String GraphicExtension(TGraphicClass GraphicClass) {
  for (const TFileFormat& F : FileFormats())
    if (GraphicClass && F.GraphicClass()->InheritsFrom(GraphicClass)) return F.Extension;
  return String();
}

String GraphicFilter(TGraphicClass GraphicClass) {
  String Masks, Parts;
  for (const TFileFormat& F : FileFormats()) {
    if (!GraphicClass || !F.GraphicClass()->InheritsFrom(GraphicClass)) continue;
    String Mask = String("*.") + F.Extension;
    Masks += (Masks.empty() ? "" : ";") + Mask;
    Parts += Format("|%s (%s)|%s", F.Description, Mask, Mask);
  }
  return Masks.empty() ? String() : Format("All (%s)|%s", Masks, Masks) + Parts;
}

TGraphicClass GraphicClassOfExtension(const String& Extension) {
  String Ext = LowerCase(Extension);
  if (!Ext.empty() && Ext[0] == '.') Ext.erase(0, 1);
  for (const TFileFormat& F : FileFormats())
    if (Ext == F.Extension) return F.GraphicClass();
  return nullptr;
}

//===----------------------------------------------------------------------===//
// TPicture
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TPicture, "KilnPictures") {}

void TPicture::BeforeDestruction() {
  FGraphic.Reset();
  inherited::BeforeDestruction();
}

void TPicture::Changed() {
  if (OnChange) OnChange(this);
}

void TPicture::SetGraphic(TGraphic* Value) {
  if (Value == FGraphic.Get()) return;
  TObjectGuard<TGraphic> Copy;
  if (Value) {
    Copy = NewGraphic(Value->ClassType());
    Copy->Assign(Value);
  }
  FGraphic = std::move(Copy);
  Changed();
}

void TPicture::LoadFromFile(const String& FileName) {
  String Ext = ExtractFileExt(FileName);
  TGraphicClass Class = GraphicClassOfExtension(Ext);
  if (!Class) throw EInvalidGraphic(SUnknownExtension, Ext.empty() ? Ext : Ext.substr(1));
  TObjectGuard<TGraphic> Loaded = NewGraphic(Class);
  Loaded->LoadFromFile(FileName);
  FGraphic = std::move(Loaded);
  Changed();
}

void TPicture::SaveToFile(const String& FileName) {
  if (FGraphic) FGraphic->SaveToFile(FileName);
}

void TPicture::Assign(TPersistent* Source) {
  if (!Source) return SetGraphic(nullptr);
  if (auto* Picture = dynamic_cast<TPicture*>(Source)) return SetGraphic(Picture->Graphic());
  if (auto* Graphic = dynamic_cast<TGraphic*>(Source)) return SetGraphic(Graphic);
  inherited::Assign(Source);
}

void TPicture::DefineProperties(TFiler* Filer) {
  inherited::DefineProperties(Filer);
  auto* Ancestor = dynamic_cast<TPicture*>(Filer->Ancestor());
  bool HasData = Ancestor ? !(FGraphic ? FGraphic->Equals(Ancestor->Graphic()) : !Ancestor->Graphic())
                          : static_cast<bool>(FGraphic);
  Filer->DefineBinaryProperty(
      "Data", [this](TStream* S) { ReadData(S); }, [this](TStream* S) { WriteData(S); }, HasData);
}

void TPicture::ReadData(TStream* Stream) {
  std::uint8_t Length = 0;
  if (Stream->Read(&Length, 1) != 1) throw EInvalidGraphic(SPictureDataCorrupt);
  String Name(Length, '\0');
  if (Length > 0 && Stream->Read(Name.data(), Length) != Length) throw EInvalidGraphic(SPictureDataCorrupt);
  // An empty class name stands for an ancestor's picture cleared here.
  if (Name.empty()) return SetGraphic(nullptr);
  TGraphicClass Class = GraphicClassNamed(Name);
  if (!Class) throw EInvalidGraphic(SUnknownGraphicClass, Name);
  TObjectGuard<TGraphic> Loaded = NewGraphic(Class);
  Loaded->LoadFromStream(Stream);
  FGraphic = std::move(Loaded);
  Changed();
}

void TPicture::WriteData(TStream* Stream) {
  String Name = FGraphic ? FGraphic->ClassName() : String();
  auto Length = static_cast<std::uint8_t>(Name.size());
  Stream->WriteBuffer(&Length, 1);
  Stream->WriteBuffer(Name.data(), Length);
  if (FGraphic) FGraphic->SaveToStream(Stream);
}

//===----------------------------------------------------------------------===//
// Controls
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TImage, "KilnPictures") { B.Property("Picture", &TImage::Picture, &TImage::SetPicture); }

void TImage::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FPicture.Reset(new TPicture);
  SetBounds(Left(), Top(), 105, 105);
}

void TImage::BeforeDestruction() {
  FPicture.Reset();
  inherited::BeforeDestruction();
}

void TImage::SetPicture(TPicture* Value) { FPicture->Assign(Value); }

void TImage::Paint(TCanvas* Canvas) {
  if (TGraphic* G = FPicture->Graphic(); G && !G->Empty()) G->Draw(Canvas, Rect(0, 0, G->Width(), G->Height()));
}

FK_IMPLEMENT(TPaintBox, "KilnPictures") { B.Event("OnPaint", &TPaintBox::OnPaint); }

void TPaintBox::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FCanvas.Reset(new TCanvas);
  SetBounds(Left(), Top(), 105, 105);
}

void TPaintBox::BeforeDestruction() {
  FCanvas.Reset();
  inherited::BeforeDestruction();
}

void TPaintBox::Repaint() {
  FCanvas->ClearLines();
  Paint(FCanvas.Get());
}

void TPaintBox::Paint(TCanvas*) {
  if (OnPaint) OnPaint(this);
}

} // namespace formkit
