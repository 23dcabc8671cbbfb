// Class records, type tests and the list of classes.

#include "qxcore/core/object.h"

#include <cstring>
#include <memory>
#include <vector>

#include "qxcore/core/assert_valid.h"
#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"
#include "qxcore/core/module_state.h"
#include "tests/support/text.h"

namespace {

class SBase : public SObject {
  QXCORE_DECLARE_CREATABLE_CLASS(SBase)
};
class SDerived : public SBase {
  QXCORE_DECLARE_CLASS(SDerived)
};
QXCORE_IMPLEMENT_CREATABLE_CLASS(SBase, SObject, 7)
QXCORE_IMPLEMENT_CLASS(SDerived, SBase, 2)

std::vector<const SClassInfo*> TailOfList(std::size_t count) {
  std::vector<const SClassInfo*> all;
  for (const SClassInfo* info = g_pClassInfo; info != nullptr; info = info->m_next) all.push_back(info);
  return {all.end() - static_cast<std::ptrdiff_t>(std::min(count, all.size())), all.end()};
}

TEST(ClassInfo, TypeTests_CompareRecordsAlongTheChain) {
  SDerived derived;
  const SObject* object = &derived;
  EXPECT_EQ(object->IsA(&SDerived::classSDerived), 1);
  EXPECT_EQ(object->IsA(&SBase::classSBase), 0);
  EXPECT_EQ(object->IsKindOf(&SObject::classSObject), 1);
  EXPECT_EQ(object->IsKindOf(&SBase::classSBase), 1);
  EXPECT_EQ(object->IsDerivedFrom(&SDerived::classSDerived), 0);
  EXPECT_EQ(object->IsDerivedFrom(&SBase::classSBase), 1);
  EXPECT_EQ(object->GetClassInfo(), &SDerived::classSDerived) << "either spelling is the one operation";
  EXPECT_STREQ(object->GetClassInfoW()->m_className, "SDerived");
  EXPECT_EQ(SBase::classSBase.m_schema, 7u);
  EXPECT_EQ(SObject::classSObject.m_objectSize, sizeof(void*));
  EXPECT_EQ(SObject::classSObject.m_base, nullptr);
}

TEST(ClassInfo, NullObject_IsNothing) {
  const SObject* volatile nothing = nullptr;
  const SObject* object = nothing;
  int isKind = object->IsKindOf(&SObject::classSObject);
  EXPECT_EQ(isKind + object->IsA(nullptr) + object->IsDerivedFrom(&SObject::classSObject), 0);
  // The caller's own check behind such a call must survive the optimiser.
  EXPECT_TRUE(object == nullptr);
}

TEST(ClassInfo, Creation_NeedsAFactory) {
  std::unique_ptr<SObject> made(SBase::classSBase.CreateObject());
  ASSERT_NE(made, nullptr);
  EXPECT_EQ(made->IsA(&SBase::classSBase), 1);
  EXPECT_EQ(SDerived::classSDerived.CreateObject(), nullptr);
  SMemFailAt(1);
  EXPECT_THROW(SBase::classSBase.CreateObject(), SEOutOfMemory);
  SMemFailAt(0);
}

TEST(ClassInfo, List_LosesRecordsThatEnd) {
  auto make = [](const char* name) {
    return std::make_unique<SClassInfo>(name, 0, 4, &SObject::classSObject, nullptr);
  };
  auto a = make("A");
  auto b = make("B");
  auto c = make("C");
  EXPECT_EQ(TailOfList(3), (std::vector<const SClassInfo*>{a.get(), b.get(), c.get()}));
  {
    SClassInfo copy = *b;  // not in the list: its end changes nothing
    EXPECT_EQ(copy.m_next, c.get());
  }
  b.reset();
  EXPECT_EQ(TailOfList(2), (std::vector<const SClassInfo*>{a.get(), c.get()}));
  c.reset();
  EXPECT_EQ(TailOfList(1), (std::vector<const SClassInfo*>{a.get()}));
  auto d = make("D");
  EXPECT_EQ(TailOfList(2), (std::vector<const SClassInfo*>{a.get(), d.get()}));
}

TEST(ClassInfo, List_HoldsTheLibraryAndThisProgram) {
  int found = 0;
  for (const SClassInfo* info = g_pClassInfo; info != nullptr; info = info->m_next) {
    for (const char* name : {"SObject", "SInputStream", "SMultiFormatReaderUnicode", "SDerived"}) {
      if (std::strcmp(info->m_className, name) == 0) ++found;
    }
  }
  EXPECT_EQ(found, 4);
}

struct OpenState : SModuleState {
  using SModuleState::SetResInstance;
};

TEST(ModuleState, InitIsDoneOnce) {
  SModuleState state;
  EXPECT_FALSE(state.IsInitialized() || state.GetInstance() != nullptr);
  HINSTANCE first = reinterpret_cast<HINSTANCE>(0x1000);
  HINSTANCE second = reinterpret_cast<HINSTANCE>(0x2000);
  state.Init(first);
  state.Init(second);
  EXPECT_EQ(state.GetInstance(), first);
  EXPECT_EQ(state.GetResInstance(), first);
  EXPECT_EQ(OpenState::SetResInstance(&state, nullptr), nullptr);
  EXPECT_EQ(state.GetResInstance(), first);
  EXPECT_EQ(OpenState::SetResInstance(&state, second), first);
  EXPECT_EQ(state.GetResInstance(), second);
  EXPECT_EQ(state.GetLangResInstance(), nullptr);
}

TEST(Validation, ChecksAreCompiledOut) {
  EXPECT_EQ(SAssertValidObject(static_cast<const SObject*>(nullptr), __FILE__, __LINE__), 1);
  EXPECT_EQ(SString(SDumpText(nullptr)), WTEXT("NULL Pointer"));
}

}  // namespace
