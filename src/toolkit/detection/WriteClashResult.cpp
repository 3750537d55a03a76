#include <charconv>
#include <cstdlib>
#include <fstream>

#include "foundation/NativePath.h"
#include "platform/system/ZORTime.h"
#include "toolkit/Error.h"
#include "toolkit/detection/Detect.h"
#include "toolkit/detection/Viewpoints.h"
#include "toolkit/publishing/ReportWriter.h"
#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {
namespace {

std::string Escaped(const std::string& inText) { return Utf8(AttributeValue(FromUtf8(inText))); }

/// The shortest text that reads back as the same number.
std::string NumberText(double inValue) {
  std::array<char, 32> text{};
  const double value = inValue == 0 ? 0 : inValue;  // no minus before zero
  const auto end = std::to_chars(text.data(), text.data() + text.size(), value).ptr;
  return {text.data(), end};
}

const char* NameOfKind(DetectedInterference::Kind inKind) {
  switch (inKind) {
    case DetectedInterference::Kind::kClash:
      return "Clash";
    case DetectedInterference::Kind::kContact:
      return "Contact";
    case DetectedInterference::Kind::kClearance:
      break;
  }
  return "Clearance";
}

class ResultWriter {
 public:
  ResultWriter(const DetectionResult& inResult, std::ostream& ioStream)
      : result_(inResult), out_(ioStream) {}

  void Write(const CalendarDate& inDate) {
    out_ << "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<ClashElement Version=\"1.2\" "
            "ZORDocument=\""
         << Escaped(result_.document) << "\" Responsible=\"\">\n"
         << "  <Date Day=\"" << inDate.day << "\" Month=\"" << inDate.month << "\" Year=\""
         << inDate.year << "\"/>\n";
    WriteSpecification();
    out_ << "  <ClashResult Name=\"" << Escaped(result_.document)
         << ".Result.1\" ComputationCase=\"" << Escaped(result_.computationCase) << "\" NbInterf=\""
         << result_.interferences.size() << "\">\n";
    for (std::size_t i = 0; i < result_.interferences.size(); ++i)
      WriteInterference(result_.interferences[i], i + 1);
    out_ << "  </ClashResult>\n";
    WriteProductsInSpec();
    out_ << "</ClashElement>\n";
  }

 private:
  void WriteSpecification() {
    out_ << "  <ClashSpec Name=\"" << Escaped(result_.document) << "\" Type=\""
         << (result_.clearance > 0 ? "Clearance + Contact + Clash" : "Contact + Clash")
         << "\" Clearance=\"" << NumberText(result_.clearance) << "\" Tolerance=\""
         << NumberText(result_.tolerance) << "\" ContactGap=\"" << NumberText(result_.contactGap)
         << "\" Model=\"" << Escaped(result_.model) << '"';
    if (result_.unjudged.empty()) {
      out_ << "/>\n";
      return;
    }
    out_ << ">\n";
    for (const std::string& line : result_.unjudged)
      out_ << "    <NotChecked Reason=\"" << Escaped(line) << "\"/>\n";
    out_ << "  </ClashSpec>\n";
  }

  void WriteProductsInSpec() {
    out_ << "  <ProductsInSpec>\n    <Specification>\n";
    for (const char* list : {"ProdListe1", "ProdListe2"})
      out_ << "      <" << list << " Alias=\"" << Escaped(result_.document)
           << "\" Alien=\"NO\" ShapeName=\"\" DisplayableID=\"" << Escaped(result_.document)
           << "\" DocumentVersion=\"\"/>\n";
    out_ << "    </Specification>\n  </ProductsInSpec>\n";
  }

  void WriteInterference(const DetectedInterference& inFound, std::size_t inNumber) {
    const char* const kind = NameOfKind(inFound.kind);
    out_ << "    <Interference Name=\"Interference." << inNumber << "\" Value=\""
         << NumberText(inFound.value) << "\" ResultType=\"" << kind << "\" ResultTypeNoNLS=\""
         << kind << "\" DistanceClearance=\"" << NumberText(result_.clearance)
         << "\" Status=\"Not inspected\" RetrieveInf=\"New\"";
    if (inFound.isDuplicate) out_ << " Duplicate=\"YES\"";
    if (inFound.meshPrecision)
      out_ << " MeshPrecision=\"" << NumberText(*inFound.meshPrecision) << '"';
    out_ << ">\n";
    WriteProduct(result_.products[inFound.first]);
    WriteProduct(result_.products[inFound.second]);
    out_ << "      <GeometricAspect IntersectCurveLength=\"" << NumberText(inFound.curveLength)
         << "\" ExtractOrDistValue=\"" << NumberText(inFound.value) << "\">\n";
    for (const auto& point : WrittenPoints(inFound)) WritePoint(point, "        ");
    if (inFound.viewpoint) WriteViewpoint(*inFound.viewpoint);
    out_ << "      </GeometricAspect>\n";
    WriteComment(inFound);
    out_ << "    </Interference>\n";
  }

  void WriteViewpoint(const DetectedViewpoint& inViewpoint) {
    out_ << "        <Viewpoint FocusDistance=\"" << NumberText(inViewpoint.focusDistance)
         << "\" NearPlane=\"" << NumberText(inViewpoint.nearPlane) << "\" FarPlane=\""
         << NumberText(inViewpoint.farPlane) << "\" ProjectionType=\"Conic\">\n";
    WritePoint(inViewpoint.eye, "          ");
    WriteVector("Sight", inViewpoint.sight, "          ");
    out_ << "        </Viewpoint>\n";
  }

  void WriteComment(const DetectedInterference& inFound) {
    std::string comment;
    const auto add = [&comment](const std::string& text) {
      comment += (comment.empty() ? "" : "; ") + text;
    };
    if (inFound.isDuplicate) add("the same geometry at the same place");
    if (inFound.isSheetInSolid) add("a surface that encloses nothing enters a solid");
    if (inFound.meshPrecision) add("mesh precision " + NumberText(*inFound.meshPrecision) + " mm");
    if (!comment.empty()) out_ << "      <Comment Value=\"" << Escaped(comment) << "\"/>\n";
  }

  void WriteProduct(const DetectedProduct& inProduct) {
    const std::string path = Escaped(inProduct.path);
    out_ << "      <Product DescriptionID=\"" << path << "\" Alias=\"" << path
         << "\" Alien=\"NO\" ProcessMode=\"\" ShapeName=\"" << Escaped(inProduct.partName)
         << "\" ShapeSource=\"" << Escaped(result_.model) << "\" Preview=\"\">\n        <Matrix>\n";
    const auto& m = inProduct.rootFromProduct;
    constexpr const char* kAxes[] = {"Rx", "Ry", "Rz"};
    WritePoint({m[9], m[10], m[11]}, "          ");
    for (std::size_t i = 0; i < 3; ++i)
      WriteVector(kAxes[i], {m[3 * i], m[3 * i + 1], m[3 * i + 2]}, "          ");
    out_ << "        </Matrix>\n      </Product>\n";
  }

  void WritePoint(const std::array<double, 3>& inPoint, const char* inIndent) {
    out_ << inIndent << "<Point Ux=\"" << NumberText(inPoint[0]) << "\" Uy=\""
         << NumberText(inPoint[1]) << "\" Uz=\"" << NumberText(inPoint[2]) << "\"/>\n";
  }

  void WriteVector(const char* inName, const std::array<double, 3>& inVector,
                   const char* inIndent) {
    out_ << inIndent << "<Vector CorrespondingData=\"" << inName << "\" Vx=\""
         << NumberText(inVector[0]) << "\" Vy=\"" << NumberText(inVector[1]) << "\" Vz=\""
         << NumberText(inVector[2]) << "\"/>\n";
  }

  const DetectionResult& result_;
  std::ostream& out_;
};

}  // namespace

CalendarDate DateOfWriting() {
  const char* const epoch = std::getenv("SOURCE_DATE_EPOCH");
  const ZORTime time = epoch == nullptr ? ZORTime() : ZORTime(std::strtoll(epoch, nullptr, 10));
  return {time.GetDay(kZORTzUniversal), time.GetMonth(kZORTzUniversal),
          time.GetYear(kZORTzUniversal)};
}

void WriteClashResult(const DetectionResult& inResult, const CalendarDate& inDate,
                      const std::string& inPath) {
  std::ofstream stream(ZORFoundation::NativePath(inPath), std::ios::binary | std::ios::trunc);
  ResultWriter(inResult, stream).Write(inDate);
  stream.close();
  if (!stream) throw Error(inPath, "cannot be written");
}

}  // namespace ZORToolkit
