#ifndef AVPOST_TOOLS_AVPOST_DEMO_DEMOWATERMARKS_H
#define AVPOST_TOOLS_AVPOST_DEMO_DEMOWATERMARKS_H

#include "tools/avpost/formats/Bmp.h"

namespace avpost::tool {

// The demo's two watermarks, drawn in memory with an alpha channel as a host would make
// them: a fixed logo ("AVPOST" in white on a translucent dark plate with rounded corners)
// and a user badge ("USER" on a translucent orange plate).
Bitmap32 DemoLogo();
Bitmap32 DemoUserBadge();

}  // namespace avpost::tool

#endif
