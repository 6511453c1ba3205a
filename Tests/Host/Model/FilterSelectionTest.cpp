#include <gtest/gtest.h>

#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/FilterMultiSelection.h"
#include "Host/Model/ParameterMultiSelection.h"
#include "Tests/Host/Model/EditingTestFixture.h"

namespace {

class FilterSelectionTest : public EditingModelTest {
 protected:
  FilterMultiSelection::Selection selection;
};

std::vector<std::string> MatchNames(const ComponentChainRef& chain) {
  std::vector<std::string> names;
  for (const ComponentRef& component : chain->GetComponents()) {
    names.push_back(component->GetMatchName());
  }
  return names;
}

TEST_F(FilterSelectionTest, EntriesAreUniqueByComponentAndTrackItem) {
  EXPECT_TRUE(selection.Add(blur, a));
  EXPECT_FALSE(selection.Add(blur, a));
  EXPECT_TRUE(selection.Add(crop, a));
  EXPECT_EQ(selection.Find(crop.get(), a.get()), 1);
  EXPECT_FALSE(selection.Contains(blur.get(), b.get()));
  EXPECT_TRUE(selection.Remove(blur.get(), a.get()));
  EXPECT_FALSE(selection.Remove(blur.get(), a.get()));
  EXPECT_EQ(selection.Size(), 1u);
  EXPECT_FALSE(selection.ContainsSubsidiaryItems());
}

TEST_F(FilterSelectionTest, AMaskIsASubsidiaryEntryOfItsEffect) {
  ComponentRef mask = EffectCatalogue::Standard().Create(kMatchName_Mask);
  blur->SetMasks({mask});
  ASSERT_TRUE(selection.Add(mask, a));
  EXPECT_TRUE(selection.ContainsSubsidiaryItems());
  EXPECT_EQ(selection.At(0).parent, blur);
}

TEST_F(FilterSelectionTest, PastedEffectIsACloneWithTheSameValuesAfterTheSelectedOne) {
  ASSERT_EQ(ComponentParamActions::SetValue(blur->FindParam("Blurriness"), 0, 42.0),
            EditStatus::Done);
  ASSERT_EQ(ComponentParamActions::AddKeyframe(blur->FindParam("Blurriness"), 3 * kSec, 7.0),
            EditStatus::Done);
  selection.Add(blur, a);
  ASSERT_TRUE(selection.Copy(*project));
  // Changing the source afterwards does not change what was copied.
  ASSERT_EQ(ComponentParamActions::SetValue(blur->FindParam("Blurriness"), 3 * kSec, 1.0),
            EditStatus::Done);

  FilterMultiSelection::Selection onB;
  const ComponentRef opacity = b->GetComponentChain()->FindByMatchName(kMatchName_Opacity);
  onB.Add(opacity, b);
  const std::vector<ComponentChainRef> targets{b->GetComponentChain(), bAudio->GetComponentChain()};
  const auto& item = *project->GetClipboard().GetItem();
  ASSERT_TRUE(onB.QueryPaste(&item, targets));
  const ComponentChainRef& chain = b->GetComponentChain();
  ComponentRef pasted;
  CheckUndoRoundTrip(
      {.name = kPasteFiltersActionName,
       .edit = [&] { return onB.Paste(item, targets); },
       .checkEdited =
           [&] {
             EXPECT_EQ(MatchNames(chain), (std::vector<std::string>{
                                              kMatchName_Motion, kMatchName_Opacity,
                                              kMatchName_GaussianBlur, kMatchName_TimeRemapping}));
             pasted = chain->GetAt(2);
             EXPECT_NE(pasted, blur);
             EXPECT_EQ(pasted->FindParam("Blurriness")->GetValueAt(3 * kSec), ParamValue(7.0));
             EXPECT_TRUE(pasted->FindParam("Blurriness")->IsTimeVarying());
           }});
  EXPECT_EQ(chain->GetIndexOf(pasted.get()), -1);
}

TEST_F(FilterSelectionTest, PasteWithoutSelectionAppendsAndCanBeRepeated) {
  selection.Add(crop, a);
  ASSERT_TRUE(selection.Copy(*project));
  const auto item = project->GetClipboard().GetItem();
  FilterMultiSelection::Selection none;
  ASSERT_EQ(none.Paste(*item, {c->GetComponentChain()}), EditStatus::Done);
  ASSERT_EQ(none.Paste(*item, {c->GetComponentChain()}), EditStatus::Done);
  const ComponentChainRef& chain = c->GetComponentChain();
  ASSERT_EQ(chain->GetCount(), 5);
  EXPECT_EQ(chain->GetAt(3)->GetMatchName(), kMatchName_Crop);
  EXPECT_EQ(chain->GetAt(4)->GetMatchName(), kMatchName_Crop);
  EXPECT_NE(chain->GetAt(3), chain->GetAt(4));
}

TEST_F(FilterSelectionTest, AnIntrinsicPastesItsValuesIntoTheClipsOwnIntrinsic) {
  const ComponentRef opacityA = a->GetComponentChain()->FindByMatchName(kMatchName_Opacity);
  ASSERT_EQ(ComponentParamActions::SetValue(opacityA->FindParam("Opacity"), 0, 30.0),
            EditStatus::Done);
  selection.Add(opacityA, a);
  ASSERT_TRUE(selection.Copy(*project));
  const int count = b->GetComponentChain()->GetCount();
  ASSERT_EQ(selection.Paste(*project->GetClipboard().GetItem(), {b->GetComponentChain()}),
            EditStatus::Done);
  EXPECT_EQ(b->GetComponentChain()->GetCount(), count);
  const ComponentRef opacityB = b->GetComponentChain()->FindByMatchName(kMatchName_Opacity);
  EXPECT_EQ(opacityB->FindParam("Opacity")->GetConstantValue(), ParamValue(30.0));
}

TEST_F(FilterSelectionTest, NothingIsPastedIntoAReadOnlySequenceOrAChainOfAnotherMediaType) {
  selection.Add(blur, a);
  ASSERT_TRUE(selection.Copy(*project));
  const auto item = project->GetClipboard().GetItem();
  EXPECT_FALSE(selection.QueryPaste(item.get(), {bAudio->GetComponentChain()}));
  EXPECT_EQ(selection.Paste(*item, {bAudio->GetComponentChain()}), EditStatus::NoChange);
  sequence->SetReadOnly(true);
  const std::string before = State();
  EXPECT_FALSE(selection.QueryPaste(item.get(), {b->GetComponentChain()}));
  EXPECT_EQ(selection.Paste(*item, {b->GetComponentChain()}), EditStatus::NoChange);
  EXPECT_EQ(State(), before);
}

TEST_F(FilterSelectionTest, TwoMasksPasteAsOneStepWithTheirUndoText) {
  ComponentRef mask1 = EffectCatalogue::Standard().Create(kMatchName_Mask);
  ComponentRef mask2 = EffectCatalogue::Standard().Create(kMatchName_Mask);
  blur->SetMasks({mask1, mask2});
  ComponentRef target = EffectCatalogue::Standard().Create(kMatchName_GaussianBlur);
  b->GetComponentChain()->Append(target);
  selection.Add(mask1, a);
  selection.Add(mask2, a);
  auto item = selection.CreateClipboardItem();
  ASSERT_TRUE(item->HasMasks());
  EXPECT_TRUE(item->GetEffects().empty());
  CheckUndoRoundTrip({.name = kPasteMasksActionName,
                      .edit =
                          [&] {
                            return FilterMultiSelection::PasteMasks(
                                target, *item, "$$$/Vantile/MZ/PasteMasks=Paste Effect Masks");
                          },
                      .checkEdited =
                          [&] {
                            ASSERT_EQ(target->GetMasks().size(), 2u);
                            EXPECT_EQ(target->GetMasks()[0]->GetMaskOwner(), target.get());
                            EXPECT_NE(target->GetMasks()[0], mask1);
                            EXPECT_EQ(blur->GetMasks().size(), 2u);
                            EXPECT_EQ(project->GetUndoStack().GetUndoNames().back(),
                                      kPasteMasksActionName);
                          }});

  const ComponentRef motion = a->GetComponentChain()->FindByMatchName(kMatchName_Motion);
  EXPECT_EQ(FilterMultiSelection::PasteMasks(motion, *item), EditStatus::InvalidArgument);
}

TEST(ParameterMultiSelection, SelectsEachParameterOnceAndListsItsComponents) {
  ComponentRef blur = EffectCatalogue::Standard().Create(kMatchName_GaussianBlur);
  ParameterMultiSelection::Selection selection;
  EXPECT_TRUE(selection.Add(blur, blur->GetParam(0), nullptr));
  EXPECT_FALSE(selection.Add(blur, blur->GetParam(0), nullptr));
  EXPECT_TRUE(selection.Add(blur, blur->GetParam(1), nullptr));
  EXPECT_FALSE(selection.Add(blur, nullptr, nullptr));
  EXPECT_EQ(selection.GetComponents(), std::vector<ComponentRef>{blur});
  EXPECT_TRUE(selection.Remove(blur->GetParam(0).get()));
  EXPECT_FALSE(selection.Contains(blur->GetParam(0).get()));
  EXPECT_EQ(selection.Size(), 1u);
}

}  // namespace
