#include <gtest/gtest.h>

#include "Host/Messaging/Diagnostics.h"
#include "Host/Messaging/Message.h"
#include "Host/Messaging/MessagingTestScope.h"
#include "Tests/Host/Messaging/TestMessages.h"

namespace {

struct LookalikeMessage : MessageOf<LookalikeMessage> {
  static constexpr std::string_view kTypeName = "LookalikeMessage";
  int payload = 7;
};

}  // namespace

TEST(MessageID, IsThe32BitFnv1aOfTheTypeName) {
  // Reference values of 32-bit FNV-1a; a change here would break ids stored by other builds.
  EXPECT_EQ(HashMessageTypeNameToMessageID(""), 0x811c9dc5u);
  EXPECT_EQ(HashMessageTypeNameToMessageID("a"), 0xe40c292cu);
  EXPECT_EQ(HashMessageTypeNameToMessageID("foobar"), 0xbf9cf968u);
}

TEST(MessageID, HashesBytesAboveSevenBitsWithoutSignExtension) {
  // "\xff" as an unsigned byte: (0x811c9dc5 ^ 0xff) * 16777619 mod 2^32.
  EXPECT_EQ(HashMessageTypeNameToMessageID("\xff"), (0x811c9dc5u ^ 0xffu) * 16777619u);
}

TEST(MessageID, IsComputedFromTheClassTypeNameAndStable) {
  EXPECT_EQ(PingMessage::ID(), HashMessageTypeNameToMessageID("PingMessage"));
  EXPECT_EQ(PingMessage::ID(), PingMessage::ID());
  EXPECT_NE(PingMessage::ID(), PongMessage::ID());
  static_assert(HashMessageTypeNameToMessageID("PingMessage") != 0);
}

TEST(Message, InstancesReportTheirClassIdAndName) {
  const PingMessage ping(3);
  const Message& message = ping;
  EXPECT_EQ(message.GetID(), PingMessage::ID());
  EXPECT_EQ(message.GetTypeName(), "PingMessage");
}

TEST(Message, AsGivesTheTypedPayloadOnlyForItsOwnType) {
  const PingMessage ping(42);
  const Message& message = ping;
  ASSERT_NE(message.As<PingMessage>(), nullptr);
  EXPECT_EQ(message.As<PingMessage>()->value, 42);
  EXPECT_EQ(message.As<PongMessage>(), nullptr);
  EXPECT_EQ(message.As<LookalikeMessage>(), nullptr);
  EXPECT_TRUE(message.Is<PingMessage>());
  EXPECT_FALSE(message.Is<PongMessage>());
}

namespace {

// A message whose id is forced to collide with PingMessage's, as two names with one hash would.
struct CollidingMessage : Message {
  MessageID GetID() const override { return PingMessage::ID(); }
  std::string_view GetTypeName() const override { return "CollidingMessage"; }
};

}  // namespace

TEST(Message, AsRefusesAMessageWhoseIdCollidesButWhoseNameDiffers) {
  const CollidingMessage colliding;
  EXPECT_EQ(colliding.As<PingMessage>(), nullptr);
}

TEST(Message, ASecondNameForAKnownIdIsReported) {
  MessagingTestScope scope;
  NoteMessageTypeName(PingMessage::ID(), "PingMessage");
  EXPECT_TRUE(RecordedDebugAssertions().empty());
  NoteMessageTypeName(PingMessage::ID(), "SomethingElseMessage");
  ASSERT_EQ(RecordedDebugAssertions().size(), 1u);
  EXPECT_NE(RecordedDebugAssertions()[0].message.find("SomethingElseMessage"), std::string::npos);
}
