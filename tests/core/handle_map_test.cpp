// The maps from handles to the objects that wrap them.

#include "qxcore/core/handle_map.h"

#include <gtest/gtest.h>

#include <map>
#include <random>
#include <set>

#include "qxcore/core/exception.h"
#include "qxcore/core/object.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/slots.h"

namespace {

class Wrapper : public SObject {
 public:
  explicit Wrapper(void* handle) : m_handle(handle) {}
  void* m_handle;
};

class WrapperMap final : public SHandleMap {
 public:
  ~WrapperMap() { DeleteTempMap(); }
  std::set<Wrapper*> living;

 protected:
  SObject* MakeTemporary(void* handle) override {
    auto* made = new Wrapper(handle);
    living.insert(made);
    return made;
  }
  void DestroyTemporary(SObject* object) override {
    auto* wrapper = static_cast<Wrapper*>(object);
    EXPECT_EQ(living.erase(wrapper), 1u);
    EXPECT_EQ(FromHandleTemporary(wrapper->m_handle) == object, false) << "it is unknown when it goes";
    delete wrapper;
  }
};

void* HandleOf(int number) { return reinterpret_cast<void*>(static_cast<std::uintptr_t>(number)); }

// Derived classes outside the library are called through these two slots.
TEST(HandleMap, VirtualFunctions_AreTheTwoThatMakeAndDestroy) {
  struct Probe final : SHandleMap {
    SObject* MakeTemporary(void*) override { return nullptr; }
    void DestroyTemporary(SObject*) override {}
  };
  EXPECT_EQ(SlotOf(&Probe::MakeTemporary), 0);
  EXPECT_EQ(SlotOf(&Probe::DestroyTemporary), 1);
}

TEST(HandleMap, RandomUse_FindsWhatTwoPlainMapsFind) {
  std::mt19937 random(4);
  WrapperMap map;
  std::map<void*, SObject*> permanent, temporary;
  Wrapper owners[8] = {Wrapper(nullptr), Wrapper(nullptr), Wrapper(nullptr), Wrapper(nullptr),
                       Wrapper(nullptr), Wrapper(nullptr), Wrapper(nullptr), Wrapper(nullptr)};
  const auto find = [](const std::map<void*, SObject*>& peer, void* handle) {
    const auto at = peer.find(handle);
    return at != peer.end() ? at->second : nullptr;
  };
  std::size_t discarded = 0;
  for (int step = 0; step < 20000; ++step) {
    void* const handle = HandleOf(static_cast<int>(random() % 60));
    switch (random() % 6) {
      case 0:
      case 1: {
        SObject* const found = map.FromHandle(handle);
        SObject* const expected =
            find(permanent, handle) != nullptr ? find(permanent, handle) : find(temporary, handle);
        if (handle == nullptr) {
          ASSERT_EQ(found, nullptr);
        } else if (expected != nullptr) {
          ASSERT_EQ(found, expected);
        } else {
          ASSERT_EQ(static_cast<Wrapper*>(found)->m_handle, handle);
          temporary[handle] = found;
        }
        break;
      }
      case 2:
        if (handle == nullptr) break;
        permanent[handle] = &owners[random() % 8];
        map.SetPermanent(handle, permanent[handle]);
        break;
      case 3:
        map.RemovePermanent(handle);
        permanent.erase(handle);
        break;
      case 4:
        map.DiscardTemporary(handle);
        discarded += temporary.erase(handle);
        break;
      default:
        if (random() % 50 != 0) break;
        map.DeleteTempMap();
        temporary.clear();
        discarded = 0;
    }
    ASSERT_EQ(map.FromHandlePermanent(handle), find(permanent, handle));
    ASSERT_EQ(map.FromHandleTemporary(handle), find(temporary, handle));
    ASSERT_EQ(map.GetPermanentCount(), static_cast<int>(permanent.size()));
    ASSERT_EQ(map.GetTemporaryCount(), static_cast<int>(temporary.size()));
    ASSERT_EQ(map.living.size(), temporary.size() + discarded) << "discarded ones live until the others go";
  }
}

TEST(HandleMap, WithoutMemory_NothingIsHalfDone) {
  WrapperMap map;
  Wrapper owner(nullptr);
  WithEachAllocationFailing(
      [&] {
        map.FromHandle(HandleOf(1));
        map.SetPermanent(HandleOf(2), &owner);
        map.DiscardTemporary(HandleOf(1));
        map.RemovePermanent(HandleOf(2));
        map.DeleteTempMap();
      },
      [&] {
        EXPECT_EQ(map.FromHandleTemporary(HandleOf(1)) != nullptr, map.GetTemporaryCount() == 1);
        map.RemovePermanent(HandleOf(2));
        map.DeleteTempMap();
        EXPECT_TRUE(map.living.empty());
      });
}

}  // namespace
