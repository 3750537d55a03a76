// Words of the knowledge library.
#ifndef ZOR_PLATFORM_KNOWLEDGE_ZORCKE_H
#define ZOR_PLATFORM_KNOWLEDGE_ZORCKE_H

struct ZORCke {
  enum Boolean { False = 0, True = 1 };
};

#endif
