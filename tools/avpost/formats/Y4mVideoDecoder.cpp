#include "tools/avpost/formats/Y4mVideoDecoder.h"

#include <algorithm>
#include <cmath>

#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {
namespace {

constexpr Ratio kFallbackRate{25, 1};
constexpr size_t kFrameLineBytes = 6;  // "FRAME\n"

}  // namespace

void Y4mVideoDecoder::OpenFile(const std::string& path)
{
    Close();
    input_ = std::make_unique<InputFile>(path);
    reader_ = std::make_unique<Y4mReader>(*input_);
    const Y4mFormat& format = reader_->format();
    rate_ = format.frameRate.known() ? format.frameRate : kFallbackRate;
    info_ = STREAM_INFO{};
    FillVideoInfo(info_, format.width, format.height, rate_.value(),
                  DisplayAspect(format.width, format.height, format.pixelAspect));
    traits_ = PictureTraits{format.interlace, format.chroma, 0};
    CheckFirstPictureFits();
    picture_.reset(CreateYV12Frame(format.width, format.height, false, true));
    if (!ReadNext())
        Fail(input_->name(), "Y4M stream holds no pictures");
}

// A file must hold the first picture its header announces before a picture of that size is
// allocated; a pipe cannot tell its length, so there the first read finds out.
void Y4mVideoDecoder::CheckFirstPictureFits() const
{
    if (!input_->seekable())
        return;
    const long long left = input_->size() - reader_->position();
    const size_t needed = reader_->format().PictureBytes() + kFrameLineBytes;
    if (left <= 0)
        Fail(input_->name(), "Y4M stream holds no pictures");
    if (static_cast<unsigned long long>(left) < needed)
        Fail(input_->name(), "truncated: the header announces " + std::to_string(reader_->format().width) + "x" +
                                 std::to_string(reader_->format().height) + " pictures of " + std::to_string(needed) +
                                 " bytes, " + std::to_string(left) + " bytes follow it");
}

double Y4mVideoDecoder::TotalSeconds() const
{
    if (!reader_ || !input_->seekable())
        return 0.0;
    const double pictures =
        static_cast<double>(input_->size()) / static_cast<double>(reader_->format().PictureBytes() + kFrameLineBytes);
    return pictures / rate_.value();
}

void Y4mVideoDecoder::Close()
{
    reader_.reset();
    input_.reset();
    picture_.reset();
    offsets_.clear();
}

bool Y4mVideoDecoder::ReadNext()
{
    const long long at = input_->seekable() ? reader_->position() : 0;
    if (!reader_->ReadPicture(*picture_))
        return false;
    if (static_cast<size_t>(reader_->picturesRead()) > offsets_.size())
        offsets_.push_back(at);
    StampCurrent();
    return true;
}

void Y4mVideoDecoder::StampCurrent()
{
    const long long index = reader_->picturesRead() - 1;
    picture_->startTime = picture_->streamTime = ToUnits(TimeOf(index));
    picture_->duration = static_cast<int32_t>(ToUnits(1.0 / rate_.value()));
}

double Y4mVideoDecoder::TimeOf(long long index) const
{
    return static_cast<double>(index) * static_cast<double>(rate_.den) / static_cast<double>(rate_.num);
}

int Y4mVideoDecoder::Forward(int count)
{
    if (!reader_ || count < 1)
        return 0;
    return Advance(count, [this] { return ReadNext(); });
}

double Y4mVideoDecoder::Seek(double seconds, unsigned)
{
    if (!reader_)
        return 0.0;
    const long long target = std::max(0LL, std::llround(seconds * rate_.value()));
    Guarded([&] {
        long long current = reader_->picturesRead() - 1;
        if (target < current && input_->seekable()) {
            reader_->Reposition(offsets_[static_cast<size_t>(target)], target);
            current = target - 1;
        }
        while (current < target && ReadNext())
            ++current;
    });
    return GetOffset();
}

double Y4mVideoDecoder::GetOffset() const { return reader_ ? TimeOf(reader_->picturesRead() - 1) : 0.0; }

}  // namespace avpost::tool
