// Storage identifiers, product trees and providers, on components built by hand.
#include <gtest/gtest.h>

#include <deque>
#include <optional>
#include <string>

#include "ZORLyraGeneralServices.h"
#include "general_services/FakeProduct.h"
#include "platform/product_structure/ZORILinkableObject.h"
#include "platform/product_structure/ZORIProviders.h"
#include "support/ScopedVariable.h"

namespace {

// Storage identifiers

std::string Composed(const char* inPDMId, const char* inVersion) {
  return ZORLyraGeneralServices::BuildStorageProdIdFromPDMIdDV(inPDMId, inVersion).ConvertToChar();
}

/// "RESULT PDM|VERSION" of a split whose outputs held something before.
std::string Split(const char* inStorageId) {
  ZORUnicodeString pdm = "old", version = "old";
  const HRESULT result =
      ZORLyraGeneralServices::GetPDMIdDVFromStorageProdId(inStorageId, pdm, version);
  const std::string word = result == S_OK ? "S_OK " : result == E_FAIL ? "E_FAIL " : "? ";
  return word + pdm.ConvertToChar() + "|" + version.ConvertToChar();
}

TEST(ZORLyraGeneralServices, BuildStorageProdIdJoinsBothIdentifiers) {
  EXPECT_EQ("A1B2<uuiddv>77F0", Composed("A1B2", "77F0"));
}

TEST(ZORLyraGeneralServices, BuildStorageProdIdWithoutVersionIsThePDMIdentifier) {
  EXPECT_EQ("A1B2", Composed("A1B2", ""));
}

TEST(ZORLyraGeneralServices, BuildStorageProdIdDoesNotCheckThePDMIdentifier) {
  EXPECT_EQ("<uuiddv>77F0", Composed("", "77F0"));
  EXPECT_EQ("a<uuiddv>b<uuiddv>c", Composed("a<uuiddv>b", "c"));
}

TEST(ZORLyraGeneralServices, BuildStorageProdIdTakesAVersionOfOneBlank) {
  EXPECT_EQ("A<uuiddv> ", Composed("A", " "));
}

TEST(ZORLyraGeneralServices, BuildStorageProdIdOfNothingIsEmpty) {
  EXPECT_EQ("", Composed("", ""));
}

TEST(ZORLyraGeneralServices, GetPDMIdDVSplitsAtTheSeparator) {
  EXPECT_EQ("S_OK A1B2|77F0", Split("A1B2<uuiddv>77F0"));
}

TEST(ZORLyraGeneralServices, GetPDMIdDVWithoutSeparatorIsAllPDMIdentifier) {
  EXPECT_EQ("S_OK A1B2|", Split("A1B2"));
}

TEST(ZORLyraGeneralServices, GetPDMIdDVWithNothingBehindTheSeparatorHasAnEmptyVersion) {
  EXPECT_EQ("S_OK abc|", Split("abc<uuiddv>"));
}

TEST(ZORLyraGeneralServices, GetPDMIdDVWithNothingBeforeTheSeparatorHasAnEmptyPDMIdentifier) {
  EXPECT_EQ("S_OK |xyz", Split("<uuiddv>xyz"));
}

TEST(ZORLyraGeneralServices, GetPDMIdDVOfTheSeparatorAloneSucceedsWithBothEmpty) {
  EXPECT_EQ("S_OK |", Split("<uuiddv>"));
}

TEST(ZORLyraGeneralServices, GetPDMIdDVSplitsAtTheFirstSeparator) {
  EXPECT_EQ("S_OK a|b<uuiddv>c", Split("a<uuiddv>b<uuiddv>c"));
}

TEST(ZORLyraGeneralServices, GetPDMIdDVOfNothingFailsAndEmptiesBoth) {
  EXPECT_EQ("E_FAIL |", Split(""));
}

TEST(ZORLyraGeneralServices, GetPDMIdDVTakesTheSeparatorLiterally) {
  EXPECT_EQ("S_OK a<UUIDDV>b|", Split("a<UUIDDV>b"));
  EXPECT_EQ("S_OK a<uuiddv|", Split("a<uuiddv"));
  EXPECT_EQ("S_OK a< uuiddv>b|", Split("a< uuiddv>b"));
}

TEST(ZORLyraGeneralServices, GetPDMIdDVCountsCharactersNotBytes) {
  EXPECT_EQ("S_OK Größe\U0001F527|日本", Split("Größe\U0001F527<uuiddv>日本"));
}

TEST(ZORLyraGeneralServices, GetPDMIdDVUndoesBuildStorageProdId) {
  for (const char* pdm : {"abc", " ", "<", "<uuiddv", "a>b"}) {
    for (const char* version : {"", "1", "a<uuiddv>b", "<uuiddv>"}) {
      EXPECT_EQ(std::string("S_OK ") + pdm + "|" + version, Split(Composed(pdm, version).c_str()));
    }
  }
}

TEST(ZORLyraGeneralServices, GetPDMIdDVOfAnEmptyCompositionIsTheExceptionAndFails) {
  EXPECT_EQ("E_FAIL |", Split(Composed("", "").c_str()));
}

// Product trees

/// A root with one child, itself with two; named after their place.
struct FakeTree {
  FakeTree() {
    root.Add(car);
    car.Add(wheel);
    car.Add(door);
  }
  /// What is left of the references that were taken on any of them.
  int References() const {
    return root.references + car.references + wheel.references + door.references;
  }
  FakeProduct root{"Top"}, car{"Car"}, wheel{"Wheel.1"}, door{"Door"};
};

/// The aliases of what Expand lists, each followed by a blank.
std::string Expanded(FakeProduct& inProduct) {
  ZORListValZORBaseUnknown_var list;
  ZORLyraGeneralServices::Expand(inProduct.Product(), list);
  std::string aliases;
  for (int i = 1; i <= list.Size(); ++i)
    aliases += std::string(ZORIAlias_var(list[i])->GetAlias().ConvertToChar()) + " ";
  return aliases;
}

class Expand : public testing::Test {
 protected:
  void UseOldMode() { mode_.emplace("ZOR_NEW_VISU_MODE", "0"); }
  void UseNewMode() { mode_.emplace("ZOR_NEW_VISU_MODE", "1"); }
  FakeTree tree;

 private:
  std::optional<support::ScopedVariable> mode_;
};

TEST_F(Expand, NullListsNothing) {
  ZORListValZORBaseUnknown_var list;
  ZORLyraGeneralServices::Expand(nullptr, list);
  EXPECT_EQ(0, list.Size());
}

TEST_F(Expand, LeafListsExactlyTheLeaf) {
  EXPECT_EQ("Door ", Expanded(tree.door));
  EXPECT_EQ(0, tree.References());
}

TEST_F(Expand, LeafIsNotAskedForARepresentation) {
  tree.door.OfferSession();
  EXPECT_EQ("Door ", Expanded(tree.door));
  EXPECT_EQ("", tree.door.sessionCalls);
}

TEST_F(Expand, ProductWithoutAListOfChildrenIsALeaf) {
  tree.car.hasList = false;
  EXPECT_EQ("Car ", Expanded(tree.car));
}

TEST_F(Expand, AssemblyWithoutSessionListsItsChildrenOnly) {
  EXPECT_EQ("Wheel.1 Door ", Expanded(tree.car));
}

TEST_F(Expand, TreeIsListedDepthFirst) {
  FakeProduct last("Last");
  tree.root.Add(last);
  EXPECT_EQ("Wheel.1 Door Last ", Expanded(tree.root));
}

TEST_F(Expand, AssemblyWithARepresentationStandsBeforeItsDescendants) {
  UseNewMode();
  tree.root.OfferSession();
  tree.car.OfferSession();
  EXPECT_EQ("Top Car Wheel.1 Door ", Expanded(tree.root));
  EXPECT_EQ(0, tree.References());
}

TEST_F(Expand, NewModeAsksForTheHandleWithZeroAndOne) {
  UseNewMode();
  tree.car.OfferSession();
  Expanded(tree.car);
  EXPECT_EQ("rep(0,1)", tree.car.sessionCalls);
}

TEST_F(Expand, NewModeTakesSuccessWithAnEmptyHandle) {
  UseNewMode();
  tree.car.OfferSession();
  tree.car.representation = nullptr;
  EXPECT_EQ("Car Wheel.1 Door ", Expanded(tree.car));
}

TEST_F(Expand, NewModeTakesAnySuccess) {
  UseNewMode();
  tree.car.OfferSession();
  tree.car.representationResult = 1;
  EXPECT_EQ("Car Wheel.1 Door ", Expanded(tree.car));
}

TEST_F(Expand, NewModeFailureLeavesTheAssemblyOutWhateverTheHandle) {
  UseNewMode();
  FakeComponent other;
  FakeFacet<ZORBaseUnknown> representation(other);
  tree.car.OfferSession();
  tree.car.representation = &representation;
  tree.car.representationResult = E_FAIL;
  EXPECT_EQ("Wheel.1 Door ", Expanded(tree.car));
  EXPECT_EQ(0, other.references);
}

TEST_F(Expand, NewModeReleasesTheRepresentation) {
  UseNewMode();
  FakeComponent other;
  FakeFacet<ZORBaseUnknown> representation(other);
  tree.car.OfferSession();
  tree.car.representation = &representation;
  EXPECT_EQ("Car Wheel.1 Door ", Expanded(tree.car));
  EXPECT_EQ(0, other.references);
}

TEST_F(Expand, OldModeAsksForTheNameWithZeroAndOne) {
  UseOldMode();
  tree.car.OfferSession();
  Expanded(tree.car);
  EXPECT_EQ("name(0,1)", tree.car.sessionCalls);
}

TEST_F(Expand, OldModeTakesANamedRepresentation) {
  UseOldMode();
  tree.car.OfferSession();
  tree.car.name = "body";
  EXPECT_EQ("Car Wheel.1 Door ", Expanded(tree.car));
  EXPECT_EQ(0, tree.References());
}

TEST_F(Expand, OldModeLeavesOutAnEmptyName) {
  UseOldMode();
  tree.car.OfferSession();
  tree.car.name = "";
  EXPECT_EQ("Wheel.1 Door ", Expanded(tree.car));
}

TEST_F(Expand, OldModeTakesNoOtherSuccessThanZero) {
  UseOldMode();
  tree.car.OfferSession();
  tree.car.name = "body";
  tree.car.nameResult = 1;
  EXPECT_EQ("Wheel.1 Door ", Expanded(tree.car));
}

TEST_F(Expand, OldModeFailureLeavesTheAssemblyOut) {
  UseOldMode();
  tree.car.OfferSession();
  tree.car.name = "body";
  tree.car.nameResult = E_FAIL;
  EXPECT_EQ("Wheel.1 Door ", Expanded(tree.car));
}

TEST_F(Expand, SessionMustBeAnsweredWithExactlyZero) {
  UseNewMode();
  tree.car.AnswerWith(ZORIProductInSession::ClassId(), 1, tree.car.Session());
  EXPECT_EQ("Wheel.1 Door ", Expanded(tree.car));
  EXPECT_EQ("", tree.car.sessionCalls);
  EXPECT_EQ(0, tree.References());
}

TEST_F(Expand, SessionAnsweredWithZeroAndNothingRaisesTheNullHandleError) {
  tree.car.AnswerWith(ZORIProductInSession::ClassId(), S_OK, nullptr);
  EXPECT_THROW(Expanded(tree.car), ZORNullVarError);
  EXPECT_EQ(0, tree.References());
}

TEST_F(Expand, EmptyChildHandleIsPassedOver) {
  tree.car.children.insert(tree.car.children.begin(), nullptr);
  EXPECT_EQ("Wheel.1 Door ", Expanded(tree.car));
}

TEST_F(Expand, ChildThatIsNoProductEndsItsBranch) {
  FakeComponent note;
  FakeFacet<ZORBaseUnknown> facet(note);
  tree.car.children.insert(tree.car.children.begin() + 1, &facet);
  EXPECT_EQ("Wheel.1 Door ", Expanded(tree.car));
  EXPECT_TRUE(note.WasAskedFor(ZORIProduct::ClassId()));
  EXPECT_EQ(0, note.references);
}

TEST_F(Expand, ChildThatAnswersSuccessWithNothingEndsItsBranch) {
  tree.wheel.AnswerWith(ZORIProduct::ClassId(), S_OK, nullptr);
  EXPECT_EQ("Door ", Expanded(tree.car));
}

TEST_F(Expand, ChildThatAnswersAnotherSuccessIsExpanded) {
  tree.wheel.AnswerWith(ZORIProduct::ClassId(), 1, tree.wheel.Product());
  EXPECT_EQ("Wheel.1 Door ", Expanded(tree.car));
  EXPECT_EQ(0, tree.References());
}

TEST_F(Expand, AssemblyWhoseChildrenAllEndIsNoLeaf) {
  tree.car.children = {nullptr, nullptr};
  EXPECT_EQ("", Expanded(tree.car));
}

TEST_F(Expand, ProductReachedTwiceIsListedTwice) {
  tree.root.children.push_back(tree.wheel.Product());
  EXPECT_EQ("Wheel.1 Door Wheel.1 ", Expanded(tree.root));
  EXPECT_EQ(0, tree.References());
}

TEST_F(Expand, ListKeepsWhatItHeld) {
  ZORListValZORBaseUnknown_var list;
  list.Append(ZORBaseUnknown_var());
  ZORLyraGeneralServices::Expand(tree.car.Product(), list);
  ZORLyraGeneralServices::Expand(tree.car.Product(), list);
  ASSERT_EQ(5, list.Size());
  EXPECT_TRUE(list[1].IsNull());
  EXPECT_EQ(list[2].GetInterface(), list[4].GetInterface());
}

TEST_F(Expand, ListedProductsAreHeldByTheListAlone) {
  {
    ZORListValZORBaseUnknown_var list;
    ZORLyraGeneralServices::Expand(tree.root.Product(), list);
    ASSERT_EQ(2, list.Size());
    EXPECT_EQ(1, tree.wheel.references);
    EXPECT_EQ(1, tree.door.references);
    EXPECT_EQ(0, tree.root.references + tree.car.references);
  }
  EXPECT_EQ(0, tree.References());
}

TEST_F(Expand, VeryDeepTreeIsListed) {
  std::deque<FakeProduct> chain;
  chain.emplace_back("0");
  for (int depth = 1; depth <= 200'000; ++depth) {
    FakeProduct& father = chain.back();
    father.Add(chain.emplace_back(std::to_string(depth).c_str()));
  }
  EXPECT_EQ("200000 ", Expanded(chain.front()));
  EXPECT_EQ(0, chain.front().references + chain.back().references);
}

// Alias paths

std::string PathOf(FakeProduct& inProduct) {
  return ZORLyraGeneralServices::GetPathRoot(inProduct.Product()).ConvertToChar();
}

class GetPathRoot : public testing::Test {
 protected:
  ~GetPathRoot() override { EXPECT_EQ(0, tree.References()); }
  FakeTree tree;
};

TEST_F(GetPathRoot, RootHasNone) { EXPECT_EQ("", PathOf(tree.root)); }

TEST_F(GetPathRoot, NullHandleHasNone) {
  EXPECT_EQ(0, ZORLyraGeneralServices::GetPathRoot(ZORIProduct_var()).GetLengthInChar());
}

TEST_F(GetPathRoot, ChildOfTheRootHasItsAliasAlone) { EXPECT_EQ("Car", PathOf(tree.car)); }

TEST_F(GetPathRoot, DeeperProductsAreJoinedFromTheTop) {
  FakeProduct bolt("Bolt");
  tree.wheel.Add(bolt);
  EXPECT_EQ("Car --++-- Wheel.1", PathOf(tree.wheel));
  EXPECT_EQ("Car --++-- Wheel.1 --++-- Bolt", PathOf(bolt));
}

TEST_F(GetPathRoot, AliasesAreTakenAsTheyStand) {
  FakeProduct nameless(""), odd(" --++-- ");
  tree.car.Add(nameless);
  nameless.Add(odd);
  EXPECT_EQ("Car --++-- ", PathOf(nameless));
  EXPECT_EQ("Car --++--  --++--  --++-- ", PathOf(odd));
}

TEST_F(GetPathRoot, ProductWithoutAliasHasNone) {
  tree.wheel.Withdraw(ZORIAlias::ClassId());
  EXPECT_EQ("", PathOf(tree.wheel));
}

TEST_F(GetPathRoot, AncestorWithoutAliasEndsTheChainAndItsChildCountsAsRoot) {
  FakeProduct bolt("Bolt");
  tree.wheel.Add(bolt);
  tree.car.Withdraw(ZORIAlias::ClassId());
  EXPECT_EQ("Bolt", PathOf(bolt));
  EXPECT_EQ("", PathOf(tree.wheel));
}

TEST_F(GetPathRoot, FatherThatIsNoProductEndsTheChain) {
  FakeProduct bolt("Bolt");
  tree.wheel.Add(bolt);
  tree.car.Withdraw(ZORIProduct::ClassId());
  EXPECT_EQ("Bolt", PathOf(bolt));
}

TEST_F(GetPathRoot, AliasWithoutSpecObjectRaisesTheNullHandleError) {
  tree.wheel.Withdraw(ZORISpecObject::ClassId());
  EXPECT_THROW(PathOf(tree.wheel), ZORNullVarError);
}

TEST_F(GetPathRoot, AncestorWithoutSpecObjectRaisesTheNullHandleErrorToo) {
  tree.root.Withdraw(ZORISpecObject::ClassId());
  EXPECT_THROW(PathOf(tree.wheel), ZORNullVarError);
}

TEST_F(GetPathRoot, NeitherAliasNorSpecObjectRaisesNothing) {
  tree.wheel.Withdraw(ZORIAlias::ClassId());
  tree.wheel.Withdraw(ZORISpecObject::ClassId());
  EXPECT_EQ("", PathOf(tree.wheel));
}

// Providers

class FakeDocument : public FakeComponent {
 public:
  FakeDocument() {
    Offer(ZORDocument::ClassId(), &document_);
    Offer(ZORIProviders::ClassId(), &providers_);
  }
  ZORDocument* Document() { return &document_; }

  HRESULT addResult = S_OK;
  std::vector<std::pair<IID, ZORBaseUnknown*>> added;
  int providerReferences = 0;  ///< on the provider while it was added
  FakeComponent* watched = nullptr;

 private:
  class ProvidersFacet : public FakeFacet<ZORIProviders> {
   public:
    explicit ProvidersFacet(FakeDocument& inSelf) : FakeFacet(inSelf), self_(inSelf) {}
    HRESULT AddProvider(const IID& inInterface, ZORBaseUnknown* inProvider) override {
      self_.added.emplace_back(inInterface, inProvider);
      if (self_.watched) self_.providerReferences = self_.watched->references;
      return self_.addResult;
    }

   private:
    FakeDocument& self_;
  };
  FakeFacet<ZORDocument> document_{*this};
  ProvidersFacet providers_{*this};
};

class LinkableFacet : public FakeFacet<ZORILinkableObject> {
 public:
  using FakeFacet::FakeFacet;
  ZORDocument* GetDocument() override { return document; }
  ZORDocument* document = nullptr;
};

class RegisterProvider : public testing::Test {
 protected:
  RegisterProvider() {
    provider.Offer(ZORBaseUnknown::ClassId(), &identity);
    provider.Offer(ZORIAlias::ClassId(), &wanted);
    document.watched = &provider;
  }
  ~RegisterProvider() override {
    EXPECT_EQ(0, provider.references);
    EXPECT_EQ(0, document.references);
  }
  void Link(ZORDocument* inDocument) {
    linkable.document = inDocument;
    provider.Offer(ZORILinkableObject::ClassId(), &linkable);
  }
  HRESULT Register(ZORDocument* inDocument) {
    ZORBaseUnknown_var handle(&identity);
    const HRESULT result =
        ZORLyraGeneralServices::RegisterProvider(ZORIAlias::ClassId(), handle, inDocument);
    EXPECT_EQ(&identity, handle.GetInterface());
    return result;
  }

  FakeComponent provider;
  FakeFacet<ZORBaseUnknown> identity{provider};
  FakeFacet<ZORBaseUnknown> wanted{provider};
  LinkableFacet linkable{provider};
  FakeDocument document;
};

TEST_F(RegisterProvider, ProviderIsAddedForTheInterfaceThroughItsIdentity) {
  EXPECT_EQ(S_OK, Register(document.Document()));
  ASSERT_EQ(1u, document.added.size());
  EXPECT_TRUE(ZORIAlias::ClassId() == document.added[0].first);
  EXPECT_EQ(&identity, document.added[0].second);
}

TEST_F(RegisterProvider, BothReferencesAreHeldWhileItIsAdded) {
  Register(document.Document());
  EXPECT_EQ(3, document.providerReferences);  // the caller's handle, the interface, the identity
}

TEST_F(RegisterProvider, AnswerOfTheDocumentIsTheResult) {
  document.addResult = E_INVALIDARG;
  EXPECT_EQ(E_INVALIDARG, Register(document.Document()));
  document.addResult = 1;
  EXPECT_EQ(1, Register(document.Document()));
}

TEST_F(RegisterProvider, NullProviderFails) {
  ZORBaseUnknown_var none;
  EXPECT_EQ(E_FAIL, ZORLyraGeneralServices::RegisterProvider(ZORIAlias::ClassId(), none,
                                                             document.Document()));
  EXPECT_TRUE(document.added.empty());
}

TEST_F(RegisterProvider, WithoutDocumentTheProvidersOwnIsTaken) {
  Link(document.Document());
  EXPECT_EQ(S_OK, Register(nullptr));
  EXPECT_EQ(1u, document.added.size());
}

TEST_F(RegisterProvider, GivenDocumentGoesBeforeTheProvidersOwn) {
  FakeDocument other;
  Link(other.Document());
  EXPECT_EQ(S_OK, Register(document.Document()));
  EXPECT_TRUE(other.added.empty());
  EXPECT_FALSE(provider.WasAskedFor(ZORILinkableObject::ClassId()));
}

TEST_F(RegisterProvider, WithoutDocumentAProviderThatIsNotLinkableFails) {
  EXPECT_EQ(E_FAIL, Register(nullptr));
  EXPECT_TRUE(document.added.empty());
}

TEST_F(RegisterProvider, WithoutDocumentAProviderInNoDocumentFails) {
  Link(nullptr);
  EXPECT_EQ(E_FAIL, Register(nullptr));
}

TEST_F(RegisterProvider, DocumentThatTakesNoProvidersFails) {
  document.Withdraw(ZORIProviders::ClassId());
  EXPECT_EQ(E_FAIL, Register(document.Document()));
  EXPECT_FALSE(provider.WasAskedFor(ZORIAlias::ClassId()));
}

TEST_F(RegisterProvider, ProviderWithoutTheInterfaceFails) {
  provider.Withdraw(ZORIAlias::ClassId());
  EXPECT_EQ(E_FAIL, Register(document.Document()));
  EXPECT_TRUE(document.added.empty());
}

TEST_F(RegisterProvider, ProviderThatAnswersSuccessWithNothingFails) {
  provider.AnswerWith(ZORIAlias::ClassId(), S_OK, nullptr);
  EXPECT_EQ(E_FAIL, Register(document.Document()));
  EXPECT_TRUE(document.added.empty());
}

TEST_F(RegisterProvider, ProviderThatAnswersAnotherSuccessIsAdded) {
  provider.AnswerWith(ZORIAlias::ClassId(), 1, &wanted);
  EXPECT_EQ(S_OK, Register(document.Document()));
}

TEST_F(RegisterProvider, ProviderWithoutIdentityFailsAndGivesTheInterfaceBack) {
  provider.Withdraw(ZORBaseUnknown::ClassId());
  EXPECT_EQ(E_FAIL, Register(document.Document()));
  EXPECT_TRUE(provider.WasAskedFor(ZORIAlias::ClassId()));
  EXPECT_TRUE(document.added.empty());
}

TEST_F(RegisterProvider, IdentityThatIsNothingFailsAndGivesTheInterfaceBack) {
  provider.AnswerWith(ZORBaseUnknown::ClassId(), S_OK, nullptr);
  EXPECT_EQ(E_FAIL, Register(document.Document()));
  EXPECT_TRUE(document.added.empty());
}

}  // namespace
