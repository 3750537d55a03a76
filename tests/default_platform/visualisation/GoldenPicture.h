// Whole pictures against those that were looked at and kept.
#ifndef ZOR_TESTS_DEFAULT_PLATFORM_VISUALISATION_GOLDENPICTURE_H
#define ZOR_TESTS_DEFAULT_PLATFORM_VISUALISATION_GOLDENPICTURE_H

#include <string>

#include "default_platform/visualisation/Pictures.h"

namespace pictures {

/// Fails the test unless a picture is the golden one of that name, but for the roundings of another
/// processor; the picture and its difference are left in the build tree then. With
/// ZOR_RENEW_GOLDEN=1 the picture becomes the golden one.
void CompareWithGolden(const std::string& inName, const Picture& inActual);

}  // namespace pictures

#endif
