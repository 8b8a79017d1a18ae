#include "media/AudioExports.h"

#include "audio/AudioEvenProcess.h"
#include "audio/AudioProcess.h"

AudioDecoder* PEAudioCreate(AudioDecoder* source) { return source != nullptr ? new AudioEvenProcess(source) : nullptr; }

void PEAudioDestroy(AudioDecoder* stage) { delete stage; }

AudioDecoder* PCAudioInit(AudioDecoder* source, int sampleRate, int channels, int bitsPerSample, unsigned continuous)
{
    return source != nullptr ? new AudioProcess(source, sampleRate, channels, bitsPerSample, continuous) : nullptr;
}

void PCAudioRelease(AudioDecoder* stage) { delete stage; }

void PCAudioSeek(AudioDecoder* stage, double seconds)
{
    if (stage != nullptr)
        stage->Seek(seconds);
}

void PCSetVolum(AudioDecoder* stage, int volume)
{
    // A handle of another kind is ignored rather than written into.
    if (auto* process = dynamic_cast<AudioProcess*>(stage))
        process->volume = volume;
}
