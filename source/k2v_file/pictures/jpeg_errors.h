// Errors of the JPEG library. It leaves by a jump to where the coding began, so nothing that has a destructor may come
// to life between there and here.
#pragma once

#include <csetjmp>
#include <cstdio>

#include <jpeglib.h>

#include <jerror.h>

#include "torvane/types.h"

namespace _torvane_
{

struct JpegErrors
{
  jpeg_error_mgr manager; // first: its address is what the library hands back
  std::jmp_buf target;
};

// Messages go nowhere.
inline void DropJpegMessage(j_common_ptr) {}

[[noreturn]] inline void LeaveJpeg(j_common_ptr jpeg)
{
  jpeg->err->output_message(jpeg);
  auto* errors = reinterpret_cast<JpegErrors*>(jpeg->err);
  jpeg_destroy(jpeg);
  std::longjmp(errors->target, 1);
}

// The caller sets `target` before it calls the JPEG library.
inline jpeg_error_mgr* SetUpJpegErrors(JpegErrors& errors)
{
  jpeg_error_mgr* manager = jpeg_std_error(&errors.manager);
  manager->error_exit = LeaveJpeg;
  manager->output_message = DropJpegMessage;
  return manager;
}

inline constexpr LLong kJpegBufferSize = 4096; // between the JPEG library and a file

} // namespace _torvane_
