// The one sink of the library's diagnostic lines: standard output by default, a host's callback
// when set, and standard output again when the callback is cleared.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "audio/AudioConverter.h"
#include "support/Trace.h"

namespace {

void Record(const char* line, void* context) { static_cast<std::vector<std::string>*>(context)->push_back(line); }

// A format change of the audio converter prints two lines.
void TraceFormatChange()
{
    CAudioConverter converter(1, 2, 44100, 48000, 0);
    converter.ChangeInput(2, 32000);
}

TEST(Trace, LinesGoToTheCallbackExactlyAsPrintedAndBackToStandardOutputWhenCleared)
{
    std::vector<std::string> lines;
    PCSetTraceCallback(Record, &lines);
    testing::internal::CaptureStdout();
    TraceFormatChange();
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "");
    EXPECT_EQ(lines, (std::vector<std::string>{" *** CAudioConverter::ChangeInput 1 => 2 channels.\r\n",
                                               " *** CAudioConverter::ChangeInput 44100 => 32000 Hz.\r\n"}));

    PCSetTraceCallback(nullptr, &lines);
    testing::internal::CaptureStdout();
    TraceFormatChange();
    EXPECT_EQ(testing::internal::GetCapturedStdout(),
              " *** CAudioConverter::ChangeInput 1 => 2 channels.\r\n"
              " *** CAudioConverter::ChangeInput 44100 => 32000 Hz.\r\n");
    EXPECT_EQ(lines.size(), 2u);
}

}  // namespace
