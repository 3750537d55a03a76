// Message catalogues: texts in the user's language.
#ifndef ZOR_PLATFORM_SYSTEM_ZORMSGCATALOG_H
#define ZOR_PLATFORM_SYSTEM_ZORMSGCATALOG_H

#include <memory>

#include "ZORPlatformExport.h"
#include "platform/system/ZORMsg.h"
#include "platform/system/ZORUnicodeString.h"

/// The messages of one catalogue in the user's language (see docs/conventions.md for where they are
/// looked for).
class ZOR_PLATFORM_EXPORT ZORMsgCatalog {
 public:
  ZORMsgCatalog();
  ~ZORMsgCatalog();
  ZORMsgCatalog(const ZORMsgCatalog&) = delete;
  ZORMsgCatalog& operator=(const ZORMsgCatalog&) = delete;

  /// @return 1 when the catalogue was found and read, else 0 and this catalogue is empty.
  int LoadMsgCatalog(const char* inName);
  /// @return the message of a key; an empty message when the key is unknown.
  ZORMsg GetCatalogMsg(const char* inKey) const;
  /// Loads a catalogue and builds one of its messages.
  /// @return the built text; inDefault when catalogue or key is missing.
  static ZORUnicodeString BuildMessage(const char* inCatalogue, const char* inKey,
                                       const ZORUnicodeString* inParameters = nullptr,
                                       int inCount = 0,
                                       const ZORUnicodeString& inDefault = ZORUnicodeString());

  struct Messages;

 private:
  std::shared_ptr<const Messages> messages_;
};

#endif
