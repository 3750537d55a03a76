#include "pictures/ProductList.h"

#include <algorithm>

ProductList::~ProductList() {
  while (size_ > 0) entries_[--size_] = ZORIProduct_var();
  if (entries_ != &inside_) delete[] entries_;
}

void ProductList::Append(const ZORIProduct_var& inProduct) {
  if (size_ == room_) DoubleRoom();
  entries_[size_++] = inProduct;
}

const ZORIProduct_var& ProductList::operator[](int inPosition) const {
  if (inPosition < 1 || inPosition > size_)
    throw ZORFatalError("AssertionFailed:iPos > 0 && iPos <= _Size");
  return entries_[inPosition - 1];
}

void ProductList::DoubleRoom() {
  auto* const entries = new ZORIProduct_var[2 * static_cast<std::size_t>(room_)];
  std::copy_n(entries_, size_, entries);  // the new half holds nothing
  if (entries_ == &inside_)
    inside_ = ZORIProduct_var();
  else
    delete[] entries_;
  entries_ = entries;
  room_ *= 2;
}
