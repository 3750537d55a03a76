// The picture of an interference: scene, colours, view and the pictures beside it.
#include "PrintPictures.h"

#include <gtest/gtest.h>

#include "default_platform/system/ObjectCounters.h"
#include "pictures/FakeObjects.h"
#include "support/AbandonedMemory.h"
#include "support/PlatformFolder.h"

namespace {

class Interferences : public testing::Test {
 protected:
  Interferences() {
    recorded = {};
    recorded.findRep = [this](const std::string& inPath) -> ZORRep* {
      return inPath == "a" ? first.rep : second.rep;
    };
  }
  void Print(const ZORISiInterference_var& inInterference, const char* inPath = "itf.png",
             const char* inFormat = "PNG", int inViewMode = 0, int inKeepBackground = 1) {
    PrintPictures::PrintListVisuToFile(first.Handle(), "a", second.Handle(), "b", inInterference,
                                       inPath, inFormat, 300, 200, inViewMode, inKeepBackground);
  }
  void Print() { Print(clash.Handle()); }
  bool Happened(const std::string& inCalls) const {
    return recorded.calls.find(inCalls) != std::string::npos;
  }
  /// Where the eye is when a sphere around the origin is framed.
  static double EyeFraming(double inRadius) {
    ZOR3DViewpoint framed;
    framed.Reframe(300, 200, 1, 1, {{}, inRadius});
    return framed.origin.x;
  }
  void AskForParts(const char* inVariable = "TRUE", const char* inMode = "1") {
    wanted.emplace("TRX_VELD_SUBINTERF", inVariable);
    settings.WriteFile("system/Clash.toml", std::string("ModeOfSubInterf = ") + inMode + "\n");
  }

  PictureProduct root{"root"}, group{"group", &root}, first{"a", &group}, second{"b", &root};
  FakeInterference clash;
  support::PlatformFolder settings;
  std::optional<support::ScopedVariable> wanted;
  FakeSubInterference parts[3] = {FakeSubInterference(1), FakeSubInterference(1),
                                  FakeSubInterference(1)};
};

// Scene

TEST_F(Interferences, SceneHoldsFirstProductSecondProductInterference) {
  Print();
  EXPECT_EQ("((a)(b)clash)", recorded.scenes);
}

TEST_F(Interferences, BuilderIsAskedForEachProductByItsPathText) {
  Print();
  EXPECT_TRUE(Happened("builder 0;path of a;"));
  EXPECT_TRUE(Happened("path of b;"));
}

TEST_F(Interferences, NullProductIsNotShown) {
  PrintPictures::PrintListVisuToFile(ZORIProduct_var(), "a", second.Handle(), "b", clash.Handle(),
                                     "itf.png", "PNG", 300, 200, 0, 1);
  EXPECT_EQ("((b)clash)", recorded.scenes);
  EXPECT_FALSE(Happened("path of a;"));
}

TEST_F(Interferences, ProductWithoutVisualisationLeavesAnEmptyPlace) {
  second.Withdraw(ZORI3DGeoVisu::ClassId());
  Print();
  EXPECT_EQ("((a)clash)", recorded.scenes);
}

TEST_F(Interferences, ProductThatIsNotFoundHasAnEmptyBag) {
  recorded.pathResult = E_FAIL;
  Print();
  EXPECT_EQ("(()()clash)", recorded.scenes);
}

TEST_F(Interferences, ProductWithoutPathHasAnEmptyBag) {
  recorded.givesPath = false;
  Print();
  EXPECT_EQ("(()()clash)", recorded.scenes);
}

TEST_F(Interferences, InterferenceWithoutRepresentationIsNotShown) {
  clash.hasRep = false;
  Print();
  EXPECT_EQ("((a)(b))", recorded.scenes);
}

TEST_F(Interferences, NullInterferenceShowsBothProductsFramed) {
  Print(ZORISiInterference_var());
  EXPECT_EQ("((a)(b))", recorded.scenes);
  EXPECT_DOUBLE_EQ(EyeFraming(1), recorded.eye.x);
}

TEST_F(Interferences, EverythingOfThePictureIsReleasedButTheProductsOwn) {
  const auto alive = [](const char* inClass) {
    const ZORDefault::ObjectCounts counts = ZORDefault::CountsOf(inClass);
    return counts.built - counts.released;
  };
  const long bags = alive("ZOR3DBagRep"), viewpoints = alive("ZOR3DViewpoint");
  const long bagsBuilt = ZORDefault::CountsOf("ZOR3DBagRep").built;
  Print();
  EXPECT_EQ(3, ZORDefault::CountsOf("ZOR3DBagRep").built - bagsBuilt);
  EXPECT_EQ(bags, alive("ZOR3DBagRep"));
  EXPECT_EQ(viewpoints, alive("ZOR3DViewpoint"));
  EXPECT_TRUE(Happened("clash destroyed;builder deleted;"));
  EXPECT_FALSE(Happened("a destroyed"));
  EXPECT_FALSE(Happened("b destroyed"));
  EXPECT_EQ(0, first.references);
  EXPECT_EQ(0, clash.references);
}

TEST_F(Interferences, PathsAreLeftToTheirBuilder) {
  Print();
  EXPECT_FALSE(Happened("path deleted"));
}

TEST_F(Interferences, ErrorOfThePlatformReachesTheCallerAndTheSceneEnds) {
  const ZORDefault::ObjectCounts before = ZORDefault::CountsOf("ZOR3DBagRep");
  clash.failsToAnswer = true;
  EXPECT_THROW(Print(), ZORNullVarError);
  const ZORDefault::ObjectCounts after = ZORDefault::CountsOf("ZOR3DBagRep");
  EXPECT_EQ(3, after.built - before.built);
  EXPECT_EQ(3, after.released - before.released);
  EXPECT_TRUE(Happened("clash destroyed;builder deleted;"));
}

// Flags

TEST_F(Interferences, FlagsAreAllSetWhileTheRepresentationIsTakenAndThenGivenBack) {
  Print();
  EXPECT_TRUE(Happened("flags;set flags 1 1 1;representation;set flags 0 1 0;"));
}

TEST_F(Interferences, FlagsAreNotGivenBackWithoutVisualisation) {
  const support::AbandonedMemory abandoned;
  clash.Withdraw(ZORI3DGeoVisu::ClassId());
  Print();
  EXPECT_TRUE(Happened("flags;set flags 1 1 1;"));
  EXPECT_EQ((std::vector<int>{1, 1, 1}), clash.flags);
  EXPECT_EQ("((a)(b))", recorded.scenes);
}

// Colours

TEST_F(Interferences, WithoutImposedColourRepresentationsStayAsTheyAre) {
  first.SetColour(1, 2, 3, false);
  Print();
  EXPECT_EQ("210,210,210,255 0x0", first.ShownColour());
}

TEST_F(Interferences, ImposedColourIsTheProductsOwnWithoutAnAncestors) {
  first.SetColour(1, 2, 3, true);
  second.SetColour(4, 5, 6, true);
  Print();
  EXPECT_EQ("1,2,3,255 0x1004", first.ShownColour());
  EXPECT_EQ("4,5,6,255 0x1004", second.ShownColour());
}

TEST_F(Interferences, HighestAncestorThatImposesItsColourWins) {
  first.SetColour(1, 2, 3, true);
  group.SetColour(4, 5, 6, true);
  root.SetColour(7, 8, 9, true);
  Print();
  EXPECT_EQ("7,8,9,255 0x1004", first.ShownColour());
}

TEST_F(Interferences, AncestorThatDoesNotImposeItsColourIsPassedOver) {
  root.SetColour(7, 8, 9, false);
  group.SetColour(4, 5, 6, true);
  Print();
  EXPECT_EQ("4,5,6,255 0x1004", first.ShownColour());
}

TEST_F(Interferences, ColoursAreAskedFromTheTopDownUntilOneIsFound) {
  group.SetColour(4, 5, 6, true);
  Print();
  EXPECT_TRUE(Happened("path of a;properties of root 11,5,0,0;properties of group 11,5,0,0;path"));
}

TEST_F(Interferences, AncestorWithoutVisualPropertiesDoesNotHideAColourBelow) {
  root.Withdraw(ZORIVisProperties::ClassId());
  first.SetColour(1, 2, 3, true);
  Print();
  EXPECT_EQ("1,2,3,255 0x1004", first.ShownColour());
}

TEST_F(Interferences, ProductWithoutVisualPropertiesHasTheColourOfItsAncestor) {
  first.Withdraw(ZORIVisProperties::ClassId());
  group.SetColour(4, 5, 6, true);
  Print();
  EXPECT_EQ("4,5,6,255 0x1004", first.ShownColour());
}

TEST_F(Interferences, PropertiesThatCannotBeReadGiveNoColour) {
  root.SetColour(7, 8, 9, true);
  root.valuesResult = E_FAIL;
  group.SetColour(4, 5, 6, true);
  Print();
  EXPECT_EQ("4,5,6,255 0x1004", first.ShownColour());
}

// View

TEST_F(Interferences, StoredViewpointIsUsedAsItIs) {
  clash.viewpointAnswer = 1;
  Print();
  EXPECT_EQ(1, recorded.eye.x);
  EXPECT_EQ(2, recorded.eye.y);
  EXPECT_EQ(3, recorded.eye.z);
  EXPECT_TRUE(Happened("write PNG itf.png;"));
}

TEST_F(Interferences, StoredViewpointWritesNoPicturesOfParts) {
  AskForParts();
  clash.viewpointAnswer = 1;
  clash.parts = {&parts[0]};
  Print();
  EXPECT_FALSE(Happened("_SubItf_"));
}

TEST_F(Interferences, AnotherAnswerThanOneIsNoStoredViewpoint) {
  clash.viewpointAnswer = 2;
  Print();
  EXPECT_DOUBLE_EQ(EyeFraming(1), recorded.eye.x);
}

TEST_F(Interferences, WithoutSettingTheInterferenceAloneIsFramed) {
  clash.radius = 0.25;
  Print();
  EXPECT_DOUBLE_EQ(EyeFraming(0.25), recorded.eye.x);
}

TEST_F(Interferences, ZoomZeroFramesTheInterferenceAlone) {
  settings.WriteSettings("ClashPublish", "PictureZoom = 0\n");
  clash.radius = 0.25;
  Print();
  EXPECT_DOUBLE_EQ(EyeFraming(0.25), recorded.eye.x);
}

TEST_F(Interferences, AnyOtherZoomFramesTheProductsToo) {
  clash.radius = 0.25;
  for (const char* const zoom : {"1", "2", "-1"}) {
    settings.WriteSettings("ClashPublish", std::string("PictureZoom = ") + zoom + "\n");
    Print();
    EXPECT_DOUBLE_EQ(EyeFraming(1), recorded.eye.x) << zoom;
  }
}

TEST_F(Interferences, WithoutGeometryTheWholeSceneIsFramed) {
  clash.hasGeometry = false;
  clash.radius = 0.25;
  Print();
  EXPECT_DOUBLE_EQ(EyeFraming(1), recorded.eye.x);
}

TEST_F(Interferences, GeometryWithoutRepresentationFramesTheWholeScene) {
  AskForParts();
  clash.hasRep = false;
  clash.parts = {&parts[0]};
  Print();
  EXPECT_DOUBLE_EQ(EyeFraming(1), recorded.eye.x);
  EXPECT_FALSE(Happened("_SubItf_"));
}

TEST_F(Interferences, FlagsFormatAndSizeReachTheFramedPicture) {
  Print(clash.Handle(), "itf.jpg", "JPEG", 1, 0);
  EXPECT_TRUE(
      Happened("image 300x200;white;mode 1=1;mode 2=0;rasterise;prepare 2;"
               "write JPEG itf.jpg;pixels released;image released;"));
}

TEST_F(Interferences, FramedPictureThatCannotBeDrawnLeavesItsPrintImage) {
  const support::AbandonedMemory abandoned;
  recorded.canRasterize = false;
  Print();
  EXPECT_FALSE(Happened("image released"));
}

TEST_F(Interferences, WholePictureThatCannotBeDrawnReleasesItsPrintImage) {
  recorded.canRasterize = false;
  clash.hasGeometry = false;
  Print();
  EXPECT_TRUE(Happened("rasterise;image released;"));
}

TEST_F(Interferences, GenerateJoinsDirectoryAndNameByOneBackslash) {
  PrintPictures::GeneratePictures(first.Handle(), "a", second.Handle(), "b", clash.Handle(),
                                  "C:\\rep", "itf3.png", "PNG", 30, 20, 1, 0);
  EXPECT_EQ("((a)(b)clash)", recorded.scenes);
  EXPECT_TRUE(Happened("path of a;"));
  EXPECT_TRUE(Happened("path of b;"));
  EXPECT_TRUE(Happened("image 30x20;white;mode 1=1;mode 2=0;"));
  EXPECT_TRUE(Happened("write PNG C:\\rep\\itf3.png;"));
}

// Pictures of parts

TEST_F(Interferences, PartsAreWrittenInThumbnailsWhenBothSwitchesAreOn) {
  AskForParts();
  clash.parts = {&parts[0], &parts[1]};
  Print(clash.Handle(), "C:\\rep\\itf3.png", "JPEG", 1, 0);
  EXPECT_TRUE(
      Happened("image 300x200;white;mode 1=1;mode 2=0;rasterise;prepare 2;"
               "write JPEG C:\\rep\\itf3.png;pixels released;image released;"
               "image 72x50;white;mode 1=1;mode 2=0;rasterise;prepare 2;"
               "write JPEG C:\\rep\\itf3_SubItf_1.png;pixels released;image released;"
               "image 72x50;white;mode 1=1;mode 2=0;rasterise;prepare 2;"
               "write JPEG C:\\rep\\itf3_SubItf_2.png;pixels released;image released;"));
  EXPECT_EQ("((a)(b)clash)((a)(b)clash)((a)(b)clash)", recorded.scenes);
}

TEST_F(Interferences, PartIsSeenThroughItsOwnViewpoint) {
  AskForParts();
  parts[0].eye = {4, 5, 6};
  clash.parts = {&parts[0]};
  Print();
  EXPECT_EQ(4, recorded.eye.x);
}

TEST_F(Interferences, PartsAreNotWrittenForAnotherTextThanTrue) {
  clash.parts = {&parts[0]};
  for (const char* const text : {"true", "TRUE ", " TRUE", "", "1"}) {
    wanted.reset();
    AskForParts(text);
    Print();
    EXPECT_FALSE(Happened("_SubItf_")) << "\"" << text << "\"";
  }
}

TEST_F(Interferences, PartsAreNotWrittenWithoutTheVariable) {
  clash.parts = {&parts[0]};
  settings.WriteFile("system/Clash.toml", "ModeOfSubInterf = 1\n");
  wanted.emplace("TRX_VELD_SUBINTERF", std::nullopt);
  Print();
  EXPECT_FALSE(Happened("_SubItf_"));
}

TEST_F(Interferences, PartsAreNotWrittenForAnotherModeThanOne) {
  clash.parts = {&parts[0]};
  for (const char* const mode : {"0", "2", "-1"}) {
    wanted.reset();
    AskForParts("TRUE", mode);
    Print();
    EXPECT_FALSE(Happened("_SubItf_")) << mode;
  }
}

TEST_F(Interferences, PartsAreNotWrittenWithoutTheMode) {
  AskForParts();
  settings.WriteFile("system/Clash.toml", "# nothing\n");
  clash.parts = {&parts[0]};
  Print();
  EXPECT_FALSE(Happened("_SubItf_"));
}

TEST_F(Interferences, PartsAreNotWrittenWithoutTheSystemSettings) {
  AskForParts();
  settings.WriteFile("system/Clash.toml", "= damaged");
  clash.parts = {&parts[0]};
  Print();
  EXPECT_FALSE(Happened("_SubItf_"));
}

TEST_F(Interferences, PartWithoutViewpointIsSkippedAndTheOthersKeepTheirNumbers) {
  AskForParts();
  parts[1].answer = 0;
  clash.parts = {&parts[0], &parts[1], &parts[2]};
  Print();
  EXPECT_TRUE(Happened("write PNG itf_SubItf_1.png;"));
  EXPECT_FALSE(Happened("itf_SubItf_2"));
  EXPECT_TRUE(Happened("write PNG itf_SubItf_3.png;"));
}

TEST_F(Interferences, AnyAnswerButZeroIsAViewpointOfAPart) {
  AskForParts();
  parts[0].answer = -1;
  clash.parts = {&parts[0]};
  Print();
  EXPECT_TRUE(Happened("write PNG itf_SubItf_1.png;"));
}

TEST_F(Interferences, ObjectThatIsNoPartIsSkipped) {
  AskForParts();
  parts[0].Withdraw(ZORISiSubInterference::ClassId());
  clash.parts = {&parts[0], nullptr, &parts[2]};
  Print();
  EXPECT_FALSE(Happened("itf_SubItf_1"));
  EXPECT_TRUE(Happened("write PNG itf_SubItf_3.png;"));
}

TEST_F(Interferences, CountOfPartsBelowOneWritesNone) {
  AskForParts();
  clash.parts = {&parts[0]};
  for (const int count : {0, -1}) {
    clash.partCount = count;
    Print();
    EXPECT_FALSE(Happened("_SubItf_")) << count;
  }
}

TEST_F(Interferences, CountOfPartsBeyondTheListRaisesTheFatalError) {
  AskForParts();
  clash.parts = {&parts[0]};
  clash.partCount = 2;
  EXPECT_THROW(Print(), ZORFatalError);
}

TEST_F(Interferences, PathWithoutPngGivesAllPartsOneName) {
  AskForParts();
  clash.parts = {&parts[0], &parts[1]};
  Print(clash.Handle(), "itf.jpg", "JPEG");
  const std::string name = "write JPEG itf.jpg.png;";
  const auto one = recorded.calls.find(name);
  ASSERT_NE(std::string::npos, one);
  EXPECT_NE(std::string::npos, recorded.calls.find(name, one + 1));
}

TEST_F(Interferences, EveryPngInThePathIsReplaced) {
  AskForParts();
  clash.parts = {&parts[0]};
  Print(clash.Handle(), "rep.png\\itf.png");
  EXPECT_TRUE(Happened("write PNG rep_SubItf_1\\itf_SubItf_1.png;"));
}

TEST_F(Interferences, EachPartHasAViewpointOfItsOwn) {
  AskForParts();
  const ZORDefault::ObjectCounts before = ZORDefault::CountsOf("ZOR3DViewpoint");
  clash.parts = {&parts[0], &parts[1]};
  Print();
  const ZORDefault::ObjectCounts after = ZORDefault::CountsOf("ZOR3DViewpoint");
  // The picture's and each part's, and one of every print image.
  EXPECT_EQ(6, after.built - before.built);
  EXPECT_EQ(6, after.released - before.released);
}

}  // namespace
