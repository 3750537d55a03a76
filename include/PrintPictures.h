// Pictures of interferences.
#ifndef ZOR_PRINT_PICTURES_H
#define ZOR_PRINT_PICTURES_H

#include "ZORLyraExport.h"
#include "platform/product_structure/ZORIProduct.h"
#include "platform/space_analysis/ZORISiInterference.h"
#include "platform/system/ZORResult.h"
#include "platform/system/ZORUnicodeString.h"

class ZOR3DViewpoint;
class ZORRep;

/// Takes pictures of interferences: the two products, each in the colour that is imposed on it if
/// any, and the interference itself. Only static operations; nothing is kept between two calls but
/// the colour and inheritance mode given to a product's representation, and nothing is reported:
/// what is missing is missing in the picture, and what cannot be drawn writes no file. Errors that
/// the platform raises reach the caller.
///
/// Arguments that operations share:
/// - the path text of a product: what the platform's ZORLyraRepPathBuilder finds its representation
///   by;
/// - inFormat: the picture's format by a name that the platform knows, such as "JPEG" or "PNG",
///   whatever the file's name ends in;
/// - inWidth, inHeight: in pixels, as the platform can draw them;
/// - inViewMode: 1: surfaces shaded and hidden edges off; any other value: as the platform draws at
///   first;
/// - inKeepBackground: 0: white; any other value: the platform's own background.
class ZOR_LYRA_EXPORT PrintPictures {
 public:
  /// The picture of an interference, into the file that the directory, a backslash and the file
  /// name give, whatever the directory ends in. See PrintListVisuToFile.
  static void GeneratePictures(ZORIProduct_var inFirst, ZORUnicodeString inFirstPath,
                               ZORIProduct_var inSecond, ZORUnicodeString inSecondPath,
                               ZORISiInterference_var inInterference, ZORUnicodeString inDirectory,
                               ZORUnicodeString inFileName, ZORUnicodeString inFormat, int inWidth,
                               int inHeight, int inViewMode, int inKeepBackground);
  /// The picture of one product, into a file named in the same way. See PrintListVisuToFilePreview.
  static void GeneratePicturesPreview(ZORIProduct_var inProduct, ZORUnicodeString inPath,
                                      ZORUnicodeString inDirectory, ZORUnicodeString inFileName,
                                      ZORUnicodeString inFormat, int inWidth, int inHeight,
                                      int inViewMode, int inKeepBackground);
  /// The picture of an interference. Without its own viewpoint it is framed: the interference alone
  /// when the setting "PictureZoom" of "ClashPublish" is 0 or missing, else the products too; all
  /// that is shown when the interference has no geometry, or is null. A product that is null or
  /// offers no ZORI3DGeoVisu is not shown.
  ///
  /// Beside a picture that is framed because the interference has geometry, a picture of 72 by 50
  /// pixels is written of each sub-interference that has a viewpoint, when the environment variable
  /// "TRX_VELD_SUBINTERF" is "TRUE" and the attribute "ModeOfSubInterf" of the system settings
  /// "Clash" is 1. The i-th one's file is named like the picture, with "_SubItf_" and i in the
  /// place of every ".png", and ".png" at the end.
  ///
  /// Where the interference offers no ZORI3DGeoVisu its flags stay all set, and the array of its
  /// former flags is abandoned.
  static void PrintListVisuToFile(ZORIProduct_var inFirst, ZORUnicodeString inFirstPath,
                                  ZORIProduct_var inSecond, ZORUnicodeString inSecondPath,
                                  ZORISiInterference_var inInterference,
                                  ZORUnicodeString inImagePath, ZORUnicodeString inFormat,
                                  int inWidth, int inHeight, int inViewMode, int inKeepBackground);
  /// The picture of one product, all of it framed. A null product writes no file.
  static void PrintListVisuToFilePreview(ZORIProduct_var inProduct, ZORUnicodeString inPath,
                                         ZORUnicodeString inImagePath, ZORUnicodeString inFormat,
                                         int inWidth, int inHeight, int inViewMode,
                                         int inKeepBackground);
  /// The picture of a scene, all of it framed. A null scene writes no file.
  /// @param inScene a ZOR3DRep.
  static void TakeRepImage(ZORRep* inScene, ZORUnicodeString inImagePath, ZORUnicodeString inFormat,
                           int inWidth, int inHeight, int inViewMode, int inKeepBackground);
  /// The same through a viewpoint instead of framed; a print image that cannot be rasterised is not
  /// released.
  /// @param inViewpoint never null; copied.
  static void TakeRepImage(ZORRep* inScene, ZORUnicodeString inImagePath,
                           ZOR3DViewpoint* inViewpoint, ZORUnicodeString inFormat, int inWidth,
                           int inHeight, int inViewMode, int inKeepBackground);

 private:
  class ShownProduct;
  class Scene;

  /// The colour that the highest ancestor imposes, else the product itself.
  static HRESULT RetrieveColor(ZORIProduct_var inProduct, int& outFound, unsigned int& outRed,
                               unsigned int& outGreen, unsigned int& outBlue);
  /// The flags come before the size here, unlike everywhere else.
  static void PrintSubInterferenceImage(ZORRep* inScene, ZORISiInterference_var& inInterference,
                                        ZORUnicodeString inImagePath, ZORUnicodeString inFormat,
                                        int inViewMode, int inKeepBackground, int inWidth,
                                        int inHeight);
};

#endif
