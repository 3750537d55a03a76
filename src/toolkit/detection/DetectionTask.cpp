#include "toolkit/detection/DetectionTask.h"

#include <algorithm>
#include <cstring>
#include <iterator>
#include <optional>
#include <stdexcept>
#include <type_traits>
#include <utility>

#include "foundation/Hash.h"

namespace ZORDetection {
namespace {

/// Encodes values.
class Packer {
 public:
  template <typename Value>
  void operator()(const Value& inValue) {
    static_assert(std::is_trivially_copyable_v<Value>);
    bytes_.append(reinterpret_cast<const char*>(&inValue), sizeof inValue);
  }
  void operator()(const std::string& inText) {
    (*this)(inText.size());
    bytes_ += inText;
  }
  template <typename Item>
  void operator()(const std::vector<Item>& inItems) {
    (*this)(inItems.size());
    for (const Item& item : inItems) Pass(*this, item);
  }
  template <typename Packing, typename Item>
  static void Pass(Packing& ioPacking, Item& ioItem) {
    if constexpr (requires { Fields(ioPacking, ioItem); })
      Fields(ioPacking, ioItem);
    else
      ioPacking(ioItem);
  }
  std::string Take() { return std::move(bytes_); }

 private:
  std::string bytes_;
};

/// Decodes them, in the same order.
class Unpacker {
 public:
  explicit Unpacker(std::string_view inBytes) : left_(inBytes) {}

  template <typename Value>
  void operator()(Value& outValue) {
    static_assert(std::is_trivially_copyable_v<Value>);
    std::memcpy(&outValue, Next(sizeof outValue).data(), sizeof outValue);
  }
  void operator()(std::string& outText) { outText = Next(Size()); }
  template <typename Item>
  void operator()(std::vector<Item>& outItems) {
    const std::size_t size = Size();
    if (size > left_.size()) Next(size);  // each item has a byte at least
    outItems.resize(size);
    for (Item& item : outItems) Packer::Pass(*this, item);
  }

 private:
  std::size_t Size() {
    std::size_t size = 0;
    (*this)(size);
    return size;
  }
  std::string_view Next(std::size_t inSize) {
    if (inSize > left_.size()) throw std::runtime_error("the answer was cut off");
    const std::string_view next = left_.substr(0, inSize);
    left_.remove_prefix(inSize);
    return next;
  }

  std::string_view left_;
};

// One list of fields serves both directions.

template <typename Packing, typename Item>
requires std::is_same_v<std::remove_const_t<Item>, Interference>
void Fields(Packing& ioPacking, Item& ioItem) {
  ioPacking(ioItem.first);
  ioPacking(ioItem.second);
  ioPacking(ioItem.kind);
  ioPacking(ioItem.value);
  ioPacking(ioItem.points);
  ioPacking(ioItem.curveLength);
  ioPacking(ioItem.curve);
  ioPacking(ioItem.curveProduct);
  ioPacking(ioItem.isDuplicate);
  ioPacking(ioItem.isSheetInSolid);
  ioPacking(ioItem.hasMeshPrecision);
  ioPacking(ioItem.precision);
}

template <typename Packing, typename Item>
requires std::is_same_v<std::remove_const_t<Item>, Unjudged>
void Fields(Packing& ioPacking, Item& ioItem) {
  ioPacking(ioItem.part);
  ioPacking(ioItem.other);
  ioPacking(ioItem.isWholePart);
  ioPacking(ioItem.verdict);
  ioPacking(ioItem.reason);
}

template <typename Packing, typename Item>
requires std::is_same_v<std::remove_const_t<Item>, Findings>
void Fields(Packing& ioPacking, Item& ioItem) {
  ioPacking(ioItem.interferences);
  ioPacking(ioItem.curves);
  ioPacking(ioItem.unjudged);
  ioPacking(ioItem.pairsChecked);
  ioPacking(ioItem.verdicts);
  ioPacking(ioItem.costs);
  ioPacking(ioItem.judged);
  ioPacking(ioItem.seconds);
  ioPacking(ioItem.openSeconds);
  ioPacking(ioItem.isStopped);
}

template <typename Packing, typename Item>
requires std::is_same_v<std::remove_const_t<Item>, DetectionTask>
void Fields(Packing& ioPacking, Item& ioItem) {
  ioPacking(ioItem.options.tolerance);
  ioPacking(ioItem.options.contactGap);
  ioPacking(ioItem.options.clearance);
  ioPacking(ioItem.options.sheets);
  ioPacking(ioItem.options.threads);
  ioPacking(ioItem.options.meshSize);
  ioPacking(ioItem.options.withCurves);
  ioPacking(ioItem.options.shard);
  ioPacking(ioItem.options.shards);
  ioPacking(ioItem.options.known);
  ioPacking(ioItem.options.tried);
  ioPacking(ioItem.products);
  ioPacking(ioItem.isKept);
}

template <typename Item>
std::string Packed(const Item& inItem) {
  Packer packer;
  Fields(packer, inItem);
  return packer.Take();
}

template <typename Item>
Item Unpacked(std::string_view inBytes) {
  Item item;
  Unpacker unpacker(inBytes);
  Fields(unpacker, item);
  return item;
}

bool IsSameWork(const Findings& inOne, const Findings& inOther) {
  return inOne.costs == inOther.costs && inOne.pairsChecked == inOther.pairsChecked;
}

void Append(Findings inOther, Findings& ioFindings) {
  const auto isOfPart = [](const Unjudged& inUnjudged) { return !inUnjudged.other; };
  const auto append = [](auto& ioTo, auto& ioFrom) {
    ioTo.insert(ioTo.end(), std::make_move_iterator(ioFrom.begin()),
                std::make_move_iterator(ioFrom.end()));
  };
  std::erase_if(inOther.unjudged, isOfPart);  // of whole parts, which each run finds
  const auto curves = static_cast<std::uint32_t>(ioFindings.curves.size());
  for (Interference& found : inOther.interferences)
    if (found.curve > 0) found.curve += curves - 1;  // the first is empty in both
  if (!inOther.curves.empty()) inOther.curves.erase(inOther.curves.begin());
  append(ioFindings.curves, inOther.curves);
  append(ioFindings.unjudged, inOther.unjudged);
  append(ioFindings.interferences, inOther.interferences);
  append(ioFindings.judged, inOther.judged);
}

/// Sorts findings as a single run gives them. @return false for a verdict that occurs twice.
bool Sort(Findings& ioFindings) {
  std::ranges::sort(ioFindings.judged);
  std::ranges::sort(ioFindings.interferences, {}, [](const Interference& inFound) {
    return std::pair(inFound.first, inFound.second);
  });
  std::ranges::stable_sort(ioFindings.unjudged, {}, [](const Unjudged& inUnjudged) {
    return std::pair(inUnjudged.other.has_value(), inUnjudged.verdict);
  });
  return std::ranges::adjacent_find(ioFindings.judged) == ioFindings.judged.end();
}

/// Removes the next record from the bytes. @return nothing when it is incomplete.
std::optional<Findings> NextRecord(std::string_view& ioBytes) {
  std::uint64_t head[2];  // its length and its hash
  if (ioBytes.size() < sizeof head) return std::nullopt;
  std::memcpy(head, ioBytes.data(), sizeof head);
  const std::string_view rest = ioBytes.substr(sizeof head);
  if (head[0] > rest.size()) return std::nullopt;
  const std::string_view record = rest.substr(0, head[0]);
  if (ZORFoundation::Hash64Of(record) != head[1]) return std::nullopt;
  ioBytes = rest.substr(head[0]);
  return DecodeFindings(record);
}

}  // namespace

std::string Encode(const DetectionTask& inTask) { return Packed(inTask); }
DetectionTask DecodeTask(std::string_view inBytes) { return Unpacked<DetectionTask>(inBytes); }
std::string Encode(const Findings& inFindings) { return Packed(inFindings); }
Findings DecodeFindings(std::string_view inBytes) { return Unpacked<Findings>(inBytes); }

bool MergeFindings(Findings inOther, Findings& ioFindings) {
  if (!IsSameWork(inOther, ioFindings)) return false;
  Append(std::move(inOther), ioFindings);
  return Sort(ioFindings);
}

std::string EncodeRecord(const Findings& inFindings) {
  const std::string bytes = Encode(inFindings);
  const std::uint64_t head[2] = {bytes.size(), ZORFoundation::Hash64Of(bytes)};
  return std::string(reinterpret_cast<const char*>(head), sizeof head) + bytes;
}

KeptFindings DecodeRecords(std::string_view inBytes) {
  KeptFindings kept;
  std::string_view left = inBytes;
  while (std::optional<Findings> record = NextRecord(left)) {
    const bool isStart = record->judged.empty();
    if (kept.size == 0 ? !isStart : isStart && !IsSameWork(*record, kept.findings)) break;
    if (kept.size == 0)
      kept.findings = *std::move(record);
    else if (!isStart)
      Append(*std::move(record), kept.findings);
    kept.size = inBytes.size() - left.size();
  }
  return Sort(kept.findings) ? kept : KeptFindings();
}

}  // namespace ZORDetection
