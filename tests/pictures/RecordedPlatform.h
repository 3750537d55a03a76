// A platform that draws nothing and writes down what it is asked.
#ifndef ZOR_TESTS_PICTURES_RECORDED_PLATFORM_H
#define ZOR_TESTS_PICTURES_RECORDED_PLATFORM_H

#include <functional>
#include <string>

#include "platform/visualisation/ZOR3DRep.h"
#include "platform/visualisation/ZOR3DViewpoint.h"

/// What this program's print images, pixel images and representation paths did and shall do. They
/// take the place of the platform's.
struct RecordedPlatform {
  /// What happened, in order, each followed by a semicolon.
  std::string calls;
  bool canRasterize = true;
  HRESULT pathResult = S_OK;
  bool givesPath = true;
  /// The scene of each picture, such as "((a)(b)c)": brackets are bags, names test
  /// representations.
  std::string scenes;
  /// From where the last picture was taken.
  ZORMathVector eye;
  double focusDistance = 0;
  /// What the builder finds for a product and a path text.
  std::function<ZORRep*(const std::string& inPath)> findRep;

  void Note(const std::string& inCall) { calls += inCall + ";"; }
};

extern RecordedPlatform recorded;

/// A representation with a name that notes its end.
class NamedRep : public ZOR3DRep {
 public:
  explicit NamedRep(const std::string& inName, double inRadius = 1)
      : name_(inName), radius_(inRadius) {}
  const std::string& GetName() const { return name_; }
  ZOR3DBoundingSphere GetShowBoundingElement() const override { return {{}, radius_}; }
  void Accept(ZOR3DSceneVisitor&) const override {}

 private:
  ~NamedRep() override { recorded.Note(name_ + " destroyed"); }

  std::string name_;
  double radius_;
};

#endif
