#ifndef AVPOST_TOOLS_AVPOST_FORMATS_WAVAUDIODECODER_H
#define AVPOST_TOOLS_AVPOST_FORMATS_WAVAUDIODECODER_H

#include <memory>
#include <vector>

#include "tools/avpost/formats/InputFile.h"
#include "tools/avpost/formats/Wav.h"
#include "tools/avpost/sources/Sources.h"

namespace avpost::tool {

// An audio source over a 16-bit PCM WAV file ("-" reads standard input), in blocks of 4096
// sample frames stamped with their position in the file.
class WavAudioDecoder : public AudioSource {
public:
    void OpenFile(const std::string& path) override;
    double TotalSeconds() const override;

    void Close() override;
    // Any position in a file; on standard input the position stays where it is.
    double Seek(double seconds) override;
    MEDIA_FRAME* GetNextFrame() override;
    double GetOffset() const override;

private:
    std::unique_ptr<InputFile> input_;
    std::unique_ptr<WavReader> reader_;
    std::vector<unsigned char> samples_;
    MEDIA_FRAME block_{};
    long long framesRead_ = 0;
};

}  // namespace avpost::tool

#endif
