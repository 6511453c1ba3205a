#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/FunctionListener.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/Station.h"
#include "Host/Rows/EffectItem.h"
#include "Host/Rows/EffectItemList.h"

namespace {

const StationName kListStation = "Test.List";

// A row whose kind and band height the test chooses; it records its Destroy calls.
class TestRow : public EffectItem {
 public:
  TestRow(std::string name, bool folder, int ownHeight = 0,
          std::vector<std::string>* destroyLog = nullptr)
      : EffectItem(nullptr, std::move(name), kListStation),
        mFolder(folder),
        mOwnHeight(ownHeight),
        mDestroyLog(destroyLog) {}

  bool IsFolder() const override { return mFolder; }
  int OwnHeight() const override { return mOwnHeight > 0 ? mOwnHeight : EffectItem::OwnHeight(); }
  void Destroy() override {
    if (mDestroyLog != nullptr && !IsDestroyed()) {
      mDestroyLog->push_back(GetName());
    }
    EffectItem::Destroy();
  }

 private:
  bool mFolder;
  int mOwnHeight;
  std::vector<std::string>* mDestroyLog;
};

std::shared_ptr<TestRow> Folder(std::string name) {
  return std::make_shared<TestRow>(std::move(name), true);
}
std::shared_ptr<TestRow> Param(std::string name, int height = 0) {
  return std::make_shared<TestRow>(std::move(name), false, height);
}

// Names of the shown rows, depth first: "Blur[Radius,Edge]".
std::string Shown(const EffectItemList& list) {
  std::string out;
  list.ForEachRow([&](const EffectItemList::Row& row) {
    if (row->IsShown()) {
      out += (out.empty() ? "" : " ") + row->GetName();
    }
    return true;
  });
  return out;
}

class EffectItemTest : public ::testing::Test {
 protected:
  // Blur (folder) with Radius, Edge (set aside), Group (folder) with Inner.
  void SetUp() override {
    blur = Folder("Blur");
    radius = Param("Radius");
    edge = Param("Edge");
    group = Folder("Group");
    inner = Param("Inner", 40);
    edge->SetAside(true);
    blur->AddItem(radius);
    blur->AddItem(edge);
    blur->AddItem(group);
    group->AddItem(inner);
    blur->SetIsExpanded(true);
    group->SetIsExpanded(true);
    list.AddItem(blur);
    blur->FinishCreateSelf();
    blur->Show();
  }

  MessagingTestScope messaging;
  EffectItemList list;
  std::shared_ptr<TestRow> blur, radius, edge, group, inner;
};

TEST_F(EffectItemTest, ShowingAnOpenRowShowsItsChildrenButNotTheSetAsideOnes) {
  EXPECT_EQ(Shown(list), "Blur Radius Group Inner");
  EXPECT_TRUE(radius->IsCreated());
  EXPECT_TRUE(edge->IsCreated());
}

TEST_F(EffectItemTest, CollapsingHidesEveryDescendantAndExpandingRestoresTheOpenOnes) {
  group->SetIsExpanded(false);
  EXPECT_EQ(Shown(list), "Blur Radius Group");
  blur->SetIsExpanded(false);
  EXPECT_EQ(Shown(list), "Blur");
  blur->SetIsExpanded(true);
  EXPECT_EQ(Shown(list), "Blur Radius Group");  // the group stays closed
  group->SetIsExpanded(true);
  EXPECT_EQ(Shown(list), "Blur Radius Group Inner");
}

TEST_F(EffectItemTest, BringingBackASetAsideRowShowsItOnlyUnderAnOpenShownParent) {
  blur->SetIsExpanded(false);
  edge->SetAside(false);
  EXPECT_FALSE(edge->IsShown());
  blur->SetIsExpanded(true);
  EXPECT_EQ(Shown(list), "Blur Radius Edge Group Inner");
  edge->SetAside(true);
  EXPECT_EQ(Shown(list), "Blur Radius Group Inner");
}

TEST_F(EffectItemTest, ASetAsideRowIsNeverShownEvenWhenAskedDirectly) {
  edge->Show();
  EXPECT_FALSE(edge->IsShown());
}

TEST_F(EffectItemTest, HeightCountsTheOwnBandAndTheOpenChildrenThatAreNotSetAside) {
  // Blur 21 + Radius 20 + Group 21 + Inner 40; Edge (20) is set aside.
  EXPECT_EQ(blur->Height(), 21 + 20 + 21 + 40);
  group->SetIsExpanded(false);
  EXPECT_EQ(blur->Height(), 21 + 20 + 21);
  blur->SetIsExpanded(false);
  EXPECT_EQ(blur->Height(), 21);
  EXPECT_EQ(list.TotalHeight(), 21);
}

TEST_F(EffectItemTest, PositionStacksTheChildrenUnderTheTitleOneDeeper) {
  blur->PositionSelf(100, 0, 400);
  EXPECT_EQ(blur->GetTop(), 100);
  EXPECT_EQ(radius->GetTop(), 121);
  EXPECT_EQ(group->GetTop(), 141);
  EXPECT_EQ(inner->GetTop(), 162);
  EXPECT_EQ(inner->GetDepth(), 2);
  EXPECT_EQ(inner->GetWidth(), 400);
  EXPECT_EQ(blur->GetBottom(), 202);
}

TEST_F(EffectItemTest, ChildrenOfACollapsedRowSitAtItsBottomAndTakeNoHeight) {
  blur->SetIsExpanded(false);
  blur->PositionSelf(0, 0, 300);
  EXPECT_EQ(radius->GetTop(), 21);
  EXPECT_EQ(group->GetTop(), 21);
  EXPECT_EQ(blur->GetBottom(), 21);
}

TEST_F(EffectItemTest, IndentFollowsTheGroupLevel) {
  inner->SetGroupLevel(2);
  EXPECT_EQ(inner->GetGroupLevelIndentInPixels(), 34);
  EXPECT_EQ(inner->GetTitleLeft(), 34 + 37);
  inner->SetGroupLevel(-1);  // refused: a level is never negative
  EXPECT_EQ(inner->GetGroupLevel(), 0);
  EXPECT_FALSE(RecordedDebugAssertions().empty());
}

TEST_F(EffectItemTest, SetAllExpandedOpensAndClosesTheWholeTree) {
  blur->SetAllExpanded(false);
  EXPECT_FALSE(blur->IsExpanded());
  EXPECT_FALSE(group->IsExpanded());
  EXPECT_EQ(Shown(list), "Blur");
  blur->SetAllExpanded(true);
  EXPECT_EQ(Shown(list), "Blur Radius Group Inner");
}

TEST_F(EffectItemTest, ADisclosureChangeIsAnnouncedOnTheRowsStation) {
  int announced = 0;
  FunctionListener listener(
      [&](const Message& m) { announced += m.Is<EffectControlsDisclosureStateChanged>() ? 1 : 0; });
  AddListener(kListStation, listener);
  group->OnDisclosureStateChanged();
  EXPECT_EQ(announced, 1);
}

TEST_F(EffectItemTest, ARowCannotJoinTwoParents) {
  auto other = Folder("Other");
  other->AddItem(inner);
  EXPECT_TRUE(other->GetItems().empty());
  EXPECT_EQ(inner->GetParentItem(), group);
  other->AddItem(nullptr);
  EXPECT_TRUE(other->GetItems().empty());
}

TEST_F(EffectItemTest, AChildAddedLaterIsFinishedAndFollowsItsParent) {
  auto late = Param("Late");
  group->AddItem(late);
  EXPECT_TRUE(late->IsCreated());
  EXPECT_TRUE(late->IsShown());
  auto hidden = Param("Hidden");
  group->SetIsExpanded(false);
  group->AddItem(hidden);
  EXPECT_FALSE(hidden->IsShown());
}

TEST_F(EffectItemTest, KeyframeTimesOfAFolderSkipSetAsideChildren) {
  class KeyedRow : public TestRow {
   public:
    KeyedRow(std::string name, TickTime t) : TestRow(std::move(name), false), mTime(t) {}
    void GetKeyframeTimes(std::set<TickTime>& times, TimeLine) const override {
      times.insert(mTime);
    }

   private:
    TickTime mTime;
  };
  auto folder = Folder("F");
  auto a = std::make_shared<KeyedRow>("A", 10);
  auto b = std::make_shared<KeyedRow>("B", 20);
  b->SetAside(true);
  folder->AddItem(a);
  folder->AddItem(b);
  std::set<TickTime> times;
  folder->GetKeyframeTimes(times, TimeLine::kSequence);
  EXPECT_EQ(times, (std::set<TickTime>{10}));
}

TEST(EffectItemList, ClearDestroysTheRowsLastToFirstAndTheirChildren) {
  MessagingTestScope messaging;
  std::vector<std::string> log;
  EffectItemList list;
  auto first = std::make_shared<TestRow>("First", true, 0, &log);
  auto second = std::make_shared<TestRow>("Second", true, 0, &log);
  auto child = std::make_shared<TestRow>("Child", false, 0, &log);
  first->AddItem(child);
  list.AddItem(first);
  list.AddItem(second);
  list.AddItem(second);  // already there
  EXPECT_EQ(list.Size(), 2u);
  list.Clear();
  EXPECT_TRUE(list.IsEmpty());
  EXPECT_EQ(log, (std::vector<std::string>{"Second", "First", "Child"}));
  EXPECT_TRUE(child->IsDestroyed());
}

TEST(EffectItemList, DestroyingTheListDestroysItsRows) {
  MessagingTestScope messaging;
  auto row = Folder("Row");
  {
    EffectItemList list;
    list.AddItem(row);
  }
  EXPECT_TRUE(row->IsDestroyed());
}

TEST(EffectItemList, FindRowAtReturnsTheDeepestShownRowWhoseBandHoldsThePoint) {
  MessagingTestScope messaging;
  EffectItemList list;
  auto effect = Folder("Effect");
  auto param = Param("Param", 50);
  auto aside = Param("Aside");
  aside->SetAside(true);
  effect->AddItem(aside);
  effect->AddItem(param);
  effect->SetIsExpanded(true);
  list.AddItem(effect);
  effect->Show();
  effect->PositionSelf(10, 0, 200);
  EXPECT_EQ(list.FindRowAt(10), effect);
  EXPECT_EQ(list.FindRowAt(30), effect);
  EXPECT_EQ(list.FindRowAt(31), param);
  EXPECT_EQ(list.FindRowAt(80), param);
  EXPECT_EQ(list.FindRowAt(81), nullptr);
  EXPECT_EQ(list.FindRowAt(9), nullptr);
  effect->SetIsExpanded(false);
  EXPECT_EQ(list.FindRowAt(31), nullptr);
  EXPECT_EQ(list.IndexOf(*effect), 0);
  EXPECT_EQ(list.IndexOf(*param), -1);
}

}  // namespace
