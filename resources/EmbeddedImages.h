#pragma once

#include <cstddef>

// The program's images, held in the program as PNG data. Decode them with
// CUGetBitmapFromMemory(image.data, image.length). All are 16 x 16 unless said.
namespace wyx::images
{

struct EmbeddedImage
{
    const unsigned char* data;
    std::size_t length;
};

// RGBA: one wheel turned a twelfth further in each frame, frame 0 first.
extern const EmbeddedImage busyWheel[12];
// RGB on magenta (255, 0, 255), to be masked: 0 points up (ascending), 1 down.
extern const EmbeddedImage sortMarks[2];
// RGB, 1 x 23: the strip behind the list header.
extern const EmbeddedImage headerStrip;
// RGBA: the mark of a failed job.
extern const EmbeddedImage warning;
// RGBA: the "Clear All" command.
extern const EmbeddedImage clearAll;
// RGBA, the notebook's tab images: 0 hot folder, 1 Status, 2 Log.
extern const EmbeddedImage tabImages[3];

} // namespace wyx::images
