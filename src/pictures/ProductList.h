// A product and its ancestors.
#ifndef ZOR_PICTURES_PRODUCT_LIST_H
#define ZOR_PICTURES_PRODUCT_LIST_H

#include <algorithm>
#include <cstddef>

#include "platform/product_structure/ZORIProduct.h"

/// A growing 1-based list of product handles. The first is held inside the list; its capacity
/// doubles when it is full. The handles are released from the last to the first.
class ProductList {
 public:
  ProductList() = default;
  ~ProductList() {
    while (size_ > 0) entries_[--size_] = ZORIProduct_var();
    if (entries_ != &inside_) delete[] entries_;
  }
  ProductList(const ProductList&) = delete;
  ProductList& operator=(const ProductList&) = delete;

  int Size() const { return size_; }
  void Append(const ZORIProduct_var& inProduct) {
    if (size_ == capacity_) Grow();
    entries_[size_++] = inProduct;
  }
  /// A position outside 1 to Size() raises ZORFatalError.
  const ZORIProduct_var& operator[](int inPosition) const {
    if (inPosition < 1 || inPosition > size_)
      throw ZORFatalError("AssertionFailed:iPos > 0 && iPos <= _Size");
    return entries_[inPosition - 1];
  }

 private:
  void Grow() {
    auto* const entries = new ZORIProduct_var[2 * static_cast<std::size_t>(capacity_)];
    std::copy_n(entries_, size_, entries);
    if (entries_ == &inside_)
      inside_ = ZORIProduct_var();
    else
      delete[] entries_;
    entries_ = entries;
    capacity_ *= 2;
  }

  ZORIProduct_var inside_;
  ZORIProduct_var* entries_ = &inside_;
  int size_ = 0;
  int capacity_ = 1;
};

#endif
