// Components with just the interfaces that a test gives them.
#ifndef ZOR_TESTS_GENERAL_SERVICES_FAKE_COMPONENT_H
#define ZOR_TESTS_GENERAL_SERVICES_FAKE_COMPONENT_H

#include <utility>
#include <vector>

#include "platform/system/ZORBaseUnknown.h"

/// An object of a test, which owns it: it is not deleted when its last reference goes, so that a
/// test can count what is left. Nothing but a change of AnswerWith makes a query differ from what
/// was offered.
class FakeComponent {
 public:
  FakeComponent() = default;
  FakeComponent(const FakeComponent&) = delete;
  FakeComponent& operator=(const FakeComponent&) = delete;

  void Offer(const IID& inInterface, ZORBaseUnknown* inFacet) {
    answers_.push_back({inInterface, inFacet, S_OK});
  }
  /// The next queries for the interface answer this; a facet comes with a reference all the same.
  void AnswerWith(const IID& inInterface, HRESULT inResult, ZORBaseUnknown* inFacet) {
    Withdraw(inInterface);
    answers_.push_back({inInterface, inFacet, inResult});
  }
  void Withdraw(const IID& inInterface) {
    std::erase_if(answers_,
                  [&](const Answer& inAnswer) { return inAnswer.interfaceId == inInterface; });
  }

  HRESULT Query(const IID& inInterface, void** outInterface) {
    asked.push_back(inInterface);
    *outInterface = nullptr;
    for (const Answer& answer : answers_) {
      if (answer.interfaceId != inInterface) continue;
      *outInterface = answer.facet;
      if (answer.facet) answer.facet->AddRef();
      return answer.result;
    }
    return E_NOINTERFACE;
  }
  bool WasAskedFor(const IID& inInterface) const {
    for (const IID& interfaceId : asked)
      if (interfaceId == inInterface) return true;
    return false;
  }

  int references = 0;      ///< taken and not given back
  std::vector<IID> asked;  ///< in order

 private:
  struct Answer {
    IID interfaceId;
    ZORBaseUnknown* facet;
    HRESULT result;
  };
  std::vector<Answer> answers_;
};

/// One interface of a fake component. The interface is its only base, so that a pointer to it is
/// the pointer to the interface.
template <class Interface>
class FakeFacet : public Interface {
 public:
  explicit FakeFacet(FakeComponent& inOwner) : owner_(inOwner) {}
  HRESULT QueryInterface(const IID& inInterface, void** outInterface) override {
    return owner_.Query(inInterface, outInterface);
  }
  HRESULT QueryInterface(const char*, void** outInterface) override {
    *outInterface = nullptr;
    return E_NOINTERFACE;
  }
  unsigned int AddRef() override { return static_cast<unsigned int>(++owner_.references); }
  unsigned int Release() override { return static_cast<unsigned int>(--owner_.references); }

 private:
  FakeComponent& owner_;
};

#endif
