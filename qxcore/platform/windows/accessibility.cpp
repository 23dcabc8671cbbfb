// An accessible object as the system's IAccessible. The system's library is loaded when the first program asks.

#include "qxcore/platform/internal/accessibility.h"

#include <oleacc.h>

#include <atomic>

namespace platform {
namespace {

// The published identifiers of the interfaces that the object answers to.
constexpr GUID kUnknownId = {0x00000000, 0, 0, {0xC0, 0, 0, 0, 0, 0, 0, 0x46}};
constexpr GUID kDispatchId = {0x00020400, 0, 0, {0xC0, 0, 0, 0, 0, 0, 0, 0x46}};
constexpr GUID kAccessibleId = {0x618736E0, 0x3C3D, 0x11CF, {0x81, 0x0C, 0, 0xAA, 0, 0x38, 0x9B, 0x71}};

struct OleLibrary {
  using ObjectResult = LRESULT(WINAPI*)(REFIID, WPARAM, LPUNKNOWN);
  using ObjectOfWindow = HRESULT(WINAPI*)(HWND, DWORD, REFIID, void**);
  using NewText = BSTR(WINAPI*)(const OLECHAR*, UINT);

  ObjectResult objectResult = nullptr;
  ObjectOfWindow objectOfWindow = nullptr;
  NewText newText = nullptr;

  static const OleLibrary& Get() {
    static const OleLibrary library = Load();
    return library;
  }

 private:
  template <class Function>
  static void Find(HMODULE module, const char* name, Function* function) {
    if (module != nullptr)
      *function = reinterpret_cast<Function>(reinterpret_cast<void*>(GetProcAddress(module, name)));
  }
  static OleLibrary Load() {
    OleLibrary library;
    const HMODULE accessibility = LoadLibraryW(L"oleacc.dll"), automation = LoadLibraryW(L"oleaut32.dll");
    Find(accessibility, "LresultFromObject", &library.objectResult);
    Find(accessibility, "AccessibleObjectFromWindow", &library.objectOfWindow);
    Find(automation, "SysAllocStringLen", &library.newText);
    return library;
  }
};

// The published interface has no virtual destructor, for objects end by Release.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wnon-virtual-dtor"
// It lives as long as somebody holds it, perhaps longer than its window: then every answer is that it is gone.
class Adapter final : public IAccessible {
 public:
  explicit Adapter(std::unique_ptr<AccessibleSource> object) : m_object(std::move(object)) {}
  virtual ~Adapter() = default;

  // --- IUnknown ---

  HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** object) override {
    if (object == nullptr) return E_POINTER;
    *object = nullptr;
    if (!Is(id, kUnknownId) && !Is(id, kDispatchId) && !Is(id, kAccessibleId)) return E_NOINTERFACE;
    *object = static_cast<IAccessible*>(this);
    AddRef();
    return S_OK;
  }
  ULONG STDMETHODCALLTYPE AddRef() override { return ++m_references; }
  ULONG STDMETHODCALLTYPE Release() override {
    const ULONG left = --m_references;
    if (left == 0) delete this;
    return left;
  }

  // --- IDispatch: nobody needs late binding ---

  HRESULT STDMETHODCALLTYPE GetTypeInfoCount(UINT* count) override {
    *count = 0;
    return S_OK;
  }
  HRESULT STDMETHODCALLTYPE GetTypeInfo(UINT, LCID, ITypeInfo**) override { return E_NOTIMPL; }
  HRESULT STDMETHODCALLTYPE GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
  HRESULT STDMETHODCALLTYPE Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS*, VARIANT*, EXCEPINFO*, UINT*) override {
    return E_NOTIMPL;
  }

  // --- the tree ---

  HRESULT STDMETHODCALLTYPE get_accParent(IDispatch** parent) override {
    if (parent == nullptr) return E_POINTER;
    *parent = nullptr;
    if (IsGone()) return CO_E_OBJNOTCONNECTED;
    const auto find = OleLibrary::Get().objectOfWindow;
    if (find == nullptr) return S_FALSE;
    return find(m_object->Window(), static_cast<DWORD>(OBJID_WINDOW), kDispatchId, reinterpret_cast<void**>(parent));
  }
  HRESULT STDMETHODCALLTYPE get_accChildCount(LONG* count) override {
    if (count == nullptr) return E_POINTER;
    *count = 0;
    if (IsGone()) return CO_E_OBJNOTCONNECTED;
    *count = m_object->ChildCount();
    return S_OK;
  }
  HRESULT STDMETHODCALLTYPE get_accChild(VARIANT, IDispatch** child) override {
    if (child == nullptr) return E_POINTER;
    *child = nullptr;
    return S_FALSE;  // the children are parts of this object
  }

  // --- what is said of a child ---

  HRESULT STDMETHODCALLTYPE get_accName(VARIANT child, BSTR* name) override {
    return Text(child, name, &AccessibleSource::Name);
  }
  HRESULT STDMETHODCALLTYPE get_accValue(VARIANT child, BSTR* value) override {
    return Text(child, value, &AccessibleSource::Value);
  }
  HRESULT STDMETHODCALLTYPE get_accDefaultAction(VARIANT child, BSTR* action) override {
    return Text(child, action, &AccessibleSource::DefaultAction);
  }
  HRESULT STDMETHODCALLTYPE get_accDescription(VARIANT, BSTR* text) override { return NoText(text); }
  HRESULT STDMETHODCALLTYPE get_accHelp(VARIANT, BSTR* text) override { return NoText(text); }
  HRESULT STDMETHODCALLTYPE get_accHelpTopic(BSTR* text, VARIANT, LONG*) override { return NoText(text); }
  HRESULT STDMETHODCALLTYPE get_accKeyboardShortcut(VARIANT, BSTR* text) override { return NoText(text); }
  HRESULT STDMETHODCALLTYPE get_accRole(VARIANT child, VARIANT* role) override {
    return Number(child, role, [this](int number) { return static_cast<LONG>(m_object->Role(number)); });
  }
  HRESULT STDMETHODCALLTYPE get_accState(VARIANT child, VARIANT* state) override {
    return Number(child, state, [this](int number) { return static_cast<LONG>(m_object->State(number)); });
  }
  HRESULT STDMETHODCALLTYPE accLocation(LONG* left, LONG* top, LONG* width, LONG* height, VARIANT child) override {
    if (left == nullptr || top == nullptr || width == nullptr || height == nullptr) return E_POINTER;
    *left = *top = *width = *height = 0;
    int number = 0;
    if (const HRESULT result = Child(child, &number); result != S_OK) return result;
    const RECT rect = m_object->Place(number);
    *left = rect.left;
    *top = rect.top;
    *width = rect.right - rect.left;
    *height = rect.bottom - rect.top;
    return S_OK;
  }

  // --- focus, selection, action ---

  HRESULT STDMETHODCALLTYPE get_accFocus(VARIANT* child) override {
    return Found(child, [this] { return m_object->FocusedChild(); });
  }
  HRESULT STDMETHODCALLTYPE accHitTest(LONG x, LONG y, VARIANT* child) override {
    return Found(child, [this, x, y] { return m_object->ChildAt(POINT{x, y}); });
  }
  HRESULT STDMETHODCALLTYPE get_accSelection(VARIANT* child) override {
    return Found(child, [this] {
      for (int number = 1; number <= m_object->ChildCount(); ++number)
        if (m_object->State(number) & STATE_SYSTEM_SELECTED) return number;
      return -1;
    });
  }
  HRESULT STDMETHODCALLTYPE accDoDefaultAction(VARIANT child) override {
    int number = 0;
    if (const HRESULT result = Child(child, &number); result != S_OK) return result;
    try {
      return m_object->DoDefaultAction(number) ? S_OK : DISP_E_MEMBERNOTFOUND;
    } catch (...) {
      return E_FAIL;
    }
  }
  HRESULT STDMETHODCALLTYPE accSelect(LONG, VARIANT) override { return DISP_E_MEMBERNOTFOUND; }
  HRESULT STDMETHODCALLTYPE accNavigate(LONG, VARIANT, VARIANT*) override { return DISP_E_MEMBERNOTFOUND; }
  HRESULT STDMETHODCALLTYPE put_accName(VARIANT, BSTR) override { return DISP_E_MEMBERNOTFOUND; }
  HRESULT STDMETHODCALLTYPE put_accValue(VARIANT, BSTR) override { return DISP_E_MEMBERNOTFOUND; }

 private:
  static bool Is(REFIID id, const GUID& other) { return IsEqualGUID(id, other) != 0; }
  bool IsGone() const { return !IsWindow(m_object->Window()); }

  HRESULT Child(const VARIANT& child, int* number) const {
    if (IsGone()) return CO_E_OBJNOTCONNECTED;
    if (child.vt != VT_I4 || child.lVal < 0 || child.lVal > m_object->ChildCount()) return E_INVALIDARG;
    *number = static_cast<int>(child.lVal);
    return S_OK;
  }
  HRESULT Text(const VARIANT& child, BSTR* text, AccessibleSource::Text (AccessibleSource::*member)(int) const) const {
    if (text == nullptr) return E_POINTER;
    *text = nullptr;
    int number = 0;
    if (const HRESULT result = Child(child, &number); result != S_OK) return result;
    const AccessibleSource::Text content = (m_object.get()->*member)(number);
    if (content.empty() || OleLibrary::Get().newText == nullptr) return S_FALSE;
    *text = OleLibrary::Get().newText(content.data(), static_cast<UINT>(content.size()));
    return *text != nullptr ? S_OK : E_OUTOFMEMORY;
  }
  static HRESULT NoText(BSTR* text) {
    if (text != nullptr) *text = nullptr;
    return S_FALSE;
  }
  template <class Value>
  HRESULT Number(const VARIANT& child, VARIANT* result, Value value) const {
    if (result == nullptr) return E_POINTER;
    result->vt = VT_EMPTY;
    int number = 0;
    if (const HRESULT failure = Child(child, &number); failure != S_OK) return failure;
    result->vt = VT_I4;
    result->lVal = value(number);
    return S_OK;
  }
  template <class Find>
  HRESULT Found(VARIANT* child, Find find) const {
    if (child == nullptr) return E_POINTER;
    child->vt = VT_EMPTY;
    if (IsGone()) return CO_E_OBJNOTCONNECTED;
    const int number = find();
    if (number < 0) return S_FALSE;
    child->vt = VT_I4;
    child->lVal = number;
    return S_OK;
  }

  std::atomic<ULONG> m_references = 1;
  std::unique_ptr<AccessibleSource> m_object;
};
#pragma GCC diagnostic pop

}  // namespace

LRESULT AnswerGetObject(WPARAM wParam, std::unique_ptr<AccessibleSource> object) {
  const auto answer = OleLibrary::Get().objectResult;
  if (answer == nullptr) return 0;
  auto* adapter = new Adapter(std::move(object));
  const LRESULT result = answer(kAccessibleId, wParam, adapter);
  adapter->Release();
  return result;
}

}  // namespace platform
