// The program that finds the interferences in a model: the CAD kernel may crash on a damaged one,
// which must not be in a host's process.
#include <signal.h>
#include <unistd.h>

#include <TopoDS_Shape.hxx>
#include <chrono>
#include <map>

#include "default_platform/ModelShapes.h"
#include "default_platform/ReaderProgram.h"
#include "foundation/Descriptor.h"
#include "foundation/ReadWholeFile.h"
#include "toolkit/detection/DetectionTask.h"

namespace ZORDetection {
namespace {

volatile sig_atomic_t isToStop = 0;

void RequestStop(int) { isToStop = 1; }

/// Reports how many verdicts are done, not too often.
class Progress {
 public:
  bool operator()(std::size_t inDone, std::size_t inAll) {
    const auto now = Clock::now();
    if (inDone == inAll || now - told_ >= std::chrono::milliseconds(50)) {
      ZORDefault::ReportStatus('=' + std::to_string(inDone) + ' ' + std::to_string(inAll));
      told_ = now;
    }
    return isToStop == 0;
  }

 private:
  using Clock = std::chrono::steady_clock;
  Clock::time_point told_;
};

DetectionTask TakeTask() {
  lseek(ZORDefault::ModelReaderProtocol::kTask, 0, SEEK_SET);
  return DecodeTask(ZORFoundation::ReadToEnd(ZORDefault::ModelReaderProtocol::kTask, "task"));
}

/// A record that cannot be written is found again by the run that resumes.
void Keep(const Findings& inFindings) {
  std::size_t written = 0;
  ZORFoundation::WriteAll(ZORDefault::ModelReaderProtocol::kKept, EncodeRecord(inFindings),
                          written);
}

/// The parts that products are instances of: no others are measured.
class ShownParts {
 public:
  ShownParts(const std::vector<TopoDS_Shape>& inShapes, std::vector<Product>& ioProducts) {
    std::map<std::uint32_t, std::uint32_t> places;
    for (Product& product : ioProducts) {
      if (product.part >= inShapes.size()) throw ZORDefault::Refusal{"changed while it was read"};
      const auto [place, isNew] =
          places.try_emplace(product.part, static_cast<std::uint32_t>(parts_.size()));
      if (isNew) {
        parts_.emplace_back().shape = &inShapes[product.part];
        numbers_.push_back(product.part);
      }
      product.part = place->second;
    }
  }

  const std::vector<Part>& Parts() const { return parts_; }

  void Restore(Findings& ioFindings) const {
    for (Unjudged& unjudged : ioFindings.unjudged) {
      unjudged.part = numbers_[unjudged.part];
      if (unjudged.other) unjudged.other = numbers_[*unjudged.other];
    }
  }

 private:
  std::vector<Part> parts_;
  std::vector<std::uint32_t> numbers_;
};

Findings Find(const ZORDefault::ModelRequest& inRequest) {
  DetectionTask task = TakeTask();
  ZORDefault::ReportStatus("reading its shapes");
  std::vector<TopoDS_Shape> shapes;
  std::string reason;
  if (!ZORDefault::ReadModelShapes(inRequest.path, static_cast<int>(inRequest.format), shapes,
                                   reason))
    throw ZORDefault::Refusal{reason};
  std::vector<Product> products;
  for (const TaskProduct& product : task.products) products.push_back(product.product);
  const ShownParts shown(shapes, products);
  task.options.isWanted = [&](std::uint32_t first, std::uint32_t second) {
    const TaskProduct &a = task.products[first], &b = task.products[second];
    return a.unit != b.unit && ((a.isFirst && b.isSecond) || (a.isSecond && b.isFirst));
  };
  Progress progress;
  task.options.progress = std::ref(progress);
  if (task.isKept)
    task.options.keep = [&](Findings inFindings) {
      shown.Restore(inFindings);
      Keep(inFindings);
    };
  ZORDefault::LiftTimeLimit();
  ZORDefault::ReportStatus("finding interferences");
  ZORDefault::ReportStatus("=0 0");
  Findings findings = FindInterferences(shown.Parts(), products, task.options);
  shown.Restore(findings);
  return findings;
}

}  // namespace
}  // namespace ZORDetection

std::string ZORDefault::AnswerTo(const ModelRequest& inRequest, std::string_view) {
  signal(SIGTERM, ZORDetection::RequestStop);
  return ZORDetection::Encode(ZORDetection::Find(inRequest));
}
