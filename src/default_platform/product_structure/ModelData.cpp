#include "default_platform/product_structure/ModelData.h"

#include <algorithm>
#include <cstring>
#include <type_traits>

namespace ZORDefault {
namespace {

class Writer {
 public:
  template <class Value>
  void Put(const Value& inValue) {
    static_assert(std::is_trivially_copyable_v<Value>);
    bytes_.append(reinterpret_cast<const char*>(&inValue), sizeof(Value));
  }
  template <class Sequence>  // a vector or a string
  void PutAll(const Sequence& inValues) {
    typedef typename Sequence::value_type Value;
    static_assert(std::is_trivially_copyable_v<Value>);
    Put<std::uint64_t>(inValues.size());
    bytes_.append(reinterpret_cast<const char*>(inValues.data()), inValues.size() * sizeof(Value));
  }
  std::string Take() { return std::move(bytes_); }

 private:
  std::string bytes_;
};

/// Reads what a Writer wrote. After the first piece that is not there all others are empty too.
/// By hand, since cereal gives a vector its size before it knows that so many bytes follow.
class Reader {
 public:
  explicit Reader(std::string_view inBytes) : bytes_(inBytes) {}

  template <class Value>
  Value Get() {
    Value value{};
    if (Has(sizeof(Value), 1)) std::memcpy(&value, Advance(sizeof(Value)), sizeof(Value));
    return value;
  }
  template <class Sequence>
  void GetAll(Sequence& outValues) {
    typedef typename Sequence::value_type Value;
    const auto count = Get<std::uint64_t>();
    if (!Has(sizeof(Value), count)) return;
    outValues.resize(count);
    if (count > 0)
      std::memcpy(outValues.data(), Advance(count * sizeof(Value)), count * sizeof(Value));
  }
  /// A count of things that take at least one byte each.
  std::size_t GetCount() {
    const auto count = Get<std::uint64_t>();
    return Has(1, count) ? count : 0;
  }
  bool IsWhole() const { return isWhole_; }
  bool IsAtEnd() const { return isWhole_ && position_ == bytes_.size(); }

 private:
  bool Has(std::size_t inSize, std::uint64_t inCount) {
    isWhole_ = isWhole_ && inCount <= (bytes_.size() - position_) / inSize;
    return isWhole_;
  }
  const char* Advance(std::size_t inCount) {
    const char* const at = bytes_.data() + position_;
    position_ += inCount;
    return at;
  }

  std::string_view bytes_;
  std::size_t position_ = 0;
  bool isWhole_ = true;
};

void PutTexts(Writer& ioWriter, const std::vector<std::string>& inTexts) {
  ioWriter.Put<std::uint64_t>(inTexts.size());
  for (const std::string& text : inTexts) ioWriter.PutAll(text);
}

std::string GetText(Reader& ioReader) {
  std::string text;
  ioReader.GetAll(text);
  return text;
}

/// Stops at the first piece that is not there: a false count costs no more than the bytes hold.
template <class Item>
void GetEach(Reader& ioReader, std::vector<Item>& outItems, Item (*inGet)(Reader&)) {
  const std::size_t count = ioReader.GetCount();
  for (std::size_t i = 0; i < count && ioReader.IsWhole(); ++i) outItems.push_back(inGet(ioReader));
}

void PutReferencedFile(Writer& ioWriter, const ReferencedFile& inFile) {
  ioWriter.PutAll(inFile.name);
  ioWriter.Put(inFile.state);
  ioWriter.Put(inFile.hash);
}

ReferencedFile GetReferencedFile(Reader& ioReader) {
  ReferencedFile file;
  ioReader.GetAll(file.name);
  file.state = ioReader.Get<ReferencedFile::State>();
  file.hash = ioReader.Get<std::uint64_t>();
  return file;
}

void PutColour(Writer& ioWriter, const std::optional<PartColour>& inColour) {
  ioWriter.Put<std::uint8_t>(inColour ? 1 : 0);
  ioWriter.Put(inColour.value_or(PartColour{}));
}

std::optional<PartColour> GetColour(Reader& ioReader) {
  const bool isSet = ioReader.Get<std::uint8_t>() != 0;
  const auto colour = ioReader.Get<PartColour>();
  return isSet ? std::optional(colour) : std::nullopt;
}

void PutMesh(Writer& ioWriter, const PartMesh& inMesh) {
  ioWriter.Put(inMesh.origin);
  ioWriter.PutAll(inMesh.points);
  ioWriter.PutAll(inMesh.normals);
  ioWriter.PutAll(inMesh.triangles);
  ioWriter.PutAll(inMesh.triangleColours);
  ioWriter.PutAll(inMesh.colours);
  ioWriter.PutAll(inMesh.edgePoints);
  ioWriter.PutAll(inMesh.lineStarts);
  ioWriter.Put(inMesh.sphere.centre);
  ioWriter.Put(inMesh.sphere.radius);
}

std::shared_ptr<const PartMesh> GetMesh(Reader& ioReader) {
  auto mesh = std::make_shared<PartMesh>();
  mesh->origin = ioReader.Get<ZORMathVector>();
  ioReader.GetAll(mesh->points);
  ioReader.GetAll(mesh->normals);
  ioReader.GetAll(mesh->triangles);
  ioReader.GetAll(mesh->triangleColours);
  ioReader.GetAll(mesh->colours);
  ioReader.GetAll(mesh->edgePoints);
  ioReader.GetAll(mesh->lineStarts);
  mesh->sphere.centre = ioReader.Get<ZORMathVector>();
  mesh->sphere.radius = ioReader.Get<double>();
  return mesh;
}

void PutPart(Writer& ioWriter, const ModelPart& inPart) {
  ioWriter.PutAll(inPart.name);
  ioWriter.PutAll(inPart.label);
  PutColour(ioWriter, inPart.colour);
  ioWriter.Put<std::uint8_t>(inPart.isAssembly);
  ioWriter.Put<std::uint8_t>(inPart.failedToTessellate);
  ioWriter.Put(inPart.facesWithoutTriangles);
  ioWriter.Put(inPart.area);
  ioWriter.Put<std::uint8_t>(inPart.mesh != nullptr);
  if (inPart.mesh) PutMesh(ioWriter, *inPart.mesh);
}

ModelPart GetPart(Reader& ioReader) {
  ModelPart part;
  ioReader.GetAll(part.name);
  ioReader.GetAll(part.label);
  part.colour = GetColour(ioReader);
  part.isAssembly = ioReader.Get<std::uint8_t>() != 0;
  part.failedToTessellate = ioReader.Get<std::uint8_t>() != 0;
  part.facesWithoutTriangles = ioReader.Get<std::uint32_t>();
  part.area = ioReader.Get<double>();
  if (ioReader.Get<std::uint8_t>() != 0) part.mesh = GetMesh(ioReader);
  return part;
}

void PutProduct(Writer& ioWriter, const ModelProduct& inProduct) {
  ioWriter.PutAll(inProduct.name);
  ioWriter.Put(inProduct.parent);
  ioWriter.Put(inProduct.part);
  std::array<double, 12> placement;
  inProduct.parentFromProduct.GetCoefficients(placement.data());
  ioWriter.Put(placement);
  PutColour(ioWriter, inProduct.colour);
}

ModelProduct GetProduct(Reader& ioReader) {
  ModelProduct product;
  ioReader.GetAll(product.name);
  product.parent = ioReader.Get<std::int32_t>();
  product.part = ioReader.Get<std::uint32_t>();
  const auto c = ioReader.Get<std::array<double, 12>>();
  product.parentFromProduct.SetMatrix({{c[0], c[1], c[2]}, {c[3], c[4], c[5]}, {c[6], c[7], c[8]}});
  product.parentFromProduct.SetVector({c[9], c[10], c[11]});
  product.colour = GetColour(ioReader);
  return product;
}

bool IsSound(const PartMesh& inMesh) {
  const auto isPoint = [&](std::uint32_t point) { return point < inMesh.points.size(); };
  const auto isTriangle = [&](const auto& corners) {
    return std::ranges::all_of(corners, isPoint);
  };
  const auto isColour = [&](std::uint16_t colour) {
    return colour == PartMesh::kNoColour || colour < inMesh.colours.size();
  };
  const auto& starts = inMesh.lineStarts;
  return inMesh.normals.size() == inMesh.points.size() &&
         std::ranges::all_of(inMesh.triangles, isTriangle) &&
         (inMesh.triangleColours.empty() ||
          inMesh.triangleColours.size() == inMesh.triangles.size()) &&
         std::ranges::all_of(inMesh.triangleColours, isColour) && std::ranges::is_sorted(starts) &&
         (starts.empty() || starts.back() == inMesh.edgePoints.size());
}

bool IsSound(const ModelData& inModel) {
  for (const ModelPart& part : inModel.parts)
    if (part.mesh && !IsSound(*part.mesh)) return false;
  for (std::size_t i = 0; i < inModel.products.size(); ++i) {
    const ModelProduct& product = inModel.products[i];
    const bool isRoot = product.parent == ModelProduct::kNoParent;
    if (isRoot != (i == 0) ||
        (!isRoot && (product.parent < 0 || static_cast<std::size_t>(product.parent) >= i)))
      return false;
    if (product.part >= inModel.parts.size()) return false;
  }
  return !inModel.products.empty();
}

}  // namespace

std::string EncodeModel(const ModelData& inModel) {
  Writer writer;
  writer.Put<std::uint8_t>(inModel.hadFailure);
  writer.Put<std::uint64_t>(inModel.referencedFiles.size());
  for (const ReferencedFile& file : inModel.referencedFiles) PutReferencedFile(writer, file);
  PutTexts(writer, inModel.damages);
  PutTexts(writer, inModel.warnings);
  writer.Put<std::uint64_t>(inModel.parts.size());
  for (const ModelPart& part : inModel.parts) PutPart(writer, part);
  writer.Put<std::uint64_t>(inModel.products.size());
  for (const ModelProduct& product : inModel.products) PutProduct(writer, product);
  return writer.Take();
}

bool DecodeModel(std::string_view inBytes, ModelData& outModel) {
  Reader reader(inBytes);
  ModelData model;
  model.hadFailure = reader.Get<std::uint8_t>() != 0;
  GetEach(reader, model.referencedFiles, &GetReferencedFile);
  GetEach(reader, model.damages, &GetText);
  GetEach(reader, model.warnings, &GetText);
  GetEach(reader, model.parts, &GetPart);
  GetEach(reader, model.products, &GetProduct);
  if (!reader.IsAtEnd() || !IsSound(model)) return false;
  outModel = std::move(model);
  return true;
}

}  // namespace ZORDefault
