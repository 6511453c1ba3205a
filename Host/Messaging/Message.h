#pragma once

#include <cstdint>
#include <string_view>

using MessageID = std::uint32_t;

// Stable across runs, builds and platforms: 32-bit FNV-1a of the type name's bytes.
constexpr MessageID HashMessageTypeNameToMessageID(std::string_view typeName) {
  MessageID hash = 2166136261u;
  for (const char c : typeName) {
    hash ^= static_cast<std::uint8_t>(c);
    hash *= 16777619u;
  }
  return hash;
}

// Base of every message. Messages are immutable values: a listener reads them during delivery
// and must not keep a reference past its ListenToMessage call (copy what it needs).
class Message {
 public:
  virtual ~Message() = default;

  virtual MessageID GetID() const = 0;
  virtual std::string_view GetTypeName() const = 0;

  // The message as a T, or nullptr when it is not one. The type name is compared as well as the
  // id, so two names that happen to share a hash never lead to a wrong cast.
  template <class T>
  const T* As() const;

  template <class T>
  bool Is() const {
    return As<T>() != nullptr;
  }
};

// Records the name behind a message id the first time the id is computed; two distinct names
// with the same id raise a debug assertion. Thread-safe.
void NoteMessageTypeName(MessageID id, std::string_view typeName);

// Each message class:
//   struct FooMessage : MessageOf<FooMessage> {
//     static constexpr std::string_view kTypeName = "FooMessage";
//     ...payload fields...
//   };
template <class T>
class MessageOf : public Message {
 public:
  // Computed once per class, on first use (thread-safe function-local static).
  static MessageID ID() {
    static const MessageID id = [] {
      const MessageID hashed = HashMessageTypeNameToMessageID(T::kTypeName);
      NoteMessageTypeName(hashed, T::kTypeName);
      return hashed;
    }();
    return id;
  }

  MessageID GetID() const override { return ID(); }
  std::string_view GetTypeName() const override { return T::kTypeName; }
};

template <class T>
const T* Message::As() const {
  if (GetID() != T::ID() || GetTypeName() != T::kTypeName) {
    return nullptr;
  }
  return static_cast<const T*>(this);
}
