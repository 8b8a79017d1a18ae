#include "tools/avpost/jobs/Captures.h"

#include <cctype>
#include <cmath>
#include <cstdlib>

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/report/Summary.h"

namespace avpost::tool {
namespace {

// Output times are multiples of a picture's length, which decimals do not hit exactly.
constexpr double kSlack = 1e-9;

}  // namespace

std::string ThumbnailName(const std::string& pattern, int number)
{
    std::string name;
    for (size_t at = 0; at < pattern.size(); ++at) {
        if (pattern[at] != '%') {
            name += pattern[at];
        } else if (at + 1 < pattern.size() && pattern[at + 1] == '%') {
            name += '%';
            ++at;
        } else {
            // The pattern was checked: digits (a width, 0 first to pad with zeros), then d.
            const size_t d = pattern.find('d', at);
            const std::string width = pattern.substr(at + 1, d - at - 1);
            const std::string digits = std::to_string(number);
            const size_t wanted = width.empty() ? 0 : static_cast<size_t>(std::atoi(width.c_str()));
            const char pad = !width.empty() && width[0] == '0' ? '0' : ' ';
            name += std::string(wanted > digits.size() ? wanted - digits.size() : 0, pad) + digits;
            at = d;
        }
    }
    return name;
}

CaptureSchedule::CaptureSchedule(const std::vector<Capture>& captures, const Thumbnails& thumbnails)
    : captures_(captures), captured_(captures.size(), false), thumbnails_(thumbnails)
{
    for (const Capture& capture : captures)
        captureFiles_.push_back(std::make_unique<StagedPath>(capture.path));
    if (thumbnails.every > 0.0)
        thumbnailFiles_.push_back(std::make_unique<StagedPath>(ThumbnailName(thumbnails.pattern, 1)));
}

void CaptureSchedule::Shoot(const StagedPath& file, bool jpeg, const std::string& name, const Take& take)
{
    if (!take(file.temporary(), jpeg) || !file.HasContent())
        Fail(name, "the picture could not be written");
}

void CaptureSchedule::Due(double seconds, bool atEnd, const Take& take, std::vector<std::string>& notes)
{
    for (size_t i = 0; i < captures_.size(); ++i) {
        const Capture& capture = captures_[i];
        const bool early = capture.seconds > seconds + kSlack;
        if (captured_[i] || (early && !atEnd))
            continue;
        captured_[i] = true;
        Shoot(*captureFiles_[i], capture.jpeg, capture.path, take);
        if (early)
            notes.push_back("--capture " + capture.path + ": the output ends before " + FixedText(capture.seconds, 3) +
                            " s; its last picture was taken");
    }
    if (thumbnails_.every <= 0.0 || atEnd || seconds + kSlack < nextThumbnail_)
        return;
    const std::string name = ThumbnailName(thumbnails_.pattern, thumbnailsTaken_ + 1);
    if (static_cast<int>(thumbnailFiles_.size()) == thumbnailsTaken_)
        thumbnailFiles_.push_back(std::make_unique<StagedPath>(name));
    Shoot(*thumbnailFiles_.back(), thumbnails_.jpeg, name, take);
    ++thumbnailsTaken_;
    // One picture per thumbnail, even when the output's pictures are further apart.
    nextThumbnail_ = (std::floor((seconds + kSlack) / thumbnails_.every) + 1.0) * thumbnails_.every;
}

void CaptureSchedule::Commit()
{
    for (const std::unique_ptr<StagedPath>& file : captureFiles_)
        file->Commit();
    for (int i = 0; i < thumbnailsTaken_; ++i)
        thumbnailFiles_[static_cast<size_t>(i)]->Commit();
}

}  // namespace avpost::tool
