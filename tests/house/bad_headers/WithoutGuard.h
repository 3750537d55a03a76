// A header that compiles only once: the check must notice it.
struct WithoutGuard {};
