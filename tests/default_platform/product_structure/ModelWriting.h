// Small models written by the geometry kernel, for readers to open.
#ifndef ZOR_TESTS_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELWRITING_H
#define ZOR_TESTS_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODELWRITING_H

#include <string>

namespace products {

/// Writers write one assembly, "frame", in millimetres: "block_1", moved by (-100, 0, 0), and
/// "block_2", turned by 90 degrees around z and then moved by (100, 50, 0), are instances of
/// "block", a box of 10 by 20 by 30 with a corner in its origin, (0, 128, 255) but for one yellow
/// face; "ball_1", moved by (0, 0, 60), is one of "ball", a sphere with a radius of 5, (255, 0, 0).

struct StepKind {
  const char* schema = "AP214IS";  ///< AP203, AP214IS or AP242DIS
  const char* unit = "MM";         ///< of the numbers in the file: MM, M or INCH
  bool isSplit = false;            ///< each part in a file of its own beside the first
};

/// These raise std::runtime_error when the kernel cannot write the file.
void WriteStep(const std::string& inPath, const StepKind& inKind);
/// Writes a part "pair" of two cubes without names, with sides of 10, the second moved by
/// (20, 0, 0).
void WriteStepOfTwoSolids(const std::string& inPath);
/// @param inUnit MM, M or INCH
void WriteIges(const std::string& inPath, const char* inUnit);

}  // namespace products

#endif
