//===- frameworks/kiln/KilnPictures.h - Graphics, pictures and their controls ===//
//
// A graphic is an image of one file format held as pixels: `TPngImage`
// (Portable Network Graphics) and `TBmpImage` (bitmap files) decode and encode
// their format, and any graphic takes the pixels of any other by `Assign`. A
// picture holds one graphic of any registered format, loads it from a file by
// the file's extension, and streams it with its component as one binary
// property "Data": the graphic's class name, then the graphic in its format.
// `TImage` shows a picture on a form; `TPaintBox` is a control its owner
// paints through `OnPaint`.
//
// Example:
//   auto* Image = CreateComponentOf<TImage>(Form);
//   Image->Picture()->LoadFromFile("logo.png");   // a TPngImage; refused: unchanged
//   Image->Picture()->Graphic()->Pixel(0, 0);       // 0xAARRGGBB
//   GraphicFilter(TGraphic::StaticClass());         // "All (*.bmp;*.png)|..."
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"

#include <cstdint>
#include <vector>

namespace formkit {

class TStream;

/// Raised for a picture that cannot be read or written: an unknown extension or class,
/// a corrupt file. What held the picture keeps what it had.
FK_EXCEPTION(EInvalidGraphic, Exception);

FK_RESOURCESTRING(SUnknownExtension, "Unknown picture file extension (.%s)");
FK_RESOURCESTRING(SUnknownGraphicClass, "Unknown graphic class %s");
FK_RESOURCESTRING(SInvalidPngImage, "The PNG image is not valid: %s");
FK_RESOURCESTRING(SInvalidBitmapImage, "The bitmap image is not valid: %s");
FK_RESOURCESTRING(SGraphicTooLarge, "The picture is too large (%d by %d pixels)");
FK_RESOURCESTRING(SPixelOutOfRange, "Pixel (%d,%d) lies outside the picture");
FK_RESOURCESTRING(SPictureDataCorrupt, "The picture data of the form file is not valid");

//===----------------------------------------------------------------------===//
// Graphics
//===----------------------------------------------------------------------===//

/// An image as pixels, and the file format it reads and writes. Abstract: the
/// descendants know their format.
class FK_API TGraphic : public TPersistent {
  FK_CLASS(TGraphic, TPersistent)

  int Width() const noexcept { return FWidth; }
  int Height() const noexcept { return FHeight; }
  /// True without pixels.
  bool Empty() const noexcept { return FWidth == 0 || FHeight == 0; }
  /// Gives the image a new size, all pixels transparent black; raises `EInvalidGraphic`
  /// "The picture is too large (%d by %d pixels)" beyond 16384 pixels a side.
  void SetSize(int Width, int Height);
  /// The pixel at (`X`, `Y`) as 0xAARRGGBB; raises `EListError` outside the image.
  std::uint32_t Pixel(int X, int Y) const;
  void SetPixel(int X, int Y, std::uint32_t Argb);
  /// The pixels, four bytes (red, green, blue, alpha) each, row by row from the top.
  const std::vector<std::uint8_t>& Rgba() const noexcept { return FRgba; }

  /// Replaces the image with the one `Stream` holds from its position to its end;
  /// raises `EInvalidGraphic` for a corrupt one and keeps the image as it was.
  void LoadFromStream(TStream* Stream);
  /// Writes the image in the format of the class at the stream's position.
  void SaveToStream(TStream* Stream);
  void LoadFromFile(const String& FileName);
  void SaveToFile(const String& FileName);
  /// True for an image of the same class with the same pixels.
  bool Equals(const TGraphic* Other) const noexcept;

  /// Takes the pixels of another graphic, of any format; null empties the image.
  void Assign(TPersistent* Source) override;
  /// Draws the image on `Canvas`: at its size when `R` is its size, else scaled into `R`.
  void Draw(TCanvas* Canvas, const TRect& R) const;

protected:
  /// Decodes `Bytes` into `Width`, `Height`, `Rgba` or raises `EInvalidGraphic`.
  virtual void Decode(const std::vector<std::uint8_t>& Bytes, int& Width, int& Height,
                      std::vector<std::uint8_t>& Rgba) const = 0;
  /// Encodes the image in the class's format.
  [[nodiscard]] virtual std::vector<std::uint8_t> Encode() const = 0;

private:
  int FWidth = 0;
  int FHeight = 0;
  std::vector<std::uint8_t> FRgba;
};

/// A class of graphic.
using TGraphicClass = TClass;

/// A Portable Network Graphics image, decoded and encoded by libpng.
class FK_API TPngImage : public TGraphic {
  FK_CLASS(TPngImage, TGraphic)

protected:
  void Decode(const std::vector<std::uint8_t>& Bytes, int& Width, int& Height,
              std::vector<std::uint8_t>& Rgba) const override;
  [[nodiscard]] std::vector<std::uint8_t> Encode() const override;
};

/// A bitmap file image: 24 or 32 bits a pixel, uncompressed, either row order on
/// reading; written with 32 bits a pixel (alpha kept), bottom row first.
class FK_API TBmpImage : public TGraphic {
  FK_CLASS(TBmpImage, TGraphic)

protected:
  void Decode(const std::vector<std::uint8_t>& Bytes, int& Width, int& Height,
              std::vector<std::uint8_t>& Rgba) const override;
  [[nodiscard]] std::vector<std::uint8_t> Encode() const override;
};

//===----------------------------------------------------------------------===//
// File formats
//===----------------------------------------------------------------------===//

/// The default extension (without the dot, lower case) of the first registered format
/// whose class is `GraphicClass` or descends from it; empty when none is.
[[nodiscard]] FK_API String GraphicExtension(TGraphicClass GraphicClass);
/// The filter of the file dialogs for the formats of `GraphicClass` and its descendants:
/// "All (*.bmp;*.png)|*.bmp;*.png|Bitmaps (*.bmp)|*.bmp|...".
[[nodiscard]] FK_API String GraphicFilter(TGraphicClass GraphicClass);
/// The graphic class of a file extension (with or without the dot, any case), or null.
[[nodiscard]] FK_API TGraphicClass GraphicClassOfExtension(const String& Extension);

//===----------------------------------------------------------------------===//
// Pictures
//===----------------------------------------------------------------------===//

/// A graphic of any registered format, owned; what components publish as a picture.
class FK_API TPicture : public TPersistent {
  FK_CLASS(TPicture, TPersistent)
  void BeforeDestruction() override;

  /// The graphic, owned; null for an empty picture.
  TGraphic* Graphic() const noexcept { return FGraphic.Get(); }
  /// Holds a copy of `Value` (of its class), or nothing for null.
  void SetGraphic(TGraphic* Value);
  int Width() const noexcept { return FGraphic ? FGraphic->Width() : 0; }
  int Height() const noexcept { return FGraphic ? FGraphic->Height() : 0; }

  /// Loads a graphic of the class the file's extension names. Raises `EInvalidGraphic`
  /// "Unknown picture file extension (.%s)", a file error or the graphic's error, and
  /// then the picture keeps what it had.
  void LoadFromFile(const String& FileName);
  /// Saves the graphic in its own format; nothing without a graphic.
  void SaveToFile(const String& FileName);

  /// Takes a copy of a picture's graphic, or of a graphic; null clears.
  void Assign(TPersistent* Source) override;
  /// The binary property "Data": the graphic's class name and the graphic.
  void DefineProperties(TFiler* Filer) override;

  /// Told each change of the graphic.
  TNotifyEvent OnChange;

private:
  void Changed();
  void ReadData(TStream* Stream);
  void WriteData(TStream* Stream);
  TObjectGuard<TGraphic> FGraphic;
};

//===----------------------------------------------------------------------===//
// Controls
//===----------------------------------------------------------------------===//

/// A control that shows a picture at its size in its top left corner: 105 by 105.
class FK_API TImage : public TGraphicControl {
  FK_CLASS(TImage, TGraphicControl)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// The picture, the control's own; `SetPicture` copies into it.
  TPicture* Picture() const noexcept { return FPicture.Get(); }
  void SetPicture(TPicture* Value);
  void Paint(TCanvas* Canvas) override;

private:
  TObjectGuard<TPicture> FPicture;
};

/// A control painted by its owner: `Repaint` clears its canvas and calls `OnPaint`.
class FK_API TPaintBox : public TGraphicControl {
  FK_CLASS(TPaintBox, TGraphicControl)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// The canvas `OnPaint` draws on, the control's own; it records the calls.
  TCanvas* Canvas() const noexcept { return FCanvas.Get(); }
  /// Forgets what was drawn and paints anew.
  void Repaint();
  /// Calls `OnPaint`, which draws on the box's own canvas whatever canvas is given: the
  /// recorded calls of a paint box are its own.
  void Paint(TCanvas* Canvas) override;
  TNotifyEvent OnPaint;

private:
  TObjectGuard<TCanvas> FCanvas;
};

} // namespace formkit
