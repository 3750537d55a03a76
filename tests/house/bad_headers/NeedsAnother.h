// A header that compiles only after another one: the check must notice it.
#ifndef ZOR_TESTS_HOUSE_NEEDS_ANOTHER_H
#define ZOR_TESTS_HOUSE_NEEDS_ANOTHER_H

struct NeedsAnother {
  std::string text;
};

#endif
