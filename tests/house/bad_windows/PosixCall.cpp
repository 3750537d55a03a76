// A source that compiles on POSIX systems only: the check must notice it.
#include <sys/mman.h>

int PageProtection() { return PROT_READ; }
