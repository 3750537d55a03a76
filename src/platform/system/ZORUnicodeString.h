// The platform's Unicode string.
#ifndef ZOR_PLATFORM_SYSTEM_ZORUNICODESTRING_H
#define ZOR_PLATFORM_SYSTEM_ZORUNICODESTRING_H

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/system/ZORResult.h"
#include "platform/system/ZORString.h"
#include "platform/system/ZORUnicodeChar.h"

/// Text as UTF-16. Positions and lengths count code units from 0. A value: copied freely.
/// The narrow form is UTF-8 on Linux and the ANSI code page on Windows.
class ZOR_PLATFORM_EXPORT ZORUnicodeString {
 public:
  ZORUnicodeString();
  /// @param inNarrow zero-terminated narrow text; null gives the empty string. Bytes that are not
  ///                 valid text become U+FFFD.
  ZORUnicodeString(const char* inNarrow);
  ZORUnicodeString(const ZORUnicodeString& inOther);
  ZORUnicodeString(ZORUnicodeString&& ioOther) noexcept;
  ZORUnicodeString& operator=(const ZORUnicodeString& inOther);
  ZORUnicodeString& operator=(ZORUnicodeString&& ioOther) noexcept;
  ~ZORUnicodeString();

  // Building
  /// Replaces the text by inCount code units, kept as they are (lone surrogates too). Null with a
  /// count of 0 empties it.
  void BuildFromUTF16(const ZORUC2Bytes* inUnits, std::size_t inCount);
  /// Replaces the text by the number in a printf format for one int ("%d", "%i") or one double
  /// ("%f", "%g", "%le"). The decimal separator is always the point, whatever the process's locale.
  /// @return S_OK, or E_INVALIDARG, the text unchanged, for a format that does not hold exactly one
  ///         conversion of that type.
  HRESULT BuildFromNum(int inNumber, const char* inFormat = "%d");
  HRESULT BuildFromNum(double inNumber, const char* inFormat = "%f");

  // Changing
  ZORUnicodeString& Append(const ZORUnicodeString& inTail);
  ZORUnicodeString& operator+=(const ZORUnicodeString& inTail);
  ZORUnicodeString& operator+=(ZORUnicodeChar inTail);
  /// Puts a text before the code unit at inPosition (0 to length; other positions are brought into
  /// that range).
  ZORUnicodeString& Insert(int inPosition, const ZORUnicodeString& inText);
  /// The text without the given character at its ends.
  /// @param inMode 1: the leading ones; 2: the trailing ones; 4: both; any other strips nothing.
  ZORUnicodeString Strip(int inMode = 4, ZORUnicodeChar inCharacter = ZORUnicodeChar(' ')) const;
  /// Replaces the first occurrence of a text.
  /// @return its position, or -1 when absent (or when inOld is empty); then nothing changes.
  int ReplaceSubString(const ZORUnicodeString& inOld, const ZORUnicodeString& inNew);

  // Asking
  int GetLengthInChar() const;
  /// @param inMode 1 searches forward from inStart, 2 backward.
  /// @return the position of the first occurrence on the way; -1 when absent, when inStart is
  ///         outside the text or when inText is empty.
  int SearchSubString(const ZORUnicodeString& inText, int inStart = 0, int inMode = 1) const;
  /// The part from inStart on, at most inLength code units (a negative number: all the rest); empty
  /// when inStart is outside.
  ZORUnicodeString SubString(int inStart, int inLength = -1) const;
  /// Reads a number in a scanf format for one int ("%d", "%i") or one double ("%le", "%lf", "%lg").
  /// Like scanf, leading white space is passed over and the number ends at the first character that
  /// does not fit. The decimal separator is always the point. An int beyond its range becomes the
  /// nearest int.
  /// @return 1 when a value was converted, else 0 and the target is unchanged.
  int ConvertToNum(int* outNumber, const char* inFormat = "%d") const;
  int ConvertToNum(double* outNumber, const char* inFormat = "%le") const;
  /// The code units, not zero-terminated for the caller; valid until this string changes or ends.
  /// Null when empty.
  const ZORUC2Bytes* ConvertToUCChar() const;
  /// The narrow form, zero-terminated; valid until this string changes or ends. Never null.
  const char* ConvertToChar() const;
  ZORString ConvertToString() const;
  /// Writes the UTF-8 form, without terminating zero; lone surrogates become U+FFFD.
  /// @param outBytes room for at least 3 bytes a code unit.
  /// @param outCount number of bytes written.
  HRESULT ConvertToUTF8(char* outBytes, std::size_t* outCount) const;
  /// Writes the wide form with its terminating zero.
  /// @param outWide room for at least length + 1 wide characters.
  HRESULT ConvertToWChar(wchar_t* outWide) const;

  ZOR_PLATFORM_EXPORT friend bool operator==(const ZORUnicodeString& inA,
                                             const ZORUnicodeString& inB);
  /// Comparison with narrow text, without a conversion when that text is ASCII.
  ZOR_PLATFORM_EXPORT friend bool operator==(const ZORUnicodeString& inA, const char* inB);
  ZOR_PLATFORM_EXPORT friend bool operator!=(const ZORUnicodeString& inA, const char* inB);
  ZOR_PLATFORM_EXPORT friend ZORUnicodeString operator+(const ZORUnicodeString& inA,
                                                        const ZORUnicodeString& inB);
  ZOR_PLATFORM_EXPORT friend ZORUnicodeString operator+(const ZORUnicodeString& inA,
                                                        const char* inB);

#if ZOR_PLATFORM_ADDITIONS
  /// What Strip and SearchSubString call their modes.
  enum StripMode { kStripLeading = 1, kStripTrailing = 2, kStripBoth = 4 };
  enum SearchMode { kSearchForward = 1, kSearchBackward = 2 };

  ZORUnicodeString(const ZORString& inNarrow);
  /// Replaces the text by the bytes of a UTF-8 text; invalid sequences become U+FFFD.
  void BuildFromUTF8(const char* inBytes, std::size_t inCount);
  /// Replaces the text by that of Latin-1 bytes, not of this string.
  void BuildFromLatin1(const char* inBytes, std::size_t inCount);
  /// Appends inCount code units as they are; amortised constant for each unit.
  ZORUnicodeString& AppendUTF16(const ZORUC2Bytes* inUnits, std::size_t inCount);
  /// Makes room for inCount code units in all, so that appending up to there does not move the
  /// text.
  void Reserve(std::size_t inCount);
  ZOR_PLATFORM_EXPORT friend bool operator!=(const ZORUnicodeString& inA,
                                             const ZORUnicodeString& inB);
#endif

 private:
  // Code units, followed by a zero. Names, numbers and words fit into the string itself, so that a
  // host that asks for forty texts at once does not pay for forty allocations. Texts that are given
  // may be parts of this one.
  class Units {
   public:
    Units() = default;
    inline Units(const Units& inOther);
    inline Units(Units&& ioOther) noexcept;
    inline Units& operator=(const Units& inOther);
    inline Units& operator=(Units&& ioOther) noexcept;
    inline ~Units();

    operator std::u16string_view() const { return {data_, size_}; }
    const char16_t* data() const { return data_; }
    std::size_t size() const { return size_; }
    bool empty() const { return size_ == 0; }
    char16_t operator[](std::size_t inPosition) const { return data_[inPosition]; }

    inline void Assign(std::u16string_view inText);
    inline void Append(std::u16string_view inTail);
    void Replace(std::size_t inPosition, std::size_t inCount, std::u16string_view inText);
    void Reserve(std::size_t inCount);
    // Makes room for a text of so many units, to be written there; the former one is lost.
    inline char16_t* Renew(std::size_t inCount);
    // Leaves the first units only.
    inline void Cut(std::size_t inCount);

   private:
    static constexpr std::size_t kInline = 23;

    void Grow(std::size_t inCapacity);
    inline void Release() noexcept;
    inline void TakeFrom(Units& ioOther) noexcept;

    char16_t* data_ = inline_;
    std::size_t size_ = 0;
    std::size_t capacity_ = kInline;
    char16_t inline_[kInline + 1] = {};
  };

  Units units_;
  mutable std::unique_ptr<std::string> narrow_;  // made when the narrow form is first asked for
};

#endif
