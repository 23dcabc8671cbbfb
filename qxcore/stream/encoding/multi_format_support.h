// Text encodings as one 32-bit value, and their names.
//
// The value names an encoding and carries the policy by which a reader may look for another one:
//   bits 0-15   code page (kind ANSI; 0 = the active one) or form bits (kind Unicode)
//   bits 16-19  kind
//   bits 20-27  policy and the XML flag
// docs/text-encodings.md explains all of it with examples. Threads: the functions may be called in any thread.
#pragma once

#include "qxcore/container/map.h"
#include "qxcore/platform/export.h"
#include "qxcore/stream/abstract_io.h"
#include "qxcore/string/string.h"

// Its functions are exported one by one: constants of a class that is imported as a whole could not be
// bound to references.
class SAbstractIO::SMultiFormatSupport {
 public:
  using Encoding = std::uint32_t;  // kind, code page or form, and policy

  // Kinds.
  static constexpr Encoding kUndefined = 0;
  static constexpr Encoding kASCII = 0x10000;
  static constexpr Encoding kANSI = 0x20000;  // plus a code page, or 0 for the active one
  static constexpr Encoding kOEM = 0x30000;
  static constexpr Encoding kUnicode = 0x40000;  // plus form bits

  // Form bits of kind Unicode.
  static constexpr Encoding kBigEndian = 0x1;
  static constexpr Encoding kLittleEndian = 0x2;
  static constexpr Encoding kUtf8Form = 0x4;
  static constexpr Encoding kOptionalBOM = 0x8;   // a mark is accepted when reading, written when writing
  static constexpr Encoding kRequiredBOM = 0x10;  // a mark must be there; always together with kOptionalBOM

  // The usual values.
  static constexpr Encoding kUTF16BE = kUnicode | kBigEndian;
  static constexpr Encoding kUTF16LE = kUnicode | kLittleEndian;
  static constexpr Encoding kUTF8 = kUnicode | kUtf8Form;

  // Policy.
  static constexpr Encoding kLossless = 0x100000;     // a character that cannot be mapped throws
  static constexpr Encoding kWholeInOnce = 0x200000;  // the whole input is read before deciding
  static constexpr Encoding kQuickDetect = 0x400000;  // the first 4096 bytes decide
  static constexpr Encoding kDetect = 0x800000;       // the first 16384 bytes decide
  static constexpr Encoding kFullDetect = 0xE00000;   // all bytes decide
  static constexpr Encoding kFavorHint = 0x1000000;   // an acceptable hint wins without a warning
  static constexpr Encoding kXML = 0x2000000;         // the input starts with an XML declaration
  static constexpr Encoding kFavorGuess = 0x4000000;  // detection's guess wins
  // Unicode by the published standards. UTF-8 is judged and read by RFC 3629: sequences of four bytes are
  // surrogate pairs, and overlong forms and surrogates in three bytes are invalid. UTF-16 without a mark is
  // recognised by statistics of the library also where every byte is below 0x80. Without this bit, sequences of four
  // bytes count against UTF-8 and are replaced in reading.
  static constexpr Encoding kFullUnicode = 0x8000000;

  // Masks. kLevelMask holds the detection level: without bit kWholeInOnce, both of the others together
  // are no level at all, and nothing is detected.
  static constexpr Encoding kCodePageMask = 0xFFFF;
  static constexpr Encoding kKindMask = 0xF0000;
  static constexpr Encoding kValueMask = 0xFFFFF;
  static constexpr Encoding kLevelMask = 0xE00000;
  static constexpr Encoding kFlagsMask = 0xFFF00000;
  static constexpr Encoding kFormatMask = 0xFFFE7;  // all but the BOM bits

  // The kind of a value, whatever its policy.
  static constexpr Encoding KindOf(Encoding encoding) { return encoding & kKindMask; }
  static constexpr bool IsUnicode(Encoding encoding) { return KindOf(encoding) == kUnicode; }
  static constexpr bool IsANSI(Encoding encoding) { return KindOf(encoding) == kANSI; }
  // The same format: the BOM bits of Unicode forms and the policy do not count; code pages count whole.
  static constexpr bool IsSameFormat(Encoding a, Encoding b) {
    Encoding mask = IsUnicode(a) && IsUnicode(b) ? kFormatMask : kValueMask;
    return (a & mask) == (b & mask);
  }
  // The code page that bytes of a kind ANSI or OEM value are in; 0 for other kinds.
  QXCORE_API static unsigned int CodePageOf(Encoding encoding);

  // The name of an encoding: the first one of the name table; code pages without a name are "Cp" and the
  // number. With `withPolicy`, the policy follows in suffixes ("+Detect"). With `userFriendly`, the
  // translatable words come from the string table. A code page that is neither the active one nor
  // installed has "* NOT INSTALLED *" behind it. Value 0: "<Undefined>", or nothing with `emptyIfUndefined`.
  QXCORE_API static SString GetEncodingName(Encoding encoding, int withPolicy = 0, int userFriendly = 0,
                                            int emptyIfUndefined = 0);

  // The encoding that a text names. Surrounding blanks are ignored; the longest name of the table that
  // begins the text wins, case does not matter, and suffixes of the policy may follow. "Cp" and a number
  // is any code page (65001 is UTF-8, which is never a code page; 65000 is refused). With `installed`, the
  // numbers and descriptions that the platform has for its installed code pages are names, too. 0 for
  // "<Undefined>", an empty text and what is no name.
  // `matched`, where given, is set to the number of characters that were understood, blanks included;
  // when it is less than the text's length, something follows that means nothing.
  QXCORE_API static Encoding MatchEncodingName(const SString& name, int installed = 0, int* matched = nullptr);

  // Whether text can be converted from and to the encoding on this machine: 1 or 0.
  QXCORE_API static int MachineSupports(Encoding encoding);

  // The name of the application's own character set: that of little-endian UTF-16.
  QXCORE_API static SString GetAppEncodingName();

  // What users read of a policy: the label of its level ("Quick detection", "<No Detection>") and that of its favour
  // ("Use detected encoding", "Use encoding hint and display warning" when it has none).
  QXCORE_API static SString GetLevelLabel(Encoding encoding);
  QXCORE_API static SString GetFavorLabel(Encoding encoding);
  // And those of its other flags that are set, "Abort on loss" and "(XML)", separated by a comma and a blank.
  QXCORE_API static SString GetFlagLabels(Encoding encoding);

  // Replaces the words of a table name that are translatable by their translation.
  QXCORE_API static SString MakeUserFriendly(const SString& name);

  using EncodingMap = SMap<SString, Encoding, SAscStrNoC>;  // names, ordered without regard to case
  // Adds name and value of encodings to a sorted map: the display name of each value, with `aliases` all
  // names; with `installedOnly` only those that the machine supports. Returns how many names were added.
  QXCORE_API static int ListAvailableEncodings(EncodingMap& names, int installedOnly, int aliases);
};
