// The handle map of one class of drawing wrappers: temporary ones hold their handle without owning it.
#pragma once

#include <type_traits>

#include "qxcore/core/handle_map.h"
#include "qxcore/core/object.h"

template <class Wrapper, auto Field>
class TWrapperMap final : public SHandleMap {
 public:
  // One a class, never destroyed: static objects may give their handles up at the very end.
  static TWrapperMap& Instance() {
    static TWrapperMap& map = *new TWrapperMap;
    return map;
  }

 protected:
  SObject* MakeTemporary(void* handle) override {
    auto* wrapper = new Wrapper;
    wrapper->*Field = static_cast<std::remove_reference_t<decltype(wrapper->*Field)>>(handle);
    return wrapper;
  }
  void DestroyTemporary(SObject* object) override {
    auto* wrapper = static_cast<Wrapper*>(object);
    wrapper->*Field = nullptr;
    delete wrapper;
  }
};
