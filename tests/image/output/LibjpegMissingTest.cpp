#include <gtest/gtest.h>

TEST(JpegDecoding, NeedsLibjpegForThisTarget)
{
    GTEST_SKIP() << "libjpeg for this target is not installed (libjpeg62-turbo-dev for its architecture): "
                    "JPEG files are not decoded and IJL15.DLL is not built";
}
