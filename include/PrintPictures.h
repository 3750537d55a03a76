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

/// Renders pictures of interferences: the two products, each in the colour imposed on it if any,
/// and the interference itself. Static operations, without state but for the colour and inheritance
/// mode set on a product's representation. Nothing is reported: what is missing is left out of the
/// picture, and what cannot be rendered writes no file. Errors that the platform raises reach the
/// caller, also those of taking the scene apart; of several errors the first arrives.
///
/// Shared arguments:
/// - the path text of a product: the key by which the platform's ZORLyraRepPathBuilder finds its
///   representation;
/// - inFormat: an image format that the platform knows, such as "JPEG" or "PNG", whatever the file
///   name's extension;
/// - inWidth, inHeight: in pixels, within the platform's limits;
/// - inViewMode: 1: surfaces shaded and hidden edges off; any other value: the platform's defaults;
/// - inKeepBackground: 0: white; any other value: the platform's own background.
class ZOR_LYRA_EXPORT PrintPictures {
 public:
  /// Renders an interference into the file whose path is the directory, a backslash and the file
  /// name, on every system and whatever the directory ends in. See PrintListVisuToFile.
  static void GeneratePictures(ZORIProduct_var inFirst, ZORUnicodeString inFirstPath,
                               ZORIProduct_var inSecond, ZORUnicodeString inSecondPath,
                               ZORISiInterference_var inInterference, ZORUnicodeString inDirectory,
                               ZORUnicodeString inFileName, ZORUnicodeString inFormat, int inWidth,
                               int inHeight, int inViewMode, int inKeepBackground);
  /// Renders one product into a file named in the same way. See PrintListVisuToFilePreview.
  static void GeneratePicturesPreview(ZORIProduct_var inProduct, ZORUnicodeString inPath,
                                      ZORUnicodeString inDirectory, ZORUnicodeString inFileName,
                                      ZORUnicodeString inFormat, int inWidth, int inHeight,
                                      int inViewMode, int inKeepBackground);
  /// Renders an interference through its stored viewpoint. Without one the picture is framed: on
  /// the interference alone when the setting "PictureZoom" of "ClashPublish" is 0 or missing, else
  /// on the whole scene; always on the whole scene when the interference is null or has no
  /// geometry. A product that is null or offers no ZORI3DGeoVisu is not shown.
  ///
  /// A picture framed because the interference has geometry is accompanied by thumbnails of 72 by
  /// 50 pixels, one for each sub-interference that has a viewpoint, if the environment variable
  /// "TRX_VELD_SUBINTERF" is "TRUE" and the attribute "ModeOfSubInterf" of the system settings
  /// "Clash" is 1. The i-th file is named like the picture, every ".png" replaced by "_SubItf_" and
  /// i, with ".png" appended.
  ///
  /// If the interference offers no ZORI3DGeoVisu, all its flags stay set and the array of its former
  /// flags is abandoned.
  static void PrintListVisuToFile(ZORIProduct_var inFirst, ZORUnicodeString inFirstPath,
                                  ZORIProduct_var inSecond, ZORUnicodeString inSecondPath,
                                  ZORISiInterference_var inInterference,
                                  ZORUnicodeString inImagePath, ZORUnicodeString inFormat,
                                  int inWidth, int inHeight, int inViewMode, int inKeepBackground);
  /// Renders one product, framed as a whole. A null product writes no file.
  static void PrintListVisuToFilePreview(ZORIProduct_var inProduct, ZORUnicodeString inPath,
                                         ZORUnicodeString inImagePath, ZORUnicodeString inFormat,
                                         int inWidth, int inHeight, int inViewMode,
                                         int inKeepBackground);
  /// Renders a scene, framed as a whole. A null scene writes no file.
  /// @param inScene a ZOR3DRep.
  static void TakeRepImage(ZORRep* inScene, ZORUnicodeString inImagePath, ZORUnicodeString inFormat,
                           int inWidth, int inHeight, int inViewMode, int inKeepBackground);
  /// The same through a viewpoint instead of framed. A print image that cannot be rasterised is not
  /// released.
  /// @param inViewpoint never null; copied.
  static void TakeRepImage(ZORRep* inScene, ZORUnicodeString inImagePath,
                           ZOR3DViewpoint* inViewpoint, ZORUnicodeString inFormat, int inWidth,
                           int inHeight, int inViewMode, int inKeepBackground);

 private:
  /// The colour that the highest ancestor imposes, else the product itself.
  static HRESULT RetrieveColor(ZORIProduct_var inProduct, int& outFound, unsigned int& outRed,
                               unsigned int& outGreen, unsigned int& outBlue);
  /// Note the order: here the flags precede the size.
  static void PrintSubInterferenceImage(ZORRep* inScene, ZORISiInterference_var& inInterference,
                                        ZORUnicodeString inImagePath, ZORUnicodeString inFormat,
                                        int inViewMode, int inKeepBackground, int inWidth,
                                        int inHeight);
};

#endif
