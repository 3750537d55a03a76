// Everything about one "Interference" element.
#include <string_view>
#include <utility>

#include "ZORClashParsing.h"
#include "ZORLyraGeneralServices.h"
#include "clash_reading/ClashElements.h"
#include "clash_reading/NamedConstants.h"
#include "platform/system/ZORMsgCatalog.h"
#include "platform/system/ZORToken.h"

namespace {

constexpr std::u16string_view kPathSeparator = u" --++-- ";
constexpr const char* kManagedByPdm = "KORVAPDM";

/// Translates words in the writer's language to fixed ones by the message catalogue, which is
/// loaded on construction. If it cannot be loaded, all of its texts are empty.
class InterferenceWords {
 public:
  InterferenceWords() : isLoaded_(catalogue_.LoadMsgCatalog("ZORLyraITFClashDialog3") == 1) {}

  /// "ResultTypeNoNLS" as it stands where present; else "ResultType" as "Clash", "Contact",
  /// "Clearance" or "error".
  ZORUnicodeString ResultType(const DOM_Node& inInterference) const {
    const DOM_Node neutral = inInterference.getAttributes().getNamedItem("ResultTypeNoNLS");
    if (!neutral.isNull()) return ZORLyraGeneralServices::GetDOMName(neutral.getNodeValue());
    const ZORUnicodeString word =
        Stripped(ZORLyraGeneralServices::GetAttrOnNode(inInterference, "ResultType"));
    for (const auto& [type, allLanguages] :
         {std::pair("Clash", "ClashAllLanguages"), std::pair("Contact", "ContactAllLanguages"),
          std::pair("Clearance", "ClearanceAllLanguages")}) {
      if (Word(allLanguages).SearchSubString(word, 0, adapter::kSearchForward) >= 0 ||
          word == Word(type))
        return type;
    }
    return "error";
  }
  /// "Relevant", "Irrelevant", "Not inspected" or "error".
  ZORUnicodeString Status(const ZORUnicodeString& inText) const {
    const ZORUnicodeString word = Stripped(inText);
    if (word == Word("Relevant")) return "Relevant";
    if (word == Word("Irrelevant")) return "Irrelevant";
    if (word == Word("NotInspected")) return "Not inspected";
    return "error";
  }
  /// "Old", "New" or the text without surrounding spaces.
  ZORUnicodeString Retrieve(const ZORUnicodeString& inText) const {
    const ZORUnicodeString word = Stripped(inText);
    if (word == Word("Old")) return "Old";
    if (word == Word("New")) return "New";
    return word;
  }

 private:
  static ZORUnicodeString Stripped(const ZORUnicodeString& inText) {
    return inText.Strip(adapter::kStripBothEnds, ZORUnicodeChar(' '));
  }
  /// The catalogue's word for a key, in the current language.
  ZORUnicodeString Word(const char* inKey) const {
    if (!isLoaded_) return ZORUnicodeString();
    return Stripped(catalogue_.GetCatalogMsg(inKey).BuildMessage());
  }

  ZORMsgCatalog catalogue_;
  bool isLoaded_;
};

void AppendPoint(const DOM_Node& inPoint, ZORUnicodeString& ioPoints) {
  const ElementAttributes attributes(inPoint);
  ZORUnicodeString coordinate;
  bool isFirst = ioPoints.GetLengthInChar() == 0;
  for (const char* const name : {"Ux", "Uy", "Uz"}) {
    if (!std::exchange(isFirst, false)) adapter::AppendUnits(ioPoints, u"/");
    attributes.ReadNumber(name, coordinate);
    ioPoints += coordinate;
  }
}

// The last segment of a path; empty if a segment is empty or holds a line feed, where the result
// depends on the platform's tokenizer.
std::u16string_view LastPlainSegment(std::u16string_view inPath) {
  std::size_t begin = 0;
  for (std::size_t at = 0; at < inPath.size();) {
    if (inPath[at] == u'\n') return {};
    if (inPath[at] != kPathSeparator[0] ||
        inPath.substr(at, kPathSeparator.size()) != kPathSeparator) {
      ++at;
      continue;
    }
    if (at == begin) return {};
    at += kPathSeparator.size();
    begin = at;
  }
  return inPath.substr(begin);
}

// Every separator replaced by a line feed, in one pass: a text may hold many.
ZORUnicodeString SegmentsAsLines(std::u16string_view inPath) {
  ZORUnicodeString lines;
  for (std::size_t end = 0; (end = inPath.find(kPathSeparator)) != std::u16string_view::npos;) {
    adapter::AppendUnits(lines, inPath.substr(0, end));
    lines.Append("\n");
    inPath.remove_prefix(end + kPathSeparator.size());
  }
  adapter::AppendUnits(lines, inPath);
  return lines;
}

ZORUnicodeString InstanceName(const ZORUnicodeString& inDescriptionId) {
  ZORUnicodeString last;
  const std::u16string_view path = adapter::UnitsOf(inDescriptionId);
  if (const std::u16string_view plain = LastPlainSegment(path); !plain.empty()) {
    last.BuildFromUTF16(plain.data(), plain.size());
    return last;
  }
  ZORToken segments(SegmentsAsLines(path));
  for (ZORUnicodeString segment = segments.GetNextToken("\n"); segment.GetLengthInChar() != 0;
       segment = segments.GetNextToken("\n"))
    last = segment;
  return last;
}

}  // namespace

void ZORClashParsing::GetInterferenceDataV12(
    DOM_Node inInterference, ZORUnicodeString& outResultType, ZORUnicodeString& outClearance,
    ZORUnicodeString& outStatus, ZORUnicodeString& outComputationType,
    ZORUnicodeString& outRetrieve, ZORUnicodeString& outRuleName,
    ZORUnicodeString& outRuleClearance, ZORUnicodeString& outFirstDescriptionId,
    ZORUnicodeString& outSecondDescriptionId, ZORUnicodeString& outFirstProcessMode,
    ZORUnicodeString& outSecondProcessMode, ZORUnicodeString& outComment,
    ZORUnicodeString& ioFirstAlien, ZORUnicodeString& outSecondAlien,
    ZORUnicodeString& outFirstDescriptionIdAgain, ZORUnicodeString& outSecondDescriptionIdAgain,
    ZORUnicodeString& outFirstInstance, ZORUnicodeString& outSecondInstance,
    ZORUnicodeString& outFirstShapeName, ZORUnicodeString& outSecondShapeName,
    ZORUnicodeString& outFirstShapeSource, ZORUnicodeString& outSecondShapeSource,
    ZORUnicodeString& outSeverity, ZORUnicodeString& outPenetrationCandidate,
    ZORUnicodeString& outCurveLength, ZORUnicodeString& outDistance, ZORUnicodeString& outReserved,
    ZORUnicodeString& outPoints, ZORUnicodeString& outFocusDistance, ZORUnicodeString& outNearPlane,
    ZORUnicodeString& outFarPlane, ZORUnicodeString& outProjection, ZORUnicodeString& outViewpointX,
    ZORUnicodeString& outViewpointY, ZORUnicodeString& outViewpointZ, ZORUnicodeString& outSightX,
    ZORUnicodeString& outSightY, ZORUnicodeString& outSightZ, ZORUnicodeString&, ZORUnicodeString&,
    ZORUnicodeString&) {
  const InterferenceWords words;
  const ElementAttributes interference(inInterference);
  outResultType = words.ResultType(inInterference);
  interference.ReadNumber("DistanceClearance", outClearance);
  outStatus = words.Status(interference.Text("Status"));
  outRetrieve = words.Retrieve(interference.Text("RetrieveInf"));
  outPoints = ZORUnicodeString();
  outProjection = "NOVIEWPOINT";

  const auto readRule = [&](const DOM_Node& inRule) {
    const ElementAttributes rule(inRule);
    rule.ReadText(names::Name, outRuleName);
    rule.ReadNumber("Clearance", outRuleClearance);
    rule.ReadText("TypeCalc", outComputationType);
    rule.ReadText("Severity", outSeverity);
    rule.ReadText("PenetrationCandidate", outPenetrationCandidate);
  };
  // A filled Alien flag means that the first product has been read. Hosts may pass one string for
  // two outputs, so everything is read before the outputs are filled, in this order.
  const auto readProduct = [&](const DOM_Node& inProduct) {
    const ElementAttributes product(inProduct);
    const bool first = ioFirstAlien.GetLengthInChar() == 0;
    ZORUnicodeString identifier = product.Text("DescriptionID");
    ZORUnicodeString alien = product.Text(names::Alien);
    if (alien.GetLengthInChar() == 0) alien = "YES";
    ZORUnicodeString processMode = product.Text("ProcessMode");
    ZORUnicodeString shapeName = product.Text(names::ShapeName);
    ZORUnicodeString shapeSource = product.Text("ShapeSource");
    ZORUnicodeString instance =
        processMode == kManagedByPdm ? product.Text(names::Alias) : InstanceName(identifier);
    (first ? outFirstDescriptionId : outSecondDescriptionId) = identifier;
    (first ? ioFirstAlien : outSecondAlien) = std::move(alien);
    (first ? outFirstShapeSource : outSecondShapeSource) = std::move(shapeSource);
    (first ? outFirstDescriptionIdAgain : outSecondDescriptionIdAgain) = std::move(identifier);
    (first ? outFirstInstance : outSecondInstance) = std::move(instance);
    (first ? outFirstProcessMode : outSecondProcessMode) = std::move(processMode);
    (first ? outFirstShapeName : outSecondShapeName) = std::move(shapeName);
  };
  const auto readViewpoint = [&](const DOM_Node& inViewpoint) {
    const ElementAttributes viewpoint(inViewpoint);
    viewpoint.ReadText("FocusDistance", outFocusDistance);  // its comma stays
    viewpoint.ReadNumber("NearPlane", outNearPlane);
    viewpoint.ReadNumber("FarPlane", outFarPlane);
    viewpoint.ReadNumber("ProjectionType", outProjection);
    ForEachElement(inViewpoint, "Point", [&](const DOM_Node& inPoint) {
      const ElementAttributes point(inPoint);
      point.ReadNumber("Ux", outViewpointX);
      point.ReadNumber("Uy", outViewpointY);
      point.ReadNumber("Uz", outViewpointZ);
    });
    // There is no second vector: the last three outputs keep the caller's texts.
    ForEachElement(inViewpoint, "Vector", [&](const DOM_Node& inVector) {
      const ElementAttributes vector(inVector);
      if (vector.Text("CorrespondingData") != "Sight") return;
      vector.ReadNumber("Vx", outSightX);
      vector.ReadNumber("Vy", outSightY);
      vector.ReadNumber("Vz", outSightZ);
    });
  };
  const auto readGeometry = [&](const DOM_Node& inGeometry) {
    const ElementAttributes geometry(inGeometry);
    geometry.ReadNumber("IntersectCurveLength", outCurveLength);
    geometry.ReadNumber("ExtractOrDistValue", outDistance);
    outReserved = ZORUnicodeString();
    ForEachElement(inGeometry, [&](const DOM_Node& inChild) {
      if (adapter::HasName(inChild, "Point"))
        AppendPoint(inChild, outPoints);
      else if (adapter::HasName(inChild, "Viewpoint"))
        readViewpoint(inChild);
    });
  };

  ForEachElement(inInterference, [&](const DOM_Node& inChild) {
    if (adapter::HasName(inChild, "ViolatedRule"))
      readRule(inChild);
    else if (adapter::HasName(inChild, "Product"))
      readProduct(inChild);
    else if (adapter::HasName(inChild, "GeometricAspect"))
      readGeometry(inChild);
    else if (adapter::HasName(inChild, "Comment"))
      ElementAttributes(inChild).ReadText("Value", outComment);
  });
}

void ZORClashParsing::GetInterferenceData(DOM_Node inInterference, ZORUnicodeString& outValue,
                                          ZORUnicodeString& outResultType,
                                          ZORUnicodeString& outRuleName,
                                          ZORUnicodeString& ioFirstAlias,
                                          ZORUnicodeString& outSecondAlias) {
  const ElementAttributes interference(inInterference);
  interference.ReadText("Value", outValue);
  interference.ReadText("ResultType", outResultType);
  ForEachElement(inInterference, [&](const DOM_Node& inChild) {
    if (adapter::HasName(inChild, "ViolatedRule"))
      ElementAttributes(inChild).ReadText(names::Name, outRuleName);
    else if (adapter::HasName(inChild, "Product"))
      ElementAttributes(inChild).ReadText(
          names::Alias, ioFirstAlias.GetLengthInChar() == 0 ? ioFirstAlias : outSecondAlias);
  });
}

void ZORClashParsing::GetInterferenceData(DOM_Node inInterference, ZORUnicodeString& ioFirstLabel,
                                          ZORUnicodeString& outSecondLabel,
                                          ZORUnicodeString& outFirstPreview,
                                          ZORUnicodeString& outSecondPreview) {
  ForEachElement(inInterference, "Product", [&](const DOM_Node& inProduct) {
    const ElementAttributes product(inProduct);
    const bool first = ioFirstLabel.GetLengthInChar() == 0;
    ZORUnicodeString label = InstanceName(product.Text(names::Alias));
    adapter::AppendUnits(label, u" -- ");
    label += product.Text(names::ShapeName);
    (first ? ioFirstLabel : outSecondLabel) = label;
    (first ? outFirstPreview : outSecondPreview) = product.Text("Preview");
  });
}

void ZORClashParsing::GetInterferenceData(DOM_Node inInterference, ZORUnicodeString& outPicture) {
  const DOM_Node picture = FirstElement(inInterference, "Picture");
  if (!picture.isNull()) outPicture = GetAttrOnNode(picture, "HRef");
}

void ZORClashParsing::GetInterferenceData(DOM_Node inInterference, ZORUnicodeString& outFirstAlias,
                                          ZORUnicodeString& outSecondAlias,
                                          ZORUnicodeString& ioFirstDescriptionId,
                                          ZORUnicodeString& outSecondDescriptionId,
                                          ZORMathTransformation& outFirstPosition,
                                          ZORMathTransformation& outSecondPosition) {
  const auto readVector = [&](const DOM_Node& inNode, const char* inX, const char* inY,
                              const char* inZ) {
    return ZORMathVector(GetAttrDoubleOnNode(inNode, inX), GetAttrDoubleOnNode(inNode, inY),
                         GetAttrDoubleOnNode(inNode, inZ));
  };
  // All zeros without a "Matrix", not the identity: callers recognise a missing placement by it.
  const auto readPosition = [&](const DOM_Node& inProduct) {
    ZORMathVector translation, columns[3];
    ForEachElement(inProduct, "Matrix", [&](const DOM_Node& inMatrix) {
      ForEachElement(inMatrix, "Point", [&](const DOM_Node& inPoint) {
        translation = readVector(inPoint, "Ux", "Uy", "Uz");
      });
      ForEachElement(inMatrix, "Vector", [&](const DOM_Node& inVector) {
        const ZORUnicodeString column = GetAttrOnNode(inVector, "CorrespondingData");
        const int place = column == names::Rx   ? 0
                          : column == names::Ry ? 1
                          : column == names::Rz ? 2
                                                : -1;
        if (place >= 0) columns[place] = readVector(inVector, "Vx", "Vy", "Vz");
      });
    });
    ZORMathTransformation position;
    position.SetVector(translation);
    position.SetMatrix(ZORMath3x3Matrix(columns[0], columns[1], columns[2]));
    return position;
  };

  ForEachElement(inInterference, "Product", [&](const DOM_Node& inProduct) {
    const bool first = ioFirstDescriptionId.GetLengthInChar() == 0;
    (first ? ioFirstDescriptionId : outSecondDescriptionId) =
        GetAttrOnNode(inProduct, "DescriptionID");
    (first ? outFirstAlias : outSecondAlias) =
        GetAttrOnNode(inProduct, names::Alias.ConvertToChar());
    (first ? outFirstPosition : outSecondPosition) = readPosition(inProduct);
  });
}

ZORUnicodeString ZORClashParsing::GetInstanceNameFromDID(ZORUnicodeString inDescriptionId) {
  return InstanceName(inDescriptionId);
}
