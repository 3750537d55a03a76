// A product and its ancestors.
#ifndef ZOR_PICTURES_PRODUCT_LIST_H
#define ZOR_PICTURES_PRODUCT_LIST_H

#include "platform/product_structure/ZORIProduct.h"

/// A growing 1-based list of product handles. It has room for one without taking memory, and
/// doubles its room when it is full. The handles are released from the last to the first.
class ProductList {
 public:
  ProductList() = default;
  ~ProductList();
  ProductList(const ProductList&) = delete;
  ProductList& operator=(const ProductList&) = delete;

  int Size() const { return size_; }
  void Append(const ZORIProduct_var& inProduct);
  /// A position outside 1 to Size() raises ZORFatalError.
  const ZORIProduct_var& operator[](int inPosition) const;

 private:
  void DoubleRoom();

  ZORIProduct_var inside_;
  ZORIProduct_var* entries_ = &inside_;
  int size_ = 0;
  int room_ = 1;
};

#endif
