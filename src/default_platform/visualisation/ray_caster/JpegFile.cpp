#include <csetjmp>
#include <cstdio>
#include <cstdlib>
#include <memory>

#include "default_platform/visualisation/ray_caster/DrawPicture.h"
// After <cstdio>, which it needs.
#include <jpeglib.h>

namespace ZORRayCaster {
namespace {

constexpr int kQuality = 92;

struct ErrorHandler {
  jpeg_error_mgr manager;
  std::jmp_buf back;
};

[[noreturn]] void GoBack(j_common_ptr inCompressor) {
  // The manager is the handler's first member, and the compressor was given that.
  std::longjmp(reinterpret_cast<ErrorHandler*>(inCompressor->err)->back, 1);
}

/// The compressor with its output. Only plain data, so that an error may jump over it.
struct Compressor {
  jpeg_compress_struct state;
  ErrorHandler errors;
  unsigned char* bytes = nullptr;
  unsigned long size = 0;

  ~Compressor() {
    jpeg_destroy_compress(&state);
    std::free(bytes);
  }
};

bool Compress(Compressor& ioCompressor, int inWidth, int inHeight, const std::uint8_t* inPixels) {
  jpeg_compress_struct& state = ioCompressor.state;
  state.err = jpeg_std_error(&ioCompressor.errors.manager);
  ioCompressor.errors.manager.error_exit = &GoBack;
  jpeg_create_compress(&state);
  if (setjmp(ioCompressor.errors.back) != 0) return false;
  jpeg_mem_dest(&state, &ioCompressor.bytes, &ioCompressor.size);
  state.image_width = static_cast<JDIMENSION>(inWidth);
  state.image_height = static_cast<JDIMENSION>(inHeight);
  state.input_components = 3;
  state.in_color_space = JCS_RGB;
  jpeg_set_defaults(&state);
  jpeg_set_quality(&state, kQuality, TRUE);
  // Full colour resolution: thin coloured lines stay crisp.
  for (int i = 0; i < state.num_components; ++i)
    state.comp_info[i].h_samp_factor = state.comp_info[i].v_samp_factor = 1;
  state.optimize_coding = TRUE;
  jpeg_start_compress(&state, TRUE);
  while (state.next_scanline < state.image_height) {
    JSAMPROW row =
        const_cast<JSAMPROW>(inPixels) + std::size_t{3} * state.image_width * state.next_scanline;
    jpeg_write_scanlines(&state, &row, 1);
  }
  jpeg_finish_compress(&state);
  return true;
}

}  // namespace

std::string JpegFile(int inWidth, int inHeight, const std::uint8_t* inPixels) {
  const auto compressor = std::make_unique<Compressor>();
  if (!Compress(*compressor, inWidth, inHeight, inPixels)) return {};
  const unsigned char* const bytes = compressor->bytes;
  return std::string(bytes, bytes + compressor->size);
}

}  // namespace ZORRayCaster
