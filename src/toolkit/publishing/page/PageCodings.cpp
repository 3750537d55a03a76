#include <meshoptimizer.h>
#include <nettle/base64.h>
#include <nettle/sha2.h>
#include <png.h>
#include <webp/encode.h>
#include <zlib.h>

#include <algorithm>
#include <new>
#include <vector>

#include "toolkit/publishing/page/PageMaker.h"

namespace ZORToolkit {
namespace {

const std::uint8_t* BytesOf(std::string_view inBytes) {
  return reinterpret_cast<const std::uint8_t*>(inBytes.data());
}

constexpr int kGzip = 15 + 16;            // the largest window, in the format of gzip
constexpr std::size_t kPiece = 1U << 30;  // what zlib takes at once

Bytef* ZlibBytes(std::string_view inBytes) {
  return const_cast<Bytef*>(reinterpret_cast<const Bytef*>(inBytes.data()));  // it only reads them
}

}  // namespace

std::string Sha256(std::string_view inBytes) {
  sha256_ctx context;
  sha256_init(&context);
  sha256_update(&context, inBytes.size(), BytesOf(inBytes));
  std::string digest(SHA256_DIGEST_SIZE, '\0');
  sha256_digest(&context, digest.size(), reinterpret_cast<std::uint8_t*>(digest.data()));
  return digest;
}

std::string Base64(std::string_view inBytes) {
  std::string text(BASE64_ENCODE_RAW_LENGTH(inBytes.size()), '\0');
  base64_encode_raw(text.data(), inBytes.size(), BytesOf(inBytes));
  return text;
}

bool FromBase64(std::string_view inText, std::string& outBytes) {
  base64_decode_ctx context;
  base64_decode_init(&context);
  std::string bytes(BASE64_DECODE_LENGTH(inText.size()), '\0');
  std::size_t length = bytes.size();
  if (base64_decode_update(&context, &length, reinterpret_cast<std::uint8_t*>(bytes.data()),
                           inText.size(), inText.data()) == 0 ||
      base64_decode_final(&context) == 0)
    return false;
  bytes.resize(length);
  outBytes = std::move(bytes);
  return true;
}

// The header has no time and no name, so that equal bytes stay equal.
std::string Gzip(std::string_view inBytes) {
  z_stream stream{};
  if (deflateInit2(&stream, Z_BEST_COMPRESSION, Z_DEFLATED, kGzip, MAX_MEM_LEVEL,
                   Z_DEFAULT_STRATEGY) != Z_OK)
    throw std::bad_alloc();
  std::string packed(deflateBound(&stream, inBytes.size()), '\0');
  std::size_t taken = 0, made = 0;
  for (int state = Z_OK; state == Z_OK;) {
    stream.next_in = ZlibBytes(inBytes.substr(taken));
    stream.avail_in = static_cast<uInt>(std::min(inBytes.size() - taken, kPiece));
    stream.next_out = ZlibBytes(std::string_view(packed).substr(made));
    stream.avail_out = static_cast<uInt>(std::min(packed.size() - made, kPiece));
    const uInt in = stream.avail_in, out = stream.avail_out;
    state = deflate(&stream, taken + in == inBytes.size() ? Z_FINISH : Z_NO_FLUSH);
    taken += in - stream.avail_in;
    made += out - stream.avail_out;
  }
  deflateEnd(&stream);
  packed.resize(made);
  return packed;
}

bool Gunzip(std::string_view inBytes, std::size_t inMaxSize, std::string& outBytes) {
  z_stream stream{};
  if (inBytes.size() > kPiece || inflateInit2(&stream, kGzip) != Z_OK) return false;
  stream.next_in = ZlibBytes(inBytes);
  stream.avail_in = static_cast<uInt>(inBytes.size());
  std::string bytes, piece(1U << 20, '\0');
  int state = Z_OK;
  while (state == Z_OK && bytes.size() <= inMaxSize) {
    stream.next_out = ZlibBytes(piece);
    stream.avail_out = static_cast<uInt>(piece.size());
    state = inflate(&stream, Z_NO_FLUSH);
    bytes.append(piece, 0, piece.size() - stream.avail_out);
  }
  inflateEnd(&stream);
  if (state != Z_STREAM_END || bytes.size() > inMaxSize) return false;
  outBytes = std::move(bytes);
  return true;
}

std::string WebpFromPng(std::string_view inPng) {
  constexpr float kQuality = 82;  // edges of surfaces stay clean
  png_image image{};
  image.version = PNG_IMAGE_VERSION;
  if (png_image_begin_read_from_memory(&image, inPng.data(), inPng.size()) == 0) return {};
  image.format = PNG_FORMAT_RGB;
  std::vector<std::uint8_t> pixels(PNG_IMAGE_SIZE(image));
  const png_color white{255, 255, 255};
  if (png_image_finish_read(&image, &white, pixels.data(), 0, nullptr) == 0) return {};
  std::uint8_t* bytes = nullptr;
  const std::size_t size =
      WebPEncodeRGB(pixels.data(), static_cast<int>(image.width), static_cast<int>(image.height),
                    static_cast<int>(PNG_IMAGE_ROW_STRIDE(image)), kQuality, &bytes);
  std::string webp(reinterpret_cast<const char*>(bytes), size);
  WebPFree(bytes);
  return webp;
}

void ReorderTriangles(std::vector<std::uint32_t>& ioCorners, std::size_t inPoints) {
  if (ioCorners.empty()) return;
  meshopt_optimizeVertexCache(ioCorners.data(), ioCorners.data(), ioCorners.size(), inPoints);
}

float SimplifyMesh(const std::vector<std::array<float, 3>>& inPoints,
                   std::vector<std::uint32_t>& ioCorners, double inShare) {
  constexpr float kMaxError = 0.05F;
  if (ioCorners.empty()) return 0;
  const auto target = static_cast<std::size_t>(static_cast<double>(ioCorners.size()) * inShare);
  float error = 0;
  const std::size_t left = meshopt_simplify(ioCorners.data(), ioCorners.data(), ioCorners.size(),
                                            inPoints.front().data(), inPoints.size(),
                                            sizeof inPoints.front(), target, kMaxError, 0, &error);
  ioCorners.resize(left);
  return error;
}

}  // namespace ZORToolkit
