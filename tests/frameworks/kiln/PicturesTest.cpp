//===- tests/frameworks/kiln/PicturesTest.cpp - Graphics, pictures, picture dialogs ===//
#include "frameworks/kiln/KilnExtDlgs.h"
#include "frameworks/kiln/KilnPictures.h"
#include "platform/ScopeGuard.h"
#include "tests/frameworks/kiln/KilnTestSupport.h"
#include "tests/frameworks/kiln/PictureSamples.h"

using namespace formkit;
using namespace formkit::kilntest;

namespace {

template <class F> void ExpectInvalid(F&& Run, const String& Message) {
  try {
    Run();
    ADD_FAILURE() << "accepted; expected: " << Message;
  } catch (const EInvalidGraphic& E) {
    EXPECT_EQ(E.Message(), Message);
  }
}

/// Counts the events it hears; paints "x" on a paint box that it is told of.
class TEventCounter : public TObject {
  FK_CLASS(TEventCounter, TObject)
  void Hit(TObject* Sender) {
    ++Count;
    LastSender = Sender;
    if (auto* Box = dynamic_cast<TPaintBox*>(Sender)) Box->Canvas()->TextOut(1, 2, "x");
  }
  int Count = 0;
  TObject* LastSender = nullptr;
};
FK_IMPLEMENT(TEventCounter, "PicturesTest") {}

class KilnPictures : public KilnTest {
protected:
  TObjectGuard<TEventCounter> Counter{new TEventCounter};
  TNotifyEvent Counted() { return TNotifyEvent::Bind<&TEventCounter::Hit>(Counter.Get()); }
};

//===----------------------------------------------------------------------===//
// Files
//===----------------------------------------------------------------------===//

TEST_F(KilnPictures, PngAndBitmapFilesLoadAndSaveThePixels) {
  TTempFile Png(".png"), Bmp(".BMP"), Again(".png");
  WritePatternPng(Png.Name, 5, 4);
  TObjectGuard<TPicture> Picture(new TPicture);
  Picture->OnChange = Counted();
  Picture->LoadFromFile(Png.Name);
  ASSERT_TRUE(Picture->Graphic());
  EXPECT_EQ(Picture->Graphic()->ClassName(), "TPngImage");
  EXPECT_EQ(Counter->Count, 1);
  ExpectPattern(Picture->Graphic(), 5, 4);

  // Into a bitmap file and back, by the extension in any case.
  TObjectGuard<TBmpImage> AsBitmap(new TBmpImage);
  AsBitmap->Assign(Picture->Graphic());
  AsBitmap->SaveToFile(Bmp.Name);
  std::vector<std::uint8_t> BmpBytes = ReadBytes(Bmp.Name);
  ASSERT_GE(BmpBytes.size(), 54u);
  EXPECT_EQ(BmpBytes[0], 'B');
  EXPECT_EQ(BmpBytes.size(), 54u + 5 * 4 * 4);
  Picture->LoadFromFile(Bmp.Name);
  EXPECT_EQ(Picture->Graphic()->ClassName(), "TBmpImage");
  ExpectPattern(Picture->Graphic(), 5, 4);

  // A saved PNG reads back the same; the picture saves in its graphic's format.
  TObjectGuard<TPngImage> AsPng(new TPngImage);
  AsPng->Assign(Picture->Graphic());
  Picture->SetGraphic(AsPng.Get());
  Picture->SaveToFile(Again.Name);
  TObjectGuard<TPngImage> Read(new TPngImage);
  Read->LoadFromFile(Again.Name);
  EXPECT_TRUE(Read->Equals(AsPng.Get()));
  EXPECT_FALSE(Read->Equals(AsBitmap.Get())); // same pixels, another format

  // A 24-bit bitmap, top row first, as other programs write them: opaque pixels.
  std::vector<std::uint8_t> B24 = {'B', 'M', 0, 0, 0, 0, 0, 0,    0,    0,    54,   0, 0, 0,  40,
                                   0,   0,   0, 2, 0, 0, 0, 0xFE, 0xFF, 0xFF, 0xFF, 1, 0, 24, 0};
  B24.resize(54, 0);
  B24.insert(B24.end(), {0x00, 0x00, 0xFF, 0x00, 0xFF, 0x00, 0, 0, 0xFF, 0x00, 0x00, 0x10, 0x20, 0x30, 0, 0});
  WriteBytes(Bmp.Name, B24);
  Picture->LoadFromFile(Bmp.Name);
  EXPECT_EQ(Picture->Width(), 2);
  EXPECT_EQ(Picture->Height(), 2);
  EXPECT_EQ(Picture->Graphic()->Pixel(0, 0), 0xFFFF0000u);
  EXPECT_EQ(Picture->Graphic()->Pixel(1, 0), 0xFF00FF00u);
  EXPECT_EQ(Picture->Graphic()->Pixel(0, 1), 0xFF0000FFu);
  EXPECT_EQ(Picture->Graphic()->Pixel(1, 1), 0xFF302010u);
  EXPECT_THROW((void)Picture->Graphic()->Pixel(2, 0), EListError);
}

TEST_F(KilnPictures, ACorruptOrUnknownFileLeavesThePictureAsItWas) {
  TTempFile Png(".png"), Bad(".png"), Bmp(".bmp"), Text(".txt");
  WritePatternPng(Png.Name, 3, 2);
  TObjectGuard<TPicture> Picture(new TPicture);
  Picture->LoadFromFile(Png.Name);
  TGraphic* Before = Picture->Graphic();
  auto Unchanged = [&] {
    EXPECT_EQ(Picture->Graphic(), Before);
    ExpectPattern(Picture->Graphic(), 3, 2);
  };

  // A PNG cut short after its header.
  std::vector<std::uint8_t> Bytes = ReadBytes(Png.Name);
  Bytes.resize(Bytes.size() / 2);
  WriteBytes(Bad.Name, Bytes);
  EXPECT_THROW(Picture->LoadFromFile(Bad.Name), EInvalidGraphic);
  Unchanged();
  WriteBytes(Bad.Name, {'n', 'o', 't', ' ', 'a', ' ', 'p', 'n', 'g'});
  try {
    Picture->LoadFromFile(Bad.Name);
    ADD_FAILURE() << "a text file was read as a PNG";
  } catch (const EInvalidGraphic& E) {
    EXPECT_EQ(String(E.Message()).rfind("The PNG image is not valid: ", 0), 0u) << E.Message();
  }
  Unchanged();

  // Bitmaps: every header field is checked against the file.
  std::vector<std::uint8_t> Good = {'B', 'M', 58, 0, 0, 0, 0, 0, 0, 0, 54, 0, 0, 0,  40,
                                    0,   0,   0,  1, 0, 0, 0, 1, 0, 0, 0,  1, 0, 32, 0};
  Good.resize(54, 0);
  Good.insert(Good.end(), {1, 2, 3, 4});
  auto Refused = [&](std::vector<std::uint8_t> B, const char* Why) {
    WriteBytes(Bmp.Name, B);
    ExpectInvalid([&] { Picture->LoadFromFile(Bmp.Name); }, Format("The bitmap image is not valid: %s", Why));
    Unchanged();
  };
  auto With = [&](std::size_t At, std::vector<std::uint8_t> Patch) {
    std::vector<std::uint8_t> B = Good;
    std::copy(Patch.begin(), Patch.end(), B.begin() + static_cast<std::ptrdiff_t>(At));
    return B;
  };
  Refused({'B', 'M', 0}, "the file is too short");
  Refused(With(0, {'P', 'K'}), "no bitmap signature");
  Refused(With(2, {200}), "the file is shorter than its header says");
  Refused(With(14, {12}), "unknown header size");
  Refused(With(26, {2}), "more than one plane");
  Refused(With(28, {8}), "only 24 and 32 bits a pixel are read");
  Refused(With(30, {1}), "compressed bitmaps are not read");
  Refused(With(18, {0}), "no pixels");
  Refused(With(22, {2}), "the pixels lie outside the file");
  Refused(With(10, {0xFF, 0xFF, 0, 0}), "the pixels lie outside the file");
  WriteBytes(Bmp.Name, With(18, {0xFF, 0xFF, 0, 0}));
  ExpectInvalid([&] { Picture->LoadFromFile(Bmp.Name); }, "The picture is too large (65535 by 1 pixels)");
  Unchanged();
  WriteBytes(Bmp.Name, Good);
  TObjectGuard<TBmpImage> One(new TBmpImage);
  One->LoadFromFile(Bmp.Name);
  EXPECT_EQ(One->Pixel(0, 0), 0x04030201u);

  WriteBytes(Text.Name, {'h', 'i'});
  ExpectInvalid([&] { Picture->LoadFromFile(Text.Name); }, "Unknown picture file extension (.txt)");
  ExpectInvalid([&] { Picture->LoadFromFile("/tmp/no_extension"); }, "Unknown picture file extension (.)");
  EXPECT_THROW(Picture->LoadFromFile("/tmp/fk_pictures_missing.png"), EFOpenError);
  Unchanged();
}

//===----------------------------------------------------------------------===//
// Streaming
//===----------------------------------------------------------------------===//

std::vector<std::uint8_t> WriteRoot(TComponent* Root, TComponent* Ancestor = nullptr) {
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  {
    TObjectGuard<TWriter> W(new TWriter(S.Get(), 4096));
    W->WriteDescendent(Root, Ancestor);
    W->FlushBuffer();
  }
  return std::vector<std::uint8_t>(S->Memory(), S->Memory() + S->Size());
}

void ReadRoot(const std::vector<std::uint8_t>& Bytes, TComponent* Root) {
  TObjectGuard<TBytesStream> S(new TBytesStream(Bytes));
  TObjectGuard<TReader> R(new TReader(S.Get(), 4096));
  R->ReadRootComponent(Root);
}

String AsText(const std::vector<std::uint8_t>& Bytes) {
  TObjectGuard<TBytesStream> In(new TBytesStream(Bytes));
  TObjectGuard<TMemoryStream> Out(new TMemoryStream);
  ObjectBinaryToText(In.Get(), Out.Get());
  return String(reinterpret_cast<const char*>(Out->Memory()), static_cast<std::size_t>(Out->Size()));
}

TEST_F(KilnPictures, APictureStreamsWithItsComponentAsBinaryData) {
  TTempFile Png(".png");
  WritePatternPng(Png.Name, 4, 3);
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form->SetName("Form1");
  auto* Image = Make<TImage>(Form.P, Form.P, "Image1");
  auto* Empty = Make<TImage>(Form.P, Form.P, "Image2");
  (void)Empty;
  Image->Picture()->LoadFromFile(Png.Name);

  std::vector<std::uint8_t> Bytes = WriteRoot(Form.P);
  String Text = AsText(Bytes);
  EXPECT_NE(Text.find("Picture.Data = {"), String::npos) << Text;
  EXPECT_EQ(Text.find("Picture.Data"), Text.rfind("Picture.Data")); // the empty one writes nothing
  // Text and binary convert both ways exactly.
  TObjectGuard<TBytesStream> In(new TBytesStream(Text.data(), Text.size()));
  TObjectGuard<TMemoryStream> Back(new TMemoryStream);
  ObjectTextToBinary(In.Get(), Back.Get());
  EXPECT_EQ(std::vector<std::uint8_t>(Back->Memory(), Back->Memory() + Back->Size()), Bytes);

  TRootGuard<TForm> Copy(CreateComponentOf<TForm>(nullptr));
  ReadRoot(Bytes, Copy.P);
  auto* Read = dynamic_cast<TImage*>(Copy->FindComponent("Image1"));
  ASSERT_TRUE(Read && Read->Picture()->Graphic());
  EXPECT_EQ(Read->Picture()->Graphic()->ClassName(), "TPngImage");
  ExpectPattern(Read->Picture()->Graphic(), 4, 3);
  EXPECT_FALSE(dynamic_cast<TImage*>(Copy->FindComponent("Image2"))->Picture()->Graphic());

  // Against an ancestor with the same picture nothing is written; a cleared one writes
  // an empty class name and reads back empty.
  EXPECT_EQ(AsText(WriteRoot(Copy.P, Form.P)).find("Picture.Data"), String::npos);
  Read->Picture()->SetGraphic(nullptr);
  std::vector<std::uint8_t> Cleared = WriteRoot(Copy.P, Form.P);
  EXPECT_NE(AsText(Cleared).find("Picture.Data = {\n      00\n    }"), String::npos) << AsText(Cleared);
}

TEST_F(KilnPictures, CorruptPictureDataInAFormFileIsAReadError) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form->SetName("Form1");
  Make<TImage>(Form.P, Form.P, "Image1");
  String Text = AsText(WriteRoot(Form.P));
  auto Corrupted = [&](const String& Data) {
    String T = Text;
    T.insert(T.find("  end\n"), "    Picture.Data = {" + Data + "}\n");
    TObjectGuard<TBytesStream> In(new TBytesStream(T.data(), T.size()));
    TObjectGuard<TMemoryStream> Out(new TMemoryStream);
    ObjectTextToBinary(In.Get(), Out.Get());
    return std::vector<std::uint8_t>(Out->Memory(), Out->Memory() + Out->Size());
  };
  auto ExpectRefused = [&](const String& Data, const String& Message) {
    TRootGuard<TForm> Copy(CreateComponentOf<TForm>(nullptr));
    try {
      ReadRoot(Corrupted(Data), Copy.P);
      ADD_FAILURE() << "read: " << Data;
    } catch (const Exception& E) {
      EXPECT_NE(String(E.Message()).find(Message), String::npos) << E.Message();
    }
  };
  ExpectRefused("", "The picture data of the form file is not valid");
  ExpectRefused("05545069", "The picture data of the form file is not valid");
  ExpectRefused("0454466F6F", "Unknown graphic class TFoo");
  ExpectRefused("0954506E67496D616765000102", "The PNG image is not valid");
}

//===----------------------------------------------------------------------===//
// Formats, controls and dialogs
//===----------------------------------------------------------------------===//

TEST_F(KilnPictures, FormatsGiveExtensionsAndFiltersByClass) {
  EXPECT_EQ(GraphicFilter(TGraphic::StaticClass()),
            "All (*.bmp;*.png)|*.bmp;*.png|Bitmaps (*.bmp)|*.bmp|Portable Network Graphics (*.png)|*.png");
  EXPECT_EQ(GraphicFilter(TPngImage::StaticClass()), "All (*.png)|*.png|Portable Network Graphics (*.png)|*.png");
  EXPECT_EQ(GraphicFilter(TForm::StaticClass()), "");
  EXPECT_EQ(GraphicExtension(TGraphic::StaticClass()), "bmp");
  EXPECT_EQ(GraphicExtension(TPngImage::StaticClass()), "png");
  EXPECT_EQ(GraphicClassOfExtension(".PNG"), TPngImage::StaticClass());
  EXPECT_EQ(GraphicClassOfExtension("gif"), nullptr);
  TObjectGuard<TPngImage> Big(new TPngImage);
  ExpectInvalid([&] { Big->SetSize(16385, 1); }, "The picture is too large (16385 by 1 pixels)");
  EXPECT_TRUE(Big->Empty());
}

TEST_F(KilnPictures, ImagesAndPaintBoxesDrawOnTheirCanvas) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* Image = Make<TImage>(Form.P, Form.P, "Image1");
  TObjectGuard<TCanvas> Canvas(new TCanvas);
  Image->Paint(Canvas.Get());
  EXPECT_EQ(Canvas->Text(), "");
  TObjectGuard<TPngImage> G(new TPngImage);
  G->SetSize(10, 6);
  TObjectGuard<TPicture> P(new TPicture);
  P->SetGraphic(G.Get());
  Image->SetPicture(P.Get());
  EXPECT_NE(Image->Picture()->Graphic(), G.Get()); // a copy
  Image->Paint(Canvas.Get());
  EXPECT_EQ(Canvas->Text(), "Draw(0,0,TPngImage)\n");
  G->Draw(Canvas.Get(), Rect(0, 0, 20, 12));
  EXPECT_EQ(Canvas->Lines().back(), "StretchDraw(0,0,20,12,TPngImage)");

  auto* Box = Make<TPaintBox>(Form.P, Form.P, "PaintBox1");
  Box->OnPaint = Counted();
  Box->Repaint();
  Box->Repaint();
  EXPECT_EQ(Counter->Count, 2);
  EXPECT_EQ(Counter->LastSender, Box);
  EXPECT_EQ(Box->Canvas()->Text(), "TextOut(1,2,\"x\")\n"); // each paint starts afresh
}

TEST_F(KilnPictures, PictureDialogsTakeTheirAnswersFromTheScript) {
  TTempFile Png(".png");
  WritePatternPng(Png.Name, 1, 1);
  TObjectGuard<TOpenPictureDialog> Open(CreateComponentOf<TOpenPictureDialog>(nullptr));
  TObjectGuard<TSavePictureDialog> Save(CreateComponentOf<TSavePictureDialog>(nullptr));
  EXPECT_EQ(Open->Filter(), GraphicFilter(TGraphic::StaticClass()));
  EXPECT_EQ(Save->Filter(), GraphicFilter(TGraphic::StaticClass()));
  DialogScript().Clear();
  auto Done = Finally([]() noexcept { DialogScript().Clear(); });

  Open->SetOptions({ofFileMustExist});
  Open->SetTitle("Load Picture");
  DialogScript().Answer(mrOk, {"/tmp/fk_pictures_missing.png"}); // refused: it does not exist
  DialogScript().Answer(mrOk, {Png.Name});
  EXPECT_TRUE(Open->Execute());
  EXPECT_EQ(Open->FileName(), Png.Name);
  ASSERT_EQ(DialogScript().Shown().size(), 2u);
  EXPECT_EQ(DialogScript().Shown()[0].Kind, "OpenPictureDialog");
  EXPECT_EQ(DialogScript().Shown()[0].Caption, "Load Picture");
  DialogScript().Answer(mrCancel);
  EXPECT_FALSE(Open->Execute());
  EXPECT_EQ(Open->FileName(), Png.Name);

  Save->SetOptions({ofFileMustExist}); // counts only for opening
  Save->SetDefaultExt("png");
  DialogScript().Answer(mrOk, {"/tmp/fk_pictures_new"});
  EXPECT_TRUE(Save->Execute());
  EXPECT_EQ(Save->FileName(), "/tmp/fk_pictures_new.png");
  EXPECT_EQ(DialogScript().Shown().back().Kind, "SavePictureDialog");
  EXPECT_THROW((void)Save->Execute(), EInvalidOperation); // nothing scripted
}

} // namespace
