#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Host/Messaging/UsageLogger.h"

namespace {

int gTrimAssertionLine = 0;

struct TrackItem {
  int id = 0;
};

class Trimmer {
 public:
  // Returns whether it changed anything; a null item is a violated precondition.
  bool Trim(const TrackItem* item) const {
    gTrimAssertionLine = __LINE__ + 1;
    if (!HOST_VERIFY(item != nullptr, "Invalid TrackItem")) {
      return false;
    }
    return true;
  }
};

void CheckTwice(int value) {
  for (int i = 0; i < 2; ++i) {
    HOST_ASSERT(value > 0, "Value must be positive");
  }
}

}  // namespace

class DiagnosticsTest : public ::testing::Test {
 protected:
  MessagingTestScope mScope;
};

TEST_F(DiagnosticsTest, AssertionRecordsMessageConditionFileLineAndFunction) {
  const Trimmer trimmer;
  EXPECT_FALSE(trimmer.Trim(nullptr));
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
  const auto& record = RecordedDebugAssertions()[0];
  EXPECT_EQ(record.message, "Invalid TrackItem");
  EXPECT_EQ(record.condition, "item != nullptr");
  EXPECT_EQ(record.file, __FILE__);
  EXPECT_EQ(record.line, gTrimAssertionLine);
  EXPECT_EQ(record.function, "{anonymous}::Trimmer::Trim");
  EXPECT_EQ(record.count, 1);
}

TEST_F(DiagnosticsTest, HoldingConditionRecordsNothing) {
  const Trimmer trimmer;
  const TrackItem item;
  EXPECT_TRUE(trimmer.Trim(&item));
  CheckTwice(5);
  HOST_ASSERT(true, "never");
  EXPECT_TRUE(RecordedDebugAssertions().empty());
}

TEST_F(DiagnosticsTest, TheSameAssertionIsRecordedAndShownOnce) {
  testing::internal::CaptureStderr();
  CheckTwice(0);
  CheckTwice(-1);
  const std::string shown = testing::internal::GetCapturedStderr();
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
  EXPECT_EQ(RecordedDebugAssertions()[0].count, 4);
  EXPECT_EQ(RecordedDebugAssertions()[0].function, "{anonymous}::CheckTwice");
  // Shown once: the message appears exactly one time on stderr.
  const auto first = shown.find("Value must be positive");
  ASSERT_NE(first, std::string::npos);
  EXPECT_EQ(shown.find("Value must be positive", first + 1), std::string::npos);
}

TEST_F(DiagnosticsTest, DistinctSitesWithOneMessageAreRecordedSeparately) {
  ReportDebugAssertion("Invalid Sequence", "sequence", "A.cpp", 10, "void A::F()");
  ReportDebugAssertion("Invalid Sequence", "sequence", "B.cpp", 20, "void B::G()");
  ReportDebugAssertion("Invalid Sequence", "sequence", "A.cpp", 10, "void A::F()");
  ASSERT_EQ(RecordedDebugAssertions().size(), 2u);
  EXPECT_EQ(RecordedDebugAssertions()[0].function, "A::F");
  EXPECT_EQ(RecordedDebugAssertions()[0].count, 2);
  EXPECT_EQ(RecordedDebugAssertions()[1].function, "B::G");
}

TEST_F(DiagnosticsTest, ClearingLetsAnAssertionBeShownAgain) {
  CheckTwice(0);
  ClearRecordedDebugAssertions();
  EXPECT_TRUE(RecordedDebugAssertions().empty());
  testing::internal::CaptureStderr();
  CheckTwice(0);
  EXPECT_THAT(testing::internal::GetCapturedStderr(), testing::HasSubstr("Value must be positive"));
  EXPECT_EQ(RecordedDebugAssertions().size(), 1u);
}

TEST(QualifiedFunctionName, StripsReturnTypeParametersAndQualifiers) {
  EXPECT_EQ(QualifiedFunctionName("void EffectControlsListView::OnCopy()"),
            "EffectControlsListView::OnCopy");
  EXPECT_EQ(QualifiedFunctionName("bool A::B::Check(int, const std::string&) const"),
            "A::B::Check");
  EXPECT_EQ(QualifiedFunctionName("FilterItem::FilterItem(int)"), "FilterItem::FilterItem");
  EXPECT_EQ(QualifiedFunctionName("void Free()"), "Free");
  EXPECT_EQ(QualifiedFunctionName("std::vector<std::pair<int, int> > Rows::Collect(int)"),
            "Rows::Collect");
  EXPECT_EQ(QualifiedFunctionName("T Box<T>::Get() const [with T = int]"), "Box<T>::Get");
  EXPECT_EQ(QualifiedFunctionName("void (* Table::Lookup(int))(int)"),
            "void (* Table::Lookup(int))(int)");
}

TEST(QualifiedFunctionName, KeepsTextItCannotTakeApart) {
  EXPECT_EQ(QualifiedFunctionName("Panel::Build()::<lambda()>"), "Panel::Build()::<lambda()>");
  EXPECT_EQ(QualifiedFunctionName(""), "");
  EXPECT_EQ(QualifiedFunctionName("main"), "main");
  EXPECT_EQ(QualifiedFunctionName("broken)"), "broken)");
}

TEST(QualifiedFunctionName, HandlesOperators) {
  EXPECT_EQ(QualifiedFunctionName("bool Key::operator<(const Key&) const"), "Key::operator<");
  EXPECT_EQ(QualifiedFunctionName("void Call::operator()(int)"), "Call::operator()");
}

TEST_F(DiagnosticsTest, RequireInterfaceThrowsNamingTheInterface) {
  int value = 4;
  EXPECT_EQ(&RequireInterface(&value, "IValue"), &value);
  try {
    RequireInterface(static_cast<int*>(nullptr), "IPlayer");
    FAIL() << "no exception";
  } catch (const NullInterfaceException& exception) {
    EXPECT_EQ(exception.GetInterfaceName(), "IPlayer");
    EXPECT_THAT(exception.what(), testing::HasSubstr("IPlayer"));
  }
}

TEST_F(DiagnosticsTest, TraceGoesOutOnlyForEnabledCategories) {
  std::vector<std::string> lines;
  SetTraceSink([&](std::string_view category, std::string_view text) {
    lines.push_back(std::string(category) + "|" + std::string(text));
  });
  Trace("Tracker", "off by default");
  EXPECT_FALSE(IsTraceCategoryEnabled("Tracker"));
  SetTraceCategoryEnabled("Tracker", true);
  Trace("Tracker", "tracked 48 frames in 812 ms");
  Trace("Other", "not enabled");
  SetTraceCategoryEnabled("Tracker", false);
  Trace("Tracker", "off again");
  EXPECT_EQ(lines, (std::vector<std::string>{"Tracker|tracked 48 frames in 812 ms"}));
}

TEST_F(DiagnosticsTest, AllCategoriesCanBeOnWithExceptions) {
  std::vector<std::string> lines;
  SetTraceSink([&](std::string_view category, std::string_view) { lines.emplace_back(category); });
  SetTraceCategoryEnabled("*", true);
  SetTraceCategoryEnabled("Noisy", false);
  Trace("Tracker", "");
  Trace("Noisy", "");
  Trace("Layout", "");
  SetTraceCategoryEnabled("*", false);
  Trace("Tracker", "");
  EXPECT_EQ(lines, (std::vector<std::string>{"Tracker", "Layout"}));
}

TEST_F(DiagnosticsTest, CategoryListsAsInTheEnvironment) {
  EnableTraceCategories(" Tracker,Layout ,,");
  EXPECT_TRUE(IsTraceCategoryEnabled("Tracker"));
  EXPECT_TRUE(IsTraceCategoryEnabled("Layout"));
  EXPECT_FALSE(IsTraceCategoryEnabled("Other"));
  EXPECT_FALSE(IsTraceCategoryEnabled(""));
  EnableTraceCategories("*");
  EXPECT_TRUE(IsTraceCategoryEnabled("Other"));
}

TEST_F(DiagnosticsTest, TraceWithoutASinkWritesTheCategoryToStderr) {
  SetTraceCategoryEnabled("Tracker", true);
  testing::internal::CaptureStderr();
  Trace("Tracker", "12 ms");
  EXPECT_EQ(testing::internal::GetCapturedStderr(), "[Tracker] 12 ms\n");
}

TEST_F(DiagnosticsTest, TraceSinkMayTraceAgain) {
  int calls = 0;
  SetTraceCategoryEnabled("A", true);
  SetTraceCategoryEnabled("B", true);
  SetTraceSink([&](std::string_view category, std::string_view) {
    ++calls;
    if (category == "A") {
      Trace("B", "nested");
    }
  });
  Trace("A", "outer");
  EXPECT_EQ(calls, 2);
}

TEST_F(DiagnosticsTest, UsageEventsReachTheSinkWithTheirFieldsInOrder) {
  UsageLogger::Instance().LogEvent("mask_tracker_performance", {{"milliseconds", 812},
                                                                {"frames", 48},
                                                                {"ratio", 0.25},
                                                                {"scale", 0.1f},
                                                                {"direction", "forward"},
                                                                {"done", true}});
  const auto events = mScope.UsageEvents().Events();
  ASSERT_EQ(events.size(), 1u);
  EXPECT_EQ(events[0].name, "mask_tracker_performance");
  using Field = std::pair<std::string, std::string>;
  EXPECT_EQ(events[0].fields, (std::vector<Field>{{"milliseconds", "812"},
                                                  {"frames", "48"},
                                                  {"ratio", "0.25"},
                                                  {"scale", "0.1"},
                                                  {"direction", "forward"},
                                                  {"done", "true"}}));
  EXPECT_EQ(events[0].Get("frames"), "48");
  EXPECT_EQ(events[0].Get("missing"), "");
  EXPECT_EQ(mScope.UsageEvents().Count("mask_tracker_performance"), 1u);
}

TEST_F(DiagnosticsTest, AUsageSinkMayLogAgain) {
  class ForwardingSink : public UsageLogSink {
   public:
    void Record(const UsageEvent& event) override {
      names.push_back(event.name);
      if (event.name == "outer") {
        UsageLogger::Instance().LogEvent("inner");
      }
    }
    std::vector<std::string> names;
  };
  const auto sink = std::make_shared<ForwardingSink>();
  UsageLogger::Instance().SetSink(sink);
  UsageLogger::Instance().LogEvent("outer", {{"n", 1}});
  EXPECT_EQ(sink->names, (std::vector<std::string>{"outer", "inner"}));
}

TEST_F(DiagnosticsTest, UsageEventsWithoutASinkAreDropped) {
  UsageLogger::Instance().SetSink(nullptr);
  UsageLogger::Instance().LogEvent("dropped", {{"a", 1}});
  EXPECT_EQ(mScope.UsageEvents().Count("dropped"), 0u);
}
