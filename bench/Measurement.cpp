#include "Measurement.h"

#include <fstream>
#include <map>

double PeakMegabytes() {
  std::ifstream status("/proc/self/status");
  std::string word;
  while (status >> word)
    if (word == "VmHWM:") break;
  double kilobytes = 0;
  status >> kilobytes;
  return kilobytes / 1024;
}

Measurement FindMeasurement(const std::string& inName) {
  static const std::map<std::string, Measurement> kMeasurements = {
      {"load-zorlyra", LoadWithZORLyra},      {"load-xerces", LoadWithXerces},
      {"load-former", LoadAsFormerly},        {"load-libxml2", LoadWithLibxml2},
      {"load-pugixml", LoadWithPugixml},      {"scan-xerces", ScanWithXerces},
      {"whole-zorlyra", WholeWithZORLyra},    {"list-lyra", ListWithLyra},
      {"loop-zorlyra", LoopWithZORLyra},      {"loop-pugixml", LoopWithPugixml},
      {"loop-libxml2", LoadAloneWithLibxml2}, {"merge-zorlyra", MergeWithZORLyra},
      {"merge-xerces", MergeWithXerces},      {"report-zorlyra", ReportWithZORLyra},
      {"report-plain", ReportWithPlainText},  {"dump-zorlyra", DumpWithZORLyra},
      {"dump-xerces", DumpWithXerces},        {"escape-zorlyra", EscapeWithZORLyra},
      {"escape-append", EscapeByCharacter},   {"escape-push-back", EscapeByPushBack},
      {"diff-zorlyra", DiffWithZORLyra},      {"carry-zorlyra", CarryWithZORLyra},
      {"group-zorlyra", GroupWithZORLyra},    {"gate-zorlyra", GateWithZORLyra}};
  const auto found = kMeasurements.find(inName);
  return found == kMeasurements.end() ? nullptr : found->second;
}
