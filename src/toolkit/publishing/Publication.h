// A clash result published as a folder: a page, a report and pictures.
#ifndef ZOR_TOOLKIT_PUBLISHING_PUBLICATION_H
#define ZOR_TOOLKIT_PUBLISHING_PUBLICATION_H

#include <cstddef>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "toolkit/publishing/PictureOptions.h"
#include "toolkit/records/RecordFilter.h"
#include "toolkit/review/Diff.h"
#include "toolkit/scenes/InterferenceScenes.h"

namespace ZORToolkit {

class SharedDrawing;

/// What is framed where an interference has no viewpoint; values of the setting "PictureZoom".
enum class PictureZoom { kInterference = 0, kProducts = 1 };

/// What is published, where, and how it is drawn.
struct PublicationOptions {
  std::string folder;      ///< made where it is missing; the path of the page when isOneFile
  bool isOneFile = false;  ///< pictures, geometry and the result stand in the page
  std::string source;      ///< the bytes of the result; empty: the page cannot give it back
  std::string sourceName;  ///< the name of its file
  std::string filterText;  ///< what the filter was made from, for the manifest
  std::string language;    ///< that was asked for, for the manifest
  std::string styleSheet;  ///< path; empty: the setting "XslTemplate", without it the page's own
  RecordFilter filter;
  /// An older result: each interference says what became of it since. Lives as long as the call.
  ClashDocument* baseline = nullptr;
  std::string baselineSource;  ///< its bytes, for the manifest
  std::string baselineName;    ///< the name of its file
  DiffOptions comparison;
  /// The root of the model that the baseline's pictures show; empty: that of the result.
  std::function<ZORIProduct_var()> openBaselineModel;
  std::string model;        ///< path of the model that the pictures show; empty: no pictures
  bool hasGeometry = true;  ///< the page can turn what its pictures show
  PictureFormat format = PictureFormat::kJpeg;
  bool isCompact = false;  ///< in one file: pictures of PNG stand there as WebP
  PictureSize size;
  std::optional<PictureZoom> zoom;  ///< nothing: the setting "PictureZoom"
  ProductPlaces places = ProductPlaces::kResult;
  int processes = 1;    ///< that draw; at least 1
  bool resume = false;  ///< keep the pictures of a run that was ended early
  /// Who draws which pictures, where others take part; lives as long as the call. May be null.
  SharedDrawing* sharing = nullptr;
  /// Called with one line for what is shown otherwise than expected. May be empty.
  std::function<void(const std::string& inWarning)> warn;
  /// Called with the numbers of interferences that are drawn and of all. May be empty.
  std::function<void(std::size_t inDone, std::size_t inAll)> drawn;
};

/// Publishes into a folder, or into one file where the path ends in ".html" and is no folder.
ZOR_TOOLKIT_EXPORT void SetTarget(PublicationOptions& ioOptions, const std::string& inPath);
/// The name of a file without its folder, UTF-8.
ZOR_TOOLKIT_EXPORT std::string FileNameOf(const std::string& inPath);

/// What a publication holds.
struct Published {
  std::string page;  ///< path of the page; of the folder where none was to be made
  std::size_t interferences = 0;
  std::size_t pictures = 0;  ///< interferences with one
  std::size_t failures = 0;  ///< without one although the model has one of their products
};

/// What has changed since a publication was made, a line each: its result, its model, its settings,
/// the version, a file that is missing or another. Empty when nothing has.
/// @param inOptions those that would make it now; without a source only its files are looked at.
/// Raises Error and ZORFoundation::FileError where there is none.
ZOR_TOOLKIT_EXPORT std::vector<std::string> VerifyPublication(const PublicationOptions& inOptions);

/// Publishes the interferences of a result that a filter accepts. Pictures are drawn in processes
/// that start as copies of this one, which runs no other thread; a termination signal is raised as
/// ZORFoundation::Interrupted.
/// @param ioResult    becomes the result that is published: the other interferences leave it, and
/// it
///                    refers to the pictures of the publication alone.
/// @param inOpenModel answers the root of the model; called once, if there is one.
/// Raises Error and what inOpenModel raises; pictures that are whole stay.
ZOR_TOOLKIT_EXPORT Published Publish(ClashDocument& ioResult, const PublicationOptions& inOptions,
                                     const std::function<ZORIProduct_var()>& inOpenModel);

}  // namespace ZORToolkit

#endif
