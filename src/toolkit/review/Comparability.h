// Why something is not comparable; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_COMPARABILITY_H
#define ZOR_TOOLKIT_REVIEW_COMPARABILITY_H

#include "toolkit/review/Diff.h"

namespace ZORToolkit {

/// Says why the new computation did not look for an interference of the old result.
class Comparability {
 public:
  /// All live as long as this.
  Comparability(const ReviewedResult& inOld, const ReviewedResult& inNew,
                const DiffOptions& inOptions, const ResultMatch& inMatch);
  ~Comparability();
  Comparability(const Comparability&) = delete;
  Comparability& operator=(const Comparability&) = delete;

  /// @return empty when it did look for it.
  std::string WhyNot(const ReviewRecord& inOld) const;

 private:
  class Checks;
  std::unique_ptr<const Checks> checks_;
};

}  // namespace ZORToolkit

#endif
