//===- tests/platform/SampleComponents.cpp - A hierarchy for the tests ---===//
#include "tests/platform/SampleComponents.h"

namespace formkit::sample {

FK_IMPLEMENT(TSampleService, "SampleUnit") {}

FK_IMPLEMENT(TSampleItem, "SampleUnit") {
  B.Field("Text", &TSampleItem::Text);
  B.Field("Weight", &TSampleItem::Weight).Default(0);
}

void TSampleItem::Assign(TPersistent* Source) {
  auto* Other = dynamic_cast<TSampleItem*>(Source);
  if (!Other) return inherited::Assign(Source);
  Text = Other->Text;
  Weight = Other->Weight;
}

FK_IMPLEMENT(TSampleBase, "SampleUnit") {}

void TSampleBase::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SawDesigning = ComponentState().Contains(csDesigning);
  ++Constructed;
}

FK_IMPLEMENT(TSampleWidget, "SampleUnit") {
  B.Field("Width", &TSampleWidget::FWidth).Default(75).Stored(&TSampleWidget::IsWidthStored);
  B.Field("Small", &TSampleWidget::FSmall);
  B.Field("Percent", &TSampleWidget::FPercent).Type(&TypeInfo_TPercent).Default(50);
  B.Field("Letter", &TSampleWidget::FLetter);
  B.Field("wide", &TSampleWidget::FWide);
  B.Field("Shade", &TSampleWidget::FShade).Default(shLight);
  B.Field("Visible", &TSampleWidget::FVisible).Default(true);
  B.Field("Shades", &TSampleWidget::FShades).Default(TShades{shLight});
  B.Field("Ratio", &TSampleWidget::FRatio);
  B.Property("Caption", &TSampleWidget::Caption, &TSampleWidget::SetCaption).Type(&TypeInfo_TCaption);
  B.Field("Hint", &TSampleWidget::FHint);
  B.Field("Big", &TSampleWidget::FBig);
  B.Field("Buddy", &TSampleWidget::FBuddy);
  B.Property("Items", &TSampleWidget::FItems);
  B.Field("Value", &TSampleWidget::FValue);
  B.Field("Service", &TSampleWidget::FService);
  B.Event("OnPress", &TSampleWidget::FOnPress);
  B.Method<&TSampleWidget::Pressed>("Pressed");
  B.Method<&TSampleWidget::Query>("Query");
}

void TSampleWidget::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FItems = new TOwnedCollection(this, TSampleItem::StaticClass());
}

void TSampleWidget::BeforeDestruction() {
  FreeAndNil(FItems);
  inherited::BeforeDestruction();
}

FK_IMPLEMENT(TFailingWidget, "SampleUnit") {}

void TFailingWidget::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  throw EComponentError("cannot build a failing widget");
}

FK_IMPLEMENT(TListener, "SampleUnit") {}

void TListener::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  Heard.emplace_back(AComponent->Name(), Operation);
  if (Operation == opRemove && AComponent == Watched) Watched = nullptr;
}

void RegisterSampleClasses() {
  RegisterClasses({TSampleWidget::StaticClass(), TFailingWidget::StaticClass(), TListener::StaticClass()});
}

} // namespace formkit::sample
