#include "resources/EmbeddedImages.h"

namespace
{
#include "EmbeddedImageData.inc"
} // namespace

namespace wyx::images
{

#define WYX_IMAGE(symbol)                                                                                    \
    EmbeddedImage                                                                                            \
    {                                                                                                        \
        symbol, sizeof(symbol)                                                                               \
    }

const EmbeddedImage busyWheel[12] = {WYX_IMAGE(busy_00_png), WYX_IMAGE(busy_01_png), WYX_IMAGE(busy_02_png),
                                     WYX_IMAGE(busy_03_png), WYX_IMAGE(busy_04_png), WYX_IMAGE(busy_05_png),
                                     WYX_IMAGE(busy_06_png), WYX_IMAGE(busy_07_png), WYX_IMAGE(busy_08_png),
                                     WYX_IMAGE(busy_09_png), WYX_IMAGE(busy_10_png), WYX_IMAGE(busy_11_png)};
const EmbeddedImage sortMarks[2] = {WYX_IMAGE(sort_ascending_png), WYX_IMAGE(sort_descending_png)};
const EmbeddedImage headerStrip = WYX_IMAGE(header_strip_png);
const EmbeddedImage warning = WYX_IMAGE(warning_png);
const EmbeddedImage clearAll = WYX_IMAGE(clear_all_png);
const EmbeddedImage tabImages[3] = {WYX_IMAGE(tab_folder_png), WYX_IMAGE(tab_status_png),
                                    WYX_IMAGE(tab_log_png)};

#undef WYX_IMAGE

} // namespace wyx::images
