#pragma once

#include <wx/bitmap.h>

#include <cstddef>

// Decodes PNG data held in memory. Data that is not a PNG image (or null, or
// empty) gives an invalid bitmap.
wxBitmap CUGetBitmapFromMemory(const void* data, std::size_t length);
