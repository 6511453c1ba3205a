#include <gtest/gtest.h>

#include <set>

#include "Host/Model/ComponentParam.h"
#include "Host/Model/ComponentParamActions.h"
#include "Host/Model/EffectCatalogue.h"
#include "ModelTestFixture.h"

namespace {

class EffectCatalogueTest : public ModelTest {};

TEST_F(EffectCatalogueTest, TheTemplatesCoverTheParameterTypesTheListPresents) {
  std::set<ParamType> types;
  for (const std::string& name : Catalogue().GetMatchNames()) {
    for (const ComponentParamRef& param : Catalogue().FindTemplate(name)->GetParams()) {
      types.insert(param->GetType());
    }
  }
  for (ParamType type :
       {ParamType::Slider, ParamType::FloatSlider, ParamType::Angle, ParamType::Checkbox,
        ParamType::Color, ParamType::Point, ParamType::Menu, ParamType::DoubleSlider,
        ParamType::Custom, ParamType::GroupBegin, ParamType::GroupEnd, ParamType::Timecode,
        ParamType::Button, ParamType::TimeRemapping, ParamType::Opaque, ParamType::Text,
        ParamType::Info}) {
    EXPECT_TRUE(types.contains(type)) << static_cast<int>(type);
  }
}

TEST_F(EffectCatalogueTest, EveryTemplateIsWellFormed) {
  for (const std::string& name : Catalogue().GetMatchNames()) {
    const Component* effect = Catalogue().FindTemplate(name);
    ASSERT_NE(effect, nullptr) << name;
    EXPECT_GE(effect->GetPresetCount(), 1u) << name;
    int depth = 0;
    for (const ComponentParamRef& param : effect->GetParams()) {
      EXPECT_EQ(param->GetComponent(), effect) << name;
      EXPECT_TRUE(param->Coerce(param->GetDefaultValue()).has_value())
          << name << " " << param->GetName();
      EXPECT_LE(param->GetMinimum(), param->GetMaximum());
      depth +=
          param->GetType() == ParamType::GroupBegin && param->GetGroupKind() != GroupKind::Counted
              ? 1
              : 0;
      depth -= param->GetType() == ParamType::GroupEnd ? 1 : 0;
      EXPECT_GE(depth, 0) << name;
      if (param->GetType() == ParamType::Menu) {
        EXPECT_FALSE(param->GetMenuEntries().empty()) << name;
      }
    }
    EXPECT_EQ(depth, 0) << name << ": every group is closed";
    for (const ComponentPreset& preset : effect->GetPresets()) {
      for (const auto& [position, value] : preset.values) {
        ASSERT_LT(position, effect->GetParamCount()) << name;
        EXPECT_TRUE(effect->GetParam(position)->Coerce(value).has_value()) << name;
      }
    }
  }
}

TEST_F(EffectCatalogueTest, ACountedGroupListsTheParametersItSpans) {
  const Component* grid = Catalogue().FindTemplate(kMatchName_GridDistortion);
  const ComponentParamRef group = grid->FindParam("Advanced");
  ASSERT_EQ(group->GetGroupKind(), GroupKind::Counted);
  ASSERT_EQ(group->GetValueKindCode(), kValueKindBinary);
  const ParamValue value = group->GetValueAt(0);
  // Wide text, UTF-16 low byte first: "Smoothness;Settings;".
  const auto& bytes = std::get<ParamBlob>(value).bytes;
  ASSERT_EQ(bytes.size() % 2, 0u);
  std::ptrdiff_t spans = 0;
  for (std::size_t i = 0; i < bytes.size(); i += 2) {
    EXPECT_EQ(bytes[i + 1], 0) << "code unit " << i / 2;
    spans += bytes[i] == ';' ? 1 : 0;
  }
  ASSERT_EQ(spans, 2);
  const std::size_t first = grid->GetParamIndex(group.get());  // position + 1
  EXPECT_EQ(grid->GetParam(first)->GetName(), "Smoothness");
  EXPECT_EQ(grid->GetParam(first + static_cast<std::size_t>(spans) - 1)->GetName(), "Settings");
}

TEST_F(EffectCatalogueTest, IntrinsicsComeInChainOrderPerMediaType) {
  auto names = [](const std::vector<ComponentRef>& components) {
    std::vector<std::string> list;
    for (const ComponentRef& c : components) {
      EXPECT_TRUE(c->IsIntrinsic());
      list.push_back(c->GetEffectName());
    }
    return list;
  };
  EXPECT_EQ(names(Catalogue().CreateIntrinsics(MediaType::Video)),
            (std::vector<std::string>{"Motion", "Opacity", "Time Remapping"}));
  EXPECT_EQ(names(Catalogue().CreateIntrinsics(MediaType::Audio)),
            (std::vector<std::string>{"Volume", "Channel Volume", "Panner"}));
  EXPECT_TRUE(Catalogue().CreateIntrinsics(MediaType::Video)[2]->IsTimeRemapping());
}

TEST_F(EffectCatalogueTest, CopiesAreIndependentOfTheTemplateAndOfEachOther) {
  const ComponentRef a = Catalogue().Create(kMatchName_GaussianBlur);
  const ComponentRef b = Catalogue().Create(kMatchName_GaussianBlur);
  ASSERT_NE(a, nullptr);
  EXPECT_NE(a->GetID(), b->GetID());
  EXPECT_NE(a->GetParam(0)->GetID(), b->GetParam(0)->GetID());
  a->GetParam(0)->SetValueAt(0, 5.0);
  EXPECT_EQ(b->GetParam(0)->GetConstantValue(), ParamValue(0.0));
  EXPECT_EQ(Catalogue().FindTemplate(kMatchName_GaussianBlur)->GetParam(0)->GetConstantValue(),
            ParamValue(0.0));
  EXPECT_EQ(Catalogue().Create("XO.KRVN NoSuchEffect"), nullptr);
}

TEST_F(EffectCatalogueTest, UniformScaleDisablesScaleWidthThroughEveryChangeAndUndo) {
  const ComponentRef motion = Intrinsic(kMatchName_Motion);
  const ComponentParamRef width = motion->FindParam("Scale Width");
  EXPECT_FALSE(width->IsEnabled());
  ComponentParamActions::SetValue(motion->FindParam("Uniform Scale"), 0, false);
  EXPECT_TRUE(width->IsEnabled());
  Undo().Undo();
  EXPECT_FALSE(width->IsEnabled());
  Undo().Redo();
  EXPECT_TRUE(width->IsEnabled());
}

TEST_F(EffectCatalogueTest, AClonedComponentKeepsItsMasksAndNames) {
  const ComponentRef opacity = Catalogue().Create(kMatchName_Opacity);
  opacity->SetMasks({Catalogue().Create(kMatchName_Mask)});
  opacity->SetInstanceName("Fade");
  const ComponentRef copy = opacity->Clone();
  ASSERT_EQ(copy->GetMasks().size(), 1u);
  EXPECT_EQ(copy->GetMasks()[0]->GetMaskOwner(), copy.get());
  EXPECT_NE(copy->GetMasks()[0], opacity->GetMasks()[0]);
  EXPECT_EQ(copy->GetDisplayName(), "Fade");
  EXPECT_EQ(copy->GetChain(), nullptr);
}

}  // namespace
