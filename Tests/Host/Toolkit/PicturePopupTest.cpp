#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Host/Toolkit/PicturePopup.h"
#include "Tests/Host/Toolkit/ControlTestSupport.h"
#include "Tests/Host/Toolkit/PopupTestSupport.h"

namespace {

// A presets popup as an effect row makes it: one command per preset from 18600 up, handled by
// the row (here the root view).
class PicturePopupTest : public ControlTest {
 protected:
  PicturePopupTest() {
    popup = Add(std::make_shared<PicturePopup>(kBounds, kEffectControlsPresetNormalDecal, 3));
    popup->AddItem("Default", 18600);
    popup->AddItem("Soft", 18601);
    popup->AddItem("Hard", 18602);
    popup->SetSelectedIndex(0);
    root->obeys = {18600, 18601, 18602};
    changes.emplace([this](const Message& message) {
      if (const auto* m = message.As<PopupControlChangedMessage>()) {
        lines.push_back(Format("chose %d cmd %d #%d", m->index, m->command, m->id));
      }
    });
    AddListener(popup->GetStation(), *changes);
    log->Clear();
  }

  static constexpr Rect kBounds{50, 10, 74, 27};
  std::shared_ptr<PicturePopup> popup;
  std::optional<FunctionListener> changes;
  Lines lines;
};

TEST_F(PicturePopupTest, ChoosingAPresetSendsItsCommandToTheOwner) {
  menus->PushAnswer(18602);
  Click(kBounds.Center());
  EXPECT_EQ(Commands(), Lines{"root command 18602"});
  EXPECT_EQ(popup->GetSelectedIndex(), 2);
  EXPECT_EQ(popup->GetSelectedText(), "Hard");
  EXPECT_EQ(lines, Lines{"chose 2 cmd 18602 #3"});
  ASSERT_EQ(menus->GetRequests().size(), 1u);
  EXPECT_EQ(menus->GetRequests()[0].entries.size(), 3u);
}

TEST_F(PicturePopupTest, TheOwnerMaySelectAnotherItemThanTheOneChosen) {
  root->onCommand = [this](RecordingView&, CommandID command) {
    popup->SelectCommand(18600);  // e.g. the preset could not be applied
    return command == 18601;
  };
  menus->PushAnswer(18601);
  Click(kBounds.Center());
  EXPECT_EQ(popup->GetSelectedIndex(), 0);
}

TEST_F(PicturePopupTest, ADisabledPopupIsFadedAndInert) {
  host.Render();
  const Image enabled = host.GetImage().Clone();
  popup->Disable();
  host.Render();
  EXPECT_GT(DifferingPixels(enabled, host.GetImage(), kBounds), 10);
  Click(kBounds.Center());
  EXPECT_TRUE(menus->GetRequests().empty());
  EXPECT_TRUE(Commands().empty());
}

TEST_F(PicturePopupTest, DrawsItsPictureInsideItsBounds) {
  EXPECT_TRUE(PaintsOnlyInside(kBounds));
  SaveForInspection(host.GetImage(), "picturepopup.png");
  const Image withPicture = host.GetImage().Clone();
  popup->SetPicture(nullptr);
  host.Render();
  EXPECT_GT(DifferingPixels(withPicture, host.GetImage(), kBounds), 10) << "the picture was drawn";
  EXPECT_TRUE(PaintsOnlyInside(kBounds)) << "the face without a picture";
  const Image plain = host.GetImage().Clone();
  popup->SetShowsChevron(true);
  host.Render();
  EXPECT_GT(DifferingPixels(plain, host.GetImage(), kBounds), 5) << "the chevron on request";
}

}  // namespace
