#include "platform/knowledge/ZORParmDictionary.h"

#include <cstring>
#include <utility>

#include "default_platform/knowledge/UnitReader.h"
#include "default_platform/system/ClassIdentifier.h"

namespace {

using ZORDefault::Dimension;

constexpr const char* kUnitName = "ZORICkeUnit";
constexpr const char* kMagnitudeName = "ZORICkeMagnitude";

// A component that is seen through one interface besides the base.
template <class Interface>
class Component : public Interface {
 public:
  explicit Component(const char* inInterfaceName) : interfaceName_(inInterfaceName) {}

  HRESULT QueryInterface(const IID& inInterface, void** outInterface) override {
    if (inInterface != Interface::ClassId())
      return ZORBaseUnknown::QueryInterface(inInterface, outInterface);
    return Give(outInterface);
  }
  HRESULT QueryInterface(const char* inInterfaceName, void** outInterface) override {
    if (!inInterfaceName || std::strcmp(inInterfaceName, interfaceName_) != 0)
      return ZORBaseUnknown::QueryInterface(inInterfaceName, outInterface);
    return Give(outInterface);
  }

 private:
  HRESULT Give(void** outInterface) {
    if (!outInterface) return E_INVALIDARG;
    this->AddRef();
    *outInterface = static_cast<Interface*>(this);
    return S_OK;
  }

  const char* const interfaceName_;
};

class StorageUnit final : public Component<ZORICkeUnit> {
 public:
  explicit StorageUnit(Dimension inDimension)
      : Component(kUnitName), dimension_(std::move(inDimension)) {}

  ZORCke::Boolean Decode(const ZORUnicodeString& inText, double& outValue) const override {
    const auto value = ZORDefault::ReadQuantity(inText, dimension_);
    if (!value) return ZORCke::False;
    outValue = *value;
    return ZORCke::True;
  }

 private:
  const Dimension dimension_;
};

class Magnitude final : public Component<ZORICkeMagnitude> {
 public:
  Magnitude(const char* inName, const Dimension& inDimension)
      : Component(kMagnitudeName), name_(inName), unit_(new StorageUnit(inDimension)) {
    unit_->Release();  // the handle holds it now
  }

  ZORUnicodeString Name() const override { return name_; }
  ZORICkeUnit_var Unit() const override { return unit_; }

 private:
  const ZORUnicodeString name_;
  const ZORICkeUnit_var unit_;
};

// The dictionary's own references keep the magnitudes until the process ends.
const auto& Magnitudes() {
  static const auto* const magnitudes = new std::map<std::string, Magnitude*>{
      {"LENGTH", new Magnitude("LENGTH", {{"m", 1}})},
      {"ANGLE", new Magnitude("ANGLE", {{"rad", 1}})},
      {"MASS", new Magnitude("MASS", {{"kg", 1}})},
      {"TIME", new Magnitude("TIME", {{"s", 1}})},
      {"AREA", new Magnitude("AREA", {{"m", 2}})},
      {"VOLUME", new Magnitude("VOLUME", {{"m", 3}})},
  };
  return *magnitudes;
}

}  // namespace

const IID& ZORICkeUnit::ClassId() {
  static const IID identifier = ZORDefault::IdentifierOfName(kUnitName);
  return identifier;
}

const IID& ZORICkeMagnitude::ClassId() {
  static const IID identifier = ZORDefault::IdentifierOfName(kMagnitudeName);
  return identifier;
}

ZORICkeMagnitude_var ZORParmDictionary::FindMagnitude(const ZORUnicodeString& inName) {
  const auto found = Magnitudes().find(inName.ConvertToChar());
  if (found == Magnitudes().end() || !ZORDefault::IsUnitDictionaryThere())
    return ZORICkeMagnitude_var();
  return found->second;
}
