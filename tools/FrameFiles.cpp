#include "FrameFiles.h"

#include "Failure.h"
#include "Formats.h"
#include "Png.h"
#include "SamplePlanes.h"

namespace tool {

FrameInput::FrameInput(const FramePlan& plan, const std::string& name) : fPlan(plan), fName(name) {
    if (plan.in == FileKind::Png) return;
    if (plan.in == FileKind::Y4M) {
        fStream.emplace(name, plan.matrix);
        fHead = fStream->Head();
        fFrame.emplace(fHead.format, fHead.width, fHead.height);
        return;
    }
    fHead.format = plan.from.At(plan.size, plan.matrix);
    fFrame.emplace(fHead.format, plan.size.width, plan.size.height);
    fRaw.emplace(name, *fFrame, plan.from.Packing());
}

int64_t FrameInput::FrameCount() const {
    return fRaw ? fRaw->FrameCount() : fStream ? 0 : 1;
}

bool FrameInput::ReadNext() {
    if (fRaw) return fRaw->Read(*fFrame);
    if (fStream) return fStream->Read(*fFrame);
    if (fFrame) return false;
    fFrame = ReadPng(fName);
    return true;
}

const Frame* FrameInput::Next() {
    if (fIsAtEnd) return nullptr;
    fIsAtEnd = !ReadNext();
    if (fIsAtEnd) return nullptr;
    const PK_PixelFormat format = fPlan.from.At(fFrame->PixelSize(), fPlan.matrix, fHead.format);
    if (format == PK_PixelFormat_Invalid || format == fFrame->Format()) return &*fFrame;
    fConverted = Converted(*fFrame, format, fPlan.quality);
    return &*fConverted;
}

FrameOutput::FrameOutput(const FramePlan& plan, const std::string& name, const Y4MHead& head)
    : fPlan(plan), fName(name), fHead(head) {}

PK_PixelFormat FrameOutput::FormatFor(Size size, PK_PixelFormat asItIs) const {
    const PK_PixelFormat told = fPlan.to.At(size, fPlan.matrix, fHead.format);
    if (told != PK_PixelFormat_Invalid) return told;
    if (fPlan.out == FileKind::Png) return fPlan.pngFormat;
    return Video420Of(fHead.format) ? fHead.format : asItIs;
}

void FrameOutput::Write(const Frame& frame) {
    if (fFrameCount > 0) RequireRoomForSeveral();
    const Size size = frame.PixelSize();
    if (!fConverted) fConverted.emplace(FormatFor(size, frame.Format()), size.width, size.height);
    Convert(frame, *fConverted, fPlan.quality);
    switch (fPlan.out) {
    case FileKind::Png:
        WriteAsPng();
        break;
    case FileKind::Y4M:
        WriteToStream();
        break;
    case FileKind::Raw:
        WriteAsRaw();
        break;
    }
    ++fFrameCount;
}

void FrameOutput::RequireRoomForSeveral() const {
    if (fPlan.out == FileKind::Png && !fName.IsNumbered())
        throw Failure(kExitUsage, "the input holds several frames and a PNG holds one: number the output, "
                                  "such as frame-%04d.png");
}

std::string FrameOutput::Summary(const Frame& input) const {
    const bool isSame = fConverted->Width() == input.Width() && fConverted->Height() == input.Height();
    return FormatName(fConverted->Format()) + (isSame ? "" : " at " + SizeText(*fConverted));
}

int64_t FrameOutput::Finish() {
    if (fRawFile) fRawFile->Commit();
    if (fStream) fStream->Commit();
    return fFrameCount;
}

void FrameOutput::WriteAsPng() {
    const std::string name = fName.At(fFrameCount);
    if (fConverted->Format() == fPlan.pngFormat)
        WritePng(*fConverted, name);
    else
        WritePng(Converted(*fConverted, fPlan.pngFormat, fPlan.quality), name);
}

void FrameOutput::WriteAsRaw() {
    if (!fRawFile) fRawFile.emplace(fName.At(0));
    WriteRaw(*fConverted, fPlan.to.Packing(), *fRawFile);
}

/// Planes of 4:2:0, and UYVY of the matrix that players take for its size, go into the stream as they are, and all else
/// as 4:4:4.
void FrameOutput::WriteToStream() {
    if (!fStream) {
        const std::optional<Video420> video = Video420Of(fConverted->Format());
        fHead.width = fConverted->Width();
        fHead.height = fConverted->Height();
        const bool isPlain = fConverted->Format() == UYVYOf(Is709("", fConverted->PixelSize()));
        fHead.format = video || isPlain ? fConverted->Format() : PK_PixelFormat_Invalid;
        if (video && !video->areFields) fHead.field = 0;
        if (video && video->areFields && fHead.field == 0) fHead.field = 1; // as most streams
        fStream.emplace(fName.At(0), fHead);
    }
    fStream->Write(*fConverted);
}

} // namespace tool
