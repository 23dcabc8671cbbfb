// Every operation that changes a text, beside a plain string: the argument anywhere, also in the text itself; the text
// owned, held a second time, lent out before or static. What others hold must never change.

#include <algorithm>
#include <functional>
#include <vector>

#include "qxcore/platform/wide.h"
#include "qxcore/string/string.h"
#include "qxcore/string/string_buffer.h"
#include "tests/support/text.h"

namespace {

constexpr SStringView kAlphabet = WTEXT("aAbBk,\t \u00E9\u00C9\u212A");

// What an operation is given: the text, its model, and arguments that may lie in the text itself.
struct Case {
  SString& text;
  WideString& model;
  const WCHAR* argument;  // into the text, or elsewhere
  WideString argumentModel;
  int index, count;
  WCHAR character;
  std::size_t Place() const { return static_cast<std::size_t>(std::clamp(index, 0, static_cast<int>(model.size()))); }
  std::size_t End() const {
    return static_cast<std::size_t>(
        std::clamp(index + count, static_cast<int>(Place()), static_cast<int>(model.size())));
  }
};

WideString Folded(WideString text) {
  std::transform(text.begin(), text.end(), text.begin(), platform::ToLowerBmp);
  return text;
}

// Replaces the first or every occurrence; returns how many.
int ReplaceIn(WideString& model, const WideString& wanted, const WideString& put, bool noCase, bool every) {
  int replaced = 0;
  const WideString folded = noCase ? Folded(wanted) : wanted;
  for (std::size_t at = 0; !wanted.empty();) {
    at = (noCase ? Folded(model) : model).find(folded, at);
    if (at == WideString::npos) break;
    model.replace(at, wanted.size(), put);
    at += put.size();
    ++replaced;
    if (!every) break;
  }
  return replaced;
}

void TrimModel(WideString& model, bool left, bool right, const std::function<bool(WCHAR)>& isStripped) {
  if (right) {
    while (!model.empty() && isStripped(model.back())) model.pop_back();
  }
  if (left) model.erase(model.begin(), std::find_if_not(model.begin(), model.end(), isStripped));
}

using Operation = std::function<void(Case&)>;

const Operation kOperations[] = {
    [](Case& c) {
      c.text += c.argument;
      c.model += c.argumentModel;
    },
    [](Case& c) {
      c.text = c.argument;
      c.model = c.argumentModel;
    },
    [](Case& c) {
      c.model.insert(c.Place(), c.argumentModel);
      EXPECT_EQ(c.text.Insert(c.argument, c.index), static_cast<int>(c.model.size()));
    },
    [](Case& c) {
      c.model.insert(c.Place(), 1, c.character);
      c.text.Insert(c.character, c.index);
    },
    [](Case& c) {
      c.model.erase(c.Place(), c.End() - c.Place());
      EXPECT_EQ(c.text.Delete(c.index, c.count), static_cast<int>(c.model.size()));
    },
    [](Case& c) {
      const int expected = ReplaceIn(c.model, c.argumentModel, WTEXT("<>"), c.count % 2 != 0, true);
      EXPECT_EQ(c.count % 2 != 0 ? c.text.ReplaceAllNoCase(c.argument, WTEXT("<>"))
                                 : c.text.ReplaceAll(c.argument, WTEXT("<>")),
                expected);
    },
    [](Case& c) {
      const int expected = ReplaceIn(c.model, c.argumentModel, WTEXT("<>"), c.count % 2 != 0, false);
      EXPECT_EQ(
          c.count % 2 != 0 ? c.text.ReplaceNoCase(c.argument, WTEXT("<>")) : c.text.Replace(c.argument, WTEXT("<>")),
          expected);
    },
    [](Case& c) {
      const bool every = c.count % 2 != 0;
      const int expected = ReplaceIn(c.model, WideString(1, c.character), WTEXT("#"), false, every);
      EXPECT_EQ(every ? c.text.ReplaceAll(c.character, WTEXT('#')) : c.text.Replace(c.character, WTEXT('#')), expected);
    },
    [](Case& c) {  // the nine ways to trim: both ends, left, right; white space, one character, a set
      const int kind = c.count % 3, side = c.index % 3;
      const WideString set = c.argumentModel;
      if (side == 1)
        kind == 0 ? c.text.TrimLeft() : kind == 1 ? c.text.TrimLeft(c.character) : c.text.TrimLeft(c.argument);
      else if (side == 2)
        kind == 0 ? c.text.TrimRight() : kind == 1 ? c.text.TrimRight(c.character) : c.text.TrimRight(c.argument);
      else
        kind == 0 ? c.text.Trim() : kind == 1 ? c.text.Trim(c.character) : c.text.Trim(c.argument);
      TrimModel(c.model, side != 2, side != 1, [&](WCHAR one) {
        if (kind == 0) return one == WTEXT(' ') || one == WTEXT('\t');
        return kind == 1 ? one == c.character : set.find(one) != WideString::npos;
      });
    },
    [](Case& c) {
      const std::size_t at = c.model.find(WTEXT(','));
      SString right;
      EXPECT_EQ(c.text.Split(&c.text, &right, WTEXT(',')) != 0, at != WideString::npos);
      EXPECT_EQ(right, at != WideString::npos ? c.model.substr(at + 1).c_str() : WTEXT(""));
      c.model = c.model.substr(0, at);
    },
    [](Case& c) {
      c.text = c.text.Mid(c.index, c.count);
      c.model = c.model.substr(c.Place(), static_cast<std::size_t>(std::max(c.count, 0)));
    },
    [](Case& c) {
      const std::size_t count = std::min(static_cast<std::size_t>(std::max(c.count, 0)), c.model.size());
      const bool left = c.index % 2 == 0;
      c.text = left ? c.text.Left(c.count) : c.text.Right(c.count);
      c.model = left ? c.model.substr(0, count) : c.model.substr(c.model.size() - count);
    },
    [](Case& c) {
      const bool upper = c.count % 2 != 0;
      const auto map = upper ? platform::ToUpperBmp : platform::ToLowerBmp;
      if (c.count % 3 == 0) {
        upper ? c.text.ToUpper(c.index) : c.text.ToLower(c.index);
        if (c.index >= 0 && c.Place() < c.model.size()) c.model[c.Place()] = map(c.model[c.Place()]);
      } else {
        upper ? c.text.ToUpper() : c.text.ToLower();
        std::transform(c.model.begin(), c.model.end(), c.model.begin(), map);
      }
    },
    [](Case& c) {
      c.text.MakeReverse();
      std::reverse(c.model.begin(), c.model.end());
    },
    [](Case& c) {
      c.text.SetAt(c.index, c.character);
      if (c.index >= 0 && static_cast<std::size_t>(c.index) < c.model.size()) c.model[c.Place()] = c.character;
    },
    [](Case& c) {
      c.text += c.character;
      c.model += c.character;
    },
    [](Case& c) {
      const auto from = WTEXT("ab,"), to = WTEXT("xy");
      const auto hits =
          std::count_if(c.model.begin(), c.model.end(), [](WCHAR one) { return one == 'a' || one == 'b'; });
      EXPECT_EQ(c.text.Translate(from, to), hits);
      for (WCHAR& one : c.model) one = one == WTEXT('a') ? WTEXT('x') : one == WTEXT('b') ? WTEXT('y') : one;
    },
    [](Case& c) {
      const auto accents =
          std::count_if(c.model.begin(), c.model.end(), [](WCHAR one) { return one == 0xE9 || one == 0xC9; });
      for (WCHAR& one : c.model) one = one == 0xE9 ? WTEXT('e') : one == 0xC9 ? WTEXT('E') : one;
      SString plain = c.text;
      plain.ReplaceAll(WCHAR{0x212A}, WTEXT('K'));  // a sign that platforms compose differently
      std::replace(c.model.begin(), c.model.end(), WCHAR{0x212A}, WTEXT('K'));
      EXPECT_EQ(plain.NoAccent(), accents);
      c.text = plain;
    },
    [](Case& c) {  // written through a pointer: all of it, or a part that is measured or cut
      const int room = std::max(c.count, 1);
      WCHAR* buffer = c.index % 3 == 0 ? c.text.LockTchar(room) : c.text.Lock(room);
      std::fill_n(buffer, room, c.character);
      buffer[room] = 0;
      c.text.Unlock(c.index % 2 == 0 ? -1 : room / 2);
      c.model.assign(static_cast<std::size_t>(c.index % 2 == 0 ? room : room / 2), c.character);
    },
    [](Case& c) {
      const int room = std::max(c.count, 1);
      WCHAR* buffer = c.index % 2 == 0 ? c.text.GetBufferSetLength(room) : c.text.GetBufferSetTcharLength(room);
      std::fill_n(buffer, room, c.character);
      c.model.assign(static_cast<std::size_t>(room), c.character);
    },
    [](Case& c) {
      const int room = std::max(c.count, 1);
      WCHAR* buffer = c.index % 2 == 0 ? c.text.LockBuffer(room) : c.text.LockBufferTchar(room);
      std::fill_n(buffer, room, c.character);
      buffer[room] = 0;
      const SString deep = c.text;
      buffer[0] = WTEXT('!');
      c.text.UnlockBuffer();
      EXPECT_EQ(deep, WideString(static_cast<std::size_t>(room), c.character).c_str());
      c.model.assign(static_cast<std::size_t>(room), c.character);
      c.model[0] = WTEXT('!');
    },
    [](Case& c) {
      c.text.Format(WTEXT("%s|%d"), c.argument, c.count);
      c.model = c.argumentModel + WTEXT("|") + SString(static_cast<long>(c.count)).GetSafePointer();
    },
    [](Case& c) {  // temporaries on the left grow in place
      c.text = c.text + c.argument + c.character + "z" + 'y' + c.text;
      c.model = c.model + c.argumentModel + c.character + WTEXT('z') + WTEXT('y') + c.model;
    },
    [](Case& c) {
      c.text = SString::ConcatCopy(c.text.Length(), c.text, static_cast<int>(c.argumentModel.size()), c.argument);
      c.model += c.argumentModel;
    },
    [](Case& c) {
      c.text.AssignCopy(static_cast<int>(c.argumentModel.size()), c.argument);
      c.model = c.argumentModel;
    },
    [](Case& c) {
      c.text.AllocBeforeWrite(std::max(c.count, 1));
      c.text.Done();
      c.model.clear();
    },
};

TEST(StringModel, RandomOperations_AgreeWithPlainString) {
  RandomText random(20261121);
  std::vector<int> done(std::size(kOperations));
  for (int round = 0; round < 60000; ++round) {
    // Lengths on both sides of the size classes; blocks of them are in the pools from earlier rounds, and not empty.
    const WideString before = random.Make(random.Number(4) == 0 ? 300 : 40, kAlphabet);
    WideString model = before;
    SString text(model.c_str());
    const bool isShared = random.Number(2) == 0;
    const SString holder = isShared ? text : SString(WTEXT("another"));
    const bool isOwn = random.Number(3) == 0;
    const int from = random.Number(static_cast<int>(model.size()) + 1);
    const WideString argument = isOwn ? model.substr(static_cast<std::size_t>(from)) : random.Make(3, kAlphabet);
    Case one{text,
             model,
             isOwn ? text.GetPointerAt(from) : argument.c_str(),
             argument,
             random.Number(50) - 5,
             random.Number(60) - 5,
             kAlphabet[static_cast<std::size_t>(random.Number(static_cast<int>(kAlphabet.size())))]};
    const auto which = static_cast<std::size_t>(random.Number(static_cast<int>(std::size(kOperations))));
    ++done[which];
    kOperations[which](one);
    ASSERT_EQ(text.View(), SStringView(model)) << "round " << round << ", operation " << which;
    ASSERT_EQ(text.GetAt(text.Length()), 0) << "operation " << which;
    ASSERT_EQ(holder.View(), isShared ? SStringView(before) : SStringView(WTEXT("another"))) << "operation " << which;
    if (model.empty()) {
      ASSERT_EQ(text.GetSafePointer(), SString::null.GetSafePointer()) << "operation " << which;
    }
  }
  for (int count : done) EXPECT_GT(count, 1000);
  EXPECT_EQ(SString::null.View(), SStringView());
}

// A builder's buffer is handed on: who got it must not see what is appended later.
TEST(StringModel, ABuildersTextsStayAsTheyWereTaken) {
  RandomText random(8);
  for (int round = 0; round < 300; ++round) {
    SStringBuffer buffer(static_cast<unsigned>(random.Number(60) + 1), 5, 3);
    WideString model;
    std::vector<std::pair<SString, WideString>> taken;
    for (int step = 0; step < 60; ++step) {
      const WideString piece = random.Make(20, kAlphabet);
      buffer += piece.c_str();
      model += piece;
      const int way = random.Number(9);
      if (way == 0) taken.emplace_back(SString(buffer), model);
      if (way == 1)
        taken.emplace_back(taken.empty() ? SString() : taken.back().first,
                           taken.empty() ? WideString() : taken.back().second);
      if (way == 2 || way == 3) {
        const SString given = way == 2 ? buffer.Detach() : SString(piece.c_str());
        taken.emplace_back(given, way == 2 ? model : piece);
        model.clear();
        if (way == 3) {  // the builder goes on with a text that another one holds
          buffer = given;
          model = piece;
        }
      }
      ASSERT_EQ(buffer.View(), SStringView(model));
    }
    for (const auto& [text, expected] : taken) ASSERT_EQ(text.View(), SStringView(expected)) << round;
  }
}

}  // namespace
