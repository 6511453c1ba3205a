#pragma once

#include <atomic>
#include <boost/intrusive_ptr.hpp>

// Intrusive reference count shared by every host model object, so a model object can be handed
// around as a boost::intrusive_ptr (SequenceRef, ComponentRef, ...) from a raw pointer without
// losing track of its owners. The count is atomic, so references may be copied on any thread; the
// objects themselves are UI-thread only. Not copyable: an object's identity is its address.
class RefCounted {
 public:
  RefCounted(const RefCounted&) = delete;
  RefCounted& operator=(const RefCounted&) = delete;

  int GetRefCount() const { return mRefCount.load(std::memory_order_relaxed); }

  friend void intrusive_ptr_add_ref(const RefCounted* object) {
    object->mRefCount.fetch_add(1, std::memory_order_relaxed);
  }
  friend void intrusive_ptr_release(const RefCounted* object) {
    if (object->mRefCount.fetch_sub(1, std::memory_order_acq_rel) == 1) {
      delete object;
    }
  }

 protected:
  RefCounted() = default;
  virtual ~RefCounted() = default;

 private:
  mutable std::atomic<int> mRefCount{0};
};
