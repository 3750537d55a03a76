#include "ClashDocumentGenerator.h"

#include <array>
#include <sstream>
#include <string>
#include <string_view>

namespace {
constexpr std::size_t kFlushedAt = 1 << 20;

// Text that goes to the stream in large pieces.
class Pieces {
 public:
  explicit Pieces(std::ostream& ioOut) : out_(ioOut) { text_.reserve(2 * kFlushedAt); }
  Pieces(const Pieces&) = delete;
  Pieces& operator=(const Pieces&) = delete;
  ~Pieces() { Flush(); }

  // The operands of << are evaluated in order, as arguments are not: random numbers come in order.
  Pieces& operator<<(std::string_view inText) {
    text_ += inText;
    if (text_.size() >= kFlushedAt) Flush();
    return *this;
  }
  Pieces& operator<<(std::size_t inNumber) { return *this << std::to_string(inNumber); }

 private:
  void Flush() {
    out_.write(text_.data(), static_cast<std::streamsize>(text_.size()));
    text_.clear();
  }

  std::ostream& out_;
  std::string text_;
};

// SplitMix64 (Steele, Lea, Flood: Fast splittable pseudorandom number generators, 2014).
class Random {
 public:
  explicit Random(std::uint64_t inSeed) : state_(inSeed) {}
  std::uint64_t Next() {
    std::uint64_t z = (state_ += 0x9E3779B97F4A7C15u);
    z = (z ^ (z >> 30)) * 0xBF58476D1CE4E5B9u;
    z = (z ^ (z >> 27)) * 0x94D049BB133111EBu;
    return z ^ (z >> 31);
  }
  std::size_t Below(std::size_t inLimit) { return static_cast<std::size_t>(Next() % inLimit); }

 private:
  std::uint64_t state_;
};

template <std::size_t kCount>
std::string_view OneOf(const std::array<std::string_view, kCount>& inChoices, Random& ioRandom) {
  return inChoices[ioRandom.Below(kCount)];
}

constexpr std::array<std::string_view, 3> kResultTypes = {"Clash", "Contact", "Clearance"};
constexpr std::array<std::string_view, 3> kStates = {"Not inspected", "Relevant", "Irrelevant"};
constexpr std::array<std::string_view, 2> kRetrieved = {"New", "Old"};
constexpr std::array<std::string_view, 3> kSeverities = {"Low", "Medium", "High"};
constexpr std::array<std::string_view, 2> kYesNo = {"YES", "NO"};
constexpr std::array<std::string_view, 8> kParts = {
    "nut", "l-bracket", "rod", "plate", "bolt", "gear &amp; shaft", "Träger", "ケーブル"};
constexpr std::array<std::string_view, 4> kComments = {
    "to be checked with the supplier", "touching on purpose, see drawing A-117",
    "moved by 2 mm &lt; tolerance", "à revoir après la prochaine révision"};
constexpr std::array<std::string_view, 3> kColumns = {"Rx", "Ry", "Rz"};
constexpr std::array<std::array<std::string_view, 3>, 3> kTurns = {
    {{"0", "0", "-1"}, {"0", "1", "0"}, {"0.866025", "-0.5", "0"}}};

// A length with up to three decimals, one in eight with a decimal comma.
std::string Length(Random& ioRandom) {
  const std::size_t thousandths = ioRandom.Below(2'000'000);
  std::string text = ioRandom.Below(3) == 0 ? "-" : "";
  text += std::to_string(thousandths / 1000);
  const std::size_t decimals = thousandths % 1000;
  if (decimals == 0) return text;
  text += ioRandom.Below(8) == 0 ? ',' : '.';
  const std::string digits = std::to_string(1000 + decimals);
  return text.append(digits, 1);
}

struct ProductName {
  std::string path;
  std::string_view part;
};

ProductName NextProduct(Random& ioRandom) {
  const std::string_view part = OneOf(kParts, ioRandom);
  std::string path = "assembly_" + std::to_string(ioRandom.Below(200)) + " --++-- ";
  path.append(part).append("_").append(std::to_string(ioRandom.Below(5000)));
  return {path, part};
}

void AddPoint(std::string_view inIndent, Random& ioRandom, Pieces& ioText) {
  ioText << inIndent << "<Point Ux=\"" << Length(ioRandom) << "\" Uy=\"" << Length(ioRandom)
         << "\" Uz=\"" << Length(ioRandom) << "\"/>\n";
}

void AddVector(std::string_view inIndent, std::string_view inColumn, Random& ioRandom,
               Pieces& ioText) {
  const auto& turn = kTurns[ioRandom.Below(kTurns.size())];
  ioText << inIndent << "<Vector CorrespondingData=\"" << inColumn << "\" Vx=\"" << turn[0]
         << "\" Vy=\"" << turn[1] << "\" Vz=\"" << turn[2] << "\"/>\n";
}

void AddProduct(std::size_t inNumber, int inWhich, Random& ioRandom, Pieces& ioText) {
  const ProductName product = NextProduct(ioRandom);
  const std::string_view processMode = ioRandom.Below(10) == 0 ? "KORVAPDM" : "";
  ioText << "      <Product DescriptionID=\"" << product.path << "\" Alias=\"" << product.path
         << "\" Alien=\"" << OneOf(kYesNo, ioRandom) << "\" ProcessMode=\"" << processMode
         << "\" ShapeName=\"" << product.part << "\" ShapeSource=\"\" Preview=\"previews/p"
         << inNumber << (inWhich == 1 ? "_1.jpg\">\n" : "_2.jpg\">\n") << "        <Matrix>\n";
  AddPoint("          ", ioRandom, ioText);
  for (std::string_view column : kColumns) AddVector("          ", column, ioRandom, ioText);
  ioText << "        </Matrix>\n      </Product>\n";
}

void AddViewpoint(Random& ioRandom, Pieces& ioText) {
  ioText << "        <Viewpoint FocusDistance=\"" << Length(ioRandom)
         << "\" NearPlane=\"1\" FarPlane=\"2000\" ProjectionType=\"Conic\">\n";
  AddPoint("          ", ioRandom, ioText);
  AddVector("          ", "Sight", ioRandom, ioText);
  ioText << "        </Viewpoint>\n";
}

void AddGeometry(std::size_t inNumber, Random& ioRandom, Pieces& ioText) {
  ioText << "      <GeometricAspect IntersectCurveLength=\"" << Length(ioRandom)
         << "\" ExtractOrDistValue=\"" << Length(ioRandom) << "\">\n";
  AddPoint("        ", ioRandom, ioText);
  AddPoint("        ", ioRandom, ioText);
  if (inNumber % 2 == 0) AddViewpoint(ioRandom, ioText);
  ioText << "      </GeometricAspect>\n";
}

void AddInterference(std::size_t inNumber, Random& ioRandom, Pieces& ioText) {
  const std::string_view type = OneOf(kResultTypes, ioRandom);
  ioText << "    <Interference Name=\"Interference." << inNumber << "\" Value=\""
         << Length(ioRandom) << "\" ResultType=\"" << type << "\" ResultTypeNoNLS=\"" << type
         << "\" DistanceClearance=\"" << Length(ioRandom) << "\" Status=\""
         << OneOf(kStates, ioRandom) << "\" RetrieveInf=\"" << OneOf(kRetrieved, ioRandom)
         << "\">\n";
  AddProduct(inNumber, 1, ioRandom, ioText);
  AddProduct(inNumber, 2, ioRandom, ioText);
  AddGeometry(inNumber, ioRandom, ioText);
  if (inNumber % 3 == 0)
    ioText << "      <Comment Value=\"" << OneOf(kComments, ioRandom) << "\"/>\n";
  if (inNumber % 5 == 0)
    ioText << "      <ViolatedRule Name=\"Rule." << inNumber / 5 << "\" Clearance=\""
           << Length(ioRandom) << "\" TypeCalc=\"Between all components\" Severity=\""
           << OneOf(kSeverities, ioRandom) << "\" PenetrationCandidate=\"No\"/>\n";
  ioText << "      <Picture HRef=\"../pictures/interference_" << inNumber
         << ".jpg\"/>\n    </Interference>\n";
}

void AddProductSet(std::string_view inName, Random& ioRandom, Pieces& ioText) {
  const ProductName product = NextProduct(ioRandom);
  ioText << "      <" << inName << " Alias=\"" << product.path << "\" Alien=\"NO\" ShapeName=\""
         << product.part << "\" DisplayableID=\"" << product.path << "\" DocumentVersion=\"A\"/>\n";
}

void AddSpecifications(std::size_t inCount, Random& ioRandom, Pieces& ioText) {
  ioText << "  <ProductsInSpec>\n";
  for (std::size_t i = 0; i < inCount; ++i) {
    ioText << "    <Specification>\n";
    AddProductSet("ProdListe1", ioRandom, ioText);
    AddProductSet("ProdListe2", ioRandom, ioText);
    ioText << "    </Specification>\n";
  }
  ioText << "  </ProductsInSpec>\n";
}

void AddAttribute(std::string_view inName, std::string_view inType, const std::string& inValue,
                  Pieces& ioText) {
  ioText << "      <ComponentAttribute Name=\"" << inName << "\" AttrType=\"" << inType
         << "\" AttrValue=\"" << inValue << "\"/>\n";
}

void AddTriple(std::string_view inName, Random& ioRandom, Pieces& ioText) {
  ioText << "      <" << inName << " Ux=\"" << Length(ioRandom) << "\" Uy=\"" << Length(ioRandom)
         << "\" Uz=\"" << Length(ioRandom) << "\"/>\n";
}

void AddShape(std::size_t inComponent, std::string_view inType, Random& ioRandom, Pieces& ioText) {
  ioText << "      <ComponentShape ShapeType=\"" << inType << "\" ShapeId=\"" << inComponent
         << "\" ShapeName=\"" << OneOf(kParts, ioRandom) << "\" ShapeOnDisk=\"shapes/"
         << inComponent << "." << inType << "\"/>\n";
}

void AddComponent(std::size_t inNumber, Random& ioRandom, Pieces& ioText) {
  const ProductName product = NextProduct(ioRandom);
  ioText << "  <Component Alias=\"" << product.path << "\" ComponentType=\"Part\" ComponentUuid=\""
         << inNumber << "\" PartNumber=\"" << product.part << "\" DocumentVersionUUID=\"A."
         << ioRandom.Below(30) << "\">\n    <ComponentAttributes>\n";
  AddAttribute("Mass", "Real", Length(ioRandom), ioText);
  AddAttribute("Material", "String", "steel", ioText);
  AddAttribute("Hole", "Feature", "12", ioText);
  AddAttribute("Supplier", "String", std::to_string(ioRandom.Below(90)), ioText);
  ioText << "    </ComponentAttributes>\n    <ComponentShapes>\n";
  AddShape(inNumber, "solid", ioRandom, ioText);
  AddShape(inNumber, "mesh", ioRandom, ioText);
  ioText << "    </ComponentShapes>\n    <ShapePosition>\n";
  for (std::string_view column : kColumns) AddTriple(column, ioRandom, ioText);
  AddTriple("T", ioRandom, ioText);
  ioText << "    </ShapePosition>\n  </Component>\n";
}

void AddHead(std::size_t inCount, Pieces& ioText) {
  ioText << "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
            "<ClashElement Version=\"1.2\" ZORDocument=\"large\" Responsible=\"design review\">\n"
            "  <Date Day=\"20\" Month=\"11\" Year=\"2026\"/>\n"
            "  <ClashSpec Name=\"large\" Type=\"Clearance + Contact + Clash\" Clearance=\"2\"/>\n"
            "  <ClashResult Name=\"large.Result.1\" ComputationCase=\"Between all components\" "
            "NbInterf=\""
         << inCount << "\">\n";
}

/// Replaces what stands between the quotes of an attribute's first occurrence.
void SetAttribute(std::string_view inBegin, std::string_view inValue, std::string& ioText) {
  const std::size_t begin = ioText.find(inBegin) + inBegin.size();
  ioText.replace(begin, ioText.find('"', begin) - begin, inValue);
}

std::string Recomputed(std::string ioText, Random& ioRandom) {
  SetAttribute(" Status=\"", kStates[0], ioText);
  SetAttribute(" RetrieveInf=\"", kRetrieved[0], ioText);
  const std::size_t edit = ioRandom.Below(100);
  if (edit < 3) return {};
  if (edit < 6) SetAttribute(" Value=\"", "-77.5", ioText);
  if (edit == 6 || edit == 7)
    for (std::size_t at = 0; (at = ioText.find("assembly_", at)) != std::string::npos;)
      ioText.replace(at, 9, "other_");
  if (edit == 8 || edit == 9) SetAttribute(" Vx=\"", "0.5", ioText);
  return ioText;
}
}  // namespace

void WriteClashDocument(std::size_t inCount, std::uint64_t inSeed, std::ostream& ioOut) {
  Random random(inSeed);
  Pieces text(ioOut);
  AddHead(inCount, text);
  for (std::size_t number = 1; number <= inCount; ++number) AddInterference(number, random, text);
  text << "  </ClashResult>\n";
  AddSpecifications(inCount / 10, random, text);
  text << "</ClashElement>\n";
}

void WriteRecomputedDocument(std::size_t inCount, std::uint64_t inSeed, std::ostream& ioOut) {
  Random random(inSeed), edits(inSeed + 1);
  Pieces text(ioOut);
  AddHead(inCount, text);
  for (std::size_t number = 1; number <= inCount; ++number) {
    std::ostringstream interference;
    {
      Pieces pieces(interference);
      AddInterference(number, random, pieces);
    }
    text << Recomputed(std::move(interference).str(), edits);
  }
  text << "  </ClashResult>\n";
  AddSpecifications(inCount / 10, random, text);
  text << "</ClashElement>\n";
}

void WritePairDocument(std::size_t inCount, std::uint64_t inSeed, std::ostream& ioOut) {
  Random random(1);
  Pieces text(ioOut);
  AddHead(inCount, text);
  for (std::size_t number = 1; number <= inCount; ++number) {
    text << "    <Interference Value=\"-" << random.Below(50)
         << "\" ResultTypeNoNLS=\"Clash\" Status=\"Not inspected\" RetrieveInf=\"New\">\n"
            "      <Product DescriptionID=\"a\" Alias=\"a\" ShapeName=\"plate\"/>\n"
            "      <Product DescriptionID=\"b\" Alias=\"b\" ShapeName=\"plate\"/>\n"
            "      <GeometricAspect><Point Ux=\""
         << random.Below(2000) << "." << inSeed % 10 << "\" Uy=\"" << random.Below(2000)
         << "\" Uz=\"" << random.Below(200) << "\"/></GeometricAspect>\n    </Interference>\n";
  }
  text << "  </ClashResult>\n</ClashElement>\n";
}

void WriteComponentsDocument(std::size_t inCount, std::uint64_t inSeed, std::ostream& ioOut) {
  Random random(inSeed);
  Pieces text(ioOut);
  text << "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
          "<Components PRCName=\"large\" ServerMarker=\"server\" Transaction=\"export\">\n";
  for (std::size_t number = 1; number <= inCount; ++number) AddComponent(number, random, text);
  text << "</Components>\n";
}
