// qxtool settings: values below the library's own key of the registry.

#include <cstring>
#include <vector>

#include "qxcore/system/hglobal.h"
#include "qxcore/system/settings/registry.h"
#include "tools/common/failure.h"
#include "tools/common/standard_streams.h"
#include "tools/common/utf8.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/json.h"

namespace {

SString PathOf(const SettingsOptions& options) { return SRegistry::GetApplicationPath(FromUtf8(options.path)); }

void Open(SRegistry& key, const SettingsOptions& options, int create = 0) {
  if (key.Init(HKEY_CURRENT_USER, PathOf(options), create) != S_OK)
    throw Failure{create ? "the key cannot be opened for writing" : "there is no such key", kFailed, options.path};
}

std::string HexOf(const void* bytes, unsigned long size) {
  std::string text;
  for (unsigned long i = 0; i < size; ++i) {
    const unsigned byte = static_cast<const unsigned char*>(bytes)[i];
    text += "0123456789abcdef"[byte >> 4];
    text += "0123456789abcdef"[byte & 15];
  }
  return text;
}

const char* TypeName(unsigned long type) {
  switch (type) {
    case REG_SZ:
      return "text";
    case REG_EXPAND_SZ:
      return "expand";
    case REG_BINARY:
      return "binary";
    case REG_DWORD:
      return "number";
    case REG_DWORD_BIG_ENDIAN:
      return "number-big-endian";
    default:
      return "other";
  }
}

struct Value {
  std::string name, text;
  unsigned long type = REG_NONE;
};

std::string BinaryText(const SRegistry& key, const SString& name) {
  void* handle = nullptr;
  unsigned long size = 0;
  key.GetProfile(name, &handle, &size);
  SHGlobal block(handle);
  const std::string text = HexOf(size == 0 ? nullptr : block.Lock(), size);
  block.Free();
  return text;
}

Value Read(const SRegistry& key, const SString& name) {
  Value value{ToUtf8(name), {}, REG_NONE};
  SString text;
  const HRESULT result = key.GetProfile(name, &text, SString(), &value.type);
  if (result == static_cast<HRESULT>(SRegistry::kDefaultUsed))
    throw Failure{"there is no such value", kFailed, value.name};
  // The unnamed value cannot be read when it is empty.
  const bool isEmptyText = name.IsEmpty() && (value.type == REG_SZ || value.type == REG_EXPAND_SZ);
  if (value.type != REG_BINARY && result != S_OK && !isEmptyText)
    throw Failure{"the value is of a kind that cannot be shown", kFailed, value.name};
  value.text = value.type == REG_BINARY ? BinaryText(key, name) : ToUtf8(text);
  return value;
}

std::string JsonOf(const std::string& path, const Value& value) {
  return "{\"path\":" + JsonString(FromUtf8(path)) + ",\"name\":" + JsonString(FromUtf8(value.name)) + ",\"type\":\"" +
         TypeName(value.type) + "\",\"value\":" + JsonString(FromUtf8(value.text)) + "}";
}

// --- list ---

class Listing {
 public:
  explicit Listing(const SettingsOptions& options) : m_options(options) {}

  void List(const SRegistry& key, const std::string& path) {
    SString name, stored;
    unsigned long type = REG_NONE;
    for (long i = 0; Step(key.GetEnumValue(i, &name, &stored, &type)); ++i) {
      Value value{ToUtf8(name), {}, type};
      // Texts as they stand; references are not replaced here.
      if (type == REG_SZ || type == REG_EXPAND_SZ) value.text = ToUtf8(stored);
      if (type == REG_BINARY) value.text = BinaryText(key, name);
      if (type == REG_DWORD || type == REG_DWORD_BIG_ENDIAN) value.text = Read(key, name).text;
      Show(path, value);
    }
    for (long i = 0; Step(key.GetEnumKey(i, &name)); ++i) {
      const std::string below = path.empty() ? ToUtf8(name) : path + "\\" + ToUtf8(name);
      if (m_options.json) m_keys.push_back(JsonString(FromUtf8(below)));
      if (!m_options.json) Print(below + "\\\n");
      if (m_options.recursive) List(SRegistry(key.GetKey(), name, 0), below);
    }
  }
  void Finish() const {
    if (m_options.json)
      Print("{\"version\":1,\"keys\":[" + Joined(m_keys) + "],\"values\":[" + Joined(m_values) + "]}\n");
  }

 private:
  // False at the end of an enumeration.
  static bool Step(long code) {
    if (code == static_cast<long>(ERROR_NO_MORE_ITEMS)) return false;
    if (code != 0) throw Failure{SystemText(static_cast<unsigned long>(code))};
    return true;
  }
  void Show(const std::string& path, const Value& value) {
    if (m_options.json) {
      m_values.push_back(JsonOf(path, value));
      return;
    }
    const std::string shown = value.name.empty() ? "(unnamed)" : value.name;
    Print((path.empty() ? "" : path + "\\") + shown + " (" + TypeName(value.type) + ") " + value.text + "\n");
  }
  static std::string Joined(const std::vector<std::string>& items) {
    std::string text;
    for (const std::string& item : items) text += (text.empty() ? "\n" : ",\n") + item;
    return text;
  }

  const SettingsOptions& m_options;
  std::vector<std::string> m_keys, m_values;
};

// --- set ---

[[noreturn]] void BadValue(const std::string& text) { throw Failure{"VALUE: " + text, kWrongUsage}; }

// Decimal or, with 0x, hexadecimal; all that fits into 32 bits with or without a sign.
long NumberOf(const std::string& text) {
  std::size_t used = 0;
  long long number = 0;
  try {
    number = std::stoll(text, &used, text.find_first_of("xX") == std::string::npos ? 10 : 16);
  } catch (const std::exception&) {
    BadValue("\"" + text + "\" is no number");
  }
  if (used != text.size()) BadValue("\"" + text + "\" is no number");
  if (number < INT32_MIN || number > UINT32_MAX) BadValue("the number does not fit into 32 bits");
  return static_cast<long>(static_cast<std::int32_t>(number));
}

std::string BytesOf(const std::string& digits) {
  std::string bytes;
  if (digits.empty() || digits.size() % 2 != 0 ||
      digits.find_first_not_of("0123456789abcdefABCDEF") != std::string::npos)
    BadValue("bytes are pairs of hexadecimal digits");
  for (std::size_t i = 0; i < digits.size(); i += 2)
    bytes += static_cast<char>(std::stoi(digits.substr(i, 2), nullptr, 16));
  return bytes;
}

HRESULT WriteBytes(SRegistry& key, const SString& name, const std::string& bytes) {
  SHGlobal block;
  block.Alloc(0, static_cast<unsigned long>(bytes.size()));
  std::memcpy(block.Lock(), bytes.data(), bytes.size());
  block.Unlock();
  const HRESULT result = key.WriteProfile(name, block, static_cast<unsigned long>(bytes.size()));
  block.Free();
  return result;
}

}  // namespace

int GetSetting(const SettingsOptions& options) {
  SRegistry key;
  Open(key, options);
  const Value value = Read(key, FromUtf8(options.name));
  Print(options.json ? "{\"version\":1,\"setting\":" + JsonOf(options.path, value) + "}\n" : value.text + "\n");
  return kDone;
}

int SetSetting(const SettingsOptions& options) {
  const SString name = FromUtf8(options.name), text = FromUtf8(options.value);
  const long number = options.type == "number" ? NumberOf(options.value) : 0;
  const std::string bytes = options.type == "binary" ? BytesOf(options.value) : std::string();
  SRegistry key;
  Open(key, options, 1);
  HRESULT result;
  if (options.type == "number") {
    result = key.WriteProfile(name, number, 1);
  } else if (options.type == "binary") {
    result = WriteBytes(key, name, bytes);
  } else if (options.type == "expand") {
    const LSTATUS code =
        RegSetValueExW(key.GetKey(), name, 0, REG_EXPAND_SZ, reinterpret_cast<const BYTE*>(text.GetSafePointer()),
                       static_cast<DWORD>((text.Length() + 1) * 2));
    result = code == 0 ? S_OK : E_FAIL;
  } else {
    result = key.WriteProfile(name, text);
  }
  if (result != S_OK) throw Failure{"the value cannot be written", kFailed, options.path};
  return kDone;
}

int ListSettings(const SettingsOptions& options) {
  SRegistry key;
  Open(key, options);
  Listing listing(options);
  listing.List(key, "");
  listing.Finish();
  return kDone;
}

int DeleteSetting(const SettingsOptions& options) {
  SRegistry key;
  Open(key, options);
  const HRESULT result = options.hasName ? key.DeleteProfile(FromUtf8(options.name), options.recursive)
                                         : key.DeleteKey(SString(), options.recursive);
  if (result != S_OK) throw Failure{"there are keys below it; --recursive deletes them", kFailed, options.path};
  return kDone;
}
