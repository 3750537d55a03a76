#include "platform/system/ZORMsg.h"

namespace {

bool HasSlash(const ZORUnicodeString& inText) {
  const ZORUC2Bytes* const units = inText.ConvertToUCChar();
  for (int i = 0; i < inText.GetLengthInChar(); ++i)
    if (units[i] == u'/') return true;
  return false;
}

}  // namespace

ZORMsg::ZORMsg() = default;

ZORMsg::ZORMsg(const ZORUnicodeString& inText) : text_(inText), isPlain_(!HasSlash(inText)) {}

ZORUnicodeString ZORMsg::BuildMessage(const ZORUnicodeString* inParameters, int inCount) const {
  if (isPlain_) return text_;
  const ZORUC2Bytes* const units = text_.ConvertToUCChar();
  const int length = text_.GetLengthInChar();
  const auto unitAt = [&](int inPosition) {
    return inPosition < length ? units[inPosition] : u'\0';
  };
  ZORUnicodeString message;
  for (int i = 0; i < length; ++i) {
    const ZORUC2Bytes place = unitAt(i + 2);
    if (units[i] == u'/' && unitAt(i + 1) == u'/') {
      message.AppendUTF16(u"/", 1);
      i += 1;
    } else if (units[i] == u'/' && unitAt(i + 1) == u'p' && place >= u'1' && place <= u'9') {
      if (inParameters && place - u'1' < inCount) message += inParameters[place - u'1'];
      i += 2;
    } else {
      message.AppendUTF16(units + i, 1);
    }
  }
  return message;
}
