#ifndef AVPOST_TOOLS_AVPOST_DEMO_COLOURBARS_H
#define AVPOST_TOOLS_AVPOST_DEMO_COLOURBARS_H

namespace avpost::tool {

// A colour as limited-range Y, U and V bytes.
struct StudioYuv {
    unsigned char y, u, v;
};

// 75 % colour bars in studio range: white, yellow, cyan, green, magenta, red, blue.
inline constexpr StudioYuv kColourBars[] = {{180, 128, 128}, {162, 44, 142}, {131, 156, 44}, {112, 72, 58},
                                            {84, 184, 198},  {65, 100, 212}, {35, 212, 114}};
inline constexpr int kColourBarCount = sizeof(kColourBars) / sizeof(kColourBars[0]);

}  // namespace avpost::tool

#endif
