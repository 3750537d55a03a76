// Prints what the exact judge says of each near pair of an assembly, beside what the detection finds. Each pair is
// judged in a process of its own: the Boolean operation sometimes crashes, or has no end.
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <BRepBndLib.hxx>
#include <Bnd_Box.hxx>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <map>

#include "toolkit/detection/Assembly.h"
#include "toolkit/detection/ExactJudge.h"
#include "toolkit/detection/ReportFailures.h"

namespace ZORDetection {
namespace {

constexpr rlim_t kMaxSeconds = 120;  // of processor time

/// @return false when it did not come to an end.
bool JudgeInChild(const TopoDS_Shape& inFirst, const TopoDS_Shape& inSecond, double inFarthest,
                  Judgement& outJudgement) {
  int ends[2];
  if (pipe(ends) != 0) return false;
  std::fflush(stdout);
  const pid_t child = fork();
  if (child == 0) {
    const rlimit limit{kMaxSeconds, kMaxSeconds};
    setrlimit(RLIMIT_CPU, &limit);
    try {
      const Judgement judgement = JudgeExactly(inFirst, inSecond, inFarthest);
      if (write(ends[1], &judgement, sizeof judgement) != sizeof judgement) _exit(1);
    } catch (const Standard_Failure&) {
      _exit(1);
    }
    _exit(0);
  }
  close(ends[1]);
  const bool isRead = read(ends[0], &outJudgement, sizeof outJudgement) == sizeof outJudgement;
  close(ends[0]);
  int status = 0;
  waitpid(child, &status, 0);
  return isRead;
}

const char* WordOf(const Judgement& inJudgement, double inClearance) {
  if (!inJudgement.isDone) return "failed";
  if (inJudgement.distance > inClearance) return "none";
  if (inJudgement.distance > 1e-5) return "clearance";
  if (inJudgement.depth > 0.01) return "clash";
  return inJudgement.hasSheets ? "sheet" : "contact";
}

const char* WordOf(const Interference* inFound) {
  constexpr const char* kWords[] = {"clash", "contact", "clearance"};
  return inFound == nullptr ? "none" : kWords[static_cast<std::size_t>(inFound->kind)];
}

int Run(const std::string& inPath, double inClearance) {
  const Assembly assembly(inPath);
  Options options;
  options.clearance = inClearance;
  options.threads = 2;
  const auto start = std::clock();
  const Findings findings = assembly.Find(options);
  std::fprintf(stderr, "%zu products, %zu near pairs, detection %.2f s of processor time\n",
               assembly.products.size(), findings.pairsChecked,
               static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC);
  for (const Unjudged& unjudged : findings.unjudged)
    std::fprintf(stderr, "not judged: part %u %s\n", unjudged.part, unjudged.reason.c_str());
  std::map<std::pair<std::size_t, std::size_t>, const Interference*> found;
  for (const Interference& interference : findings.interferences)
    found[{interference.first, interference.second}] = &interference;
  std::vector<Bnd_Box> boxes(assembly.products.size());
  for (std::size_t i = 0; i < boxes.size(); ++i)
    BRepBndLib::Add(assembly.PlacedShape(i), boxes[i], false);
  std::puts("first,second,judged,distance,volume,depth,sheets,found,value");
  for (std::size_t i = 0; i < boxes.size(); ++i)
    for (std::size_t j = i + 1; j < boxes.size(); ++j) {
      const auto place = found.find({i, j});
      const Interference* const other = place == found.end() ? nullptr : place->second;
      if (boxes[i].IsVoid() || boxes[j].IsVoid()) continue;
      if (boxes[i].Distance(boxes[j]) > inClearance && other == nullptr) continue;
      Judgement judgement;
      judgement.isDone =
          JudgeInChild(assembly.PlacedShape(i), assembly.PlacedShape(j), inClearance, judgement) &&
          judgement.isDone;
      const std::string word = WordOf(judgement, inClearance);
      if (word == "none" && other == nullptr) continue;
      std::printf("%zu,%zu,%s,%.9g,%.6g,%.6g,%d,%s,%.9g\n", i, j, word.c_str(), judgement.distance,
                  judgement.volume, judgement.depth, judgement.hasSheets ? 1 : 0, WordOf(other),
                  other == nullptr ? 0 : other->value);
    }
  return 0;
}

}  // namespace
}  // namespace ZORDetection

int main(int inCount, char** inArguments) {
  if (inCount != 3) {
    std::fprintf(stderr, "usage: %s MODEL CLEARANCE\n", inArguments[0]);
    return 2;
  }
  return ZORDetection::ReportFailures(
      [&] { return ZORDetection::Run(inArguments[1], std::atof(inArguments[2])); });
}
