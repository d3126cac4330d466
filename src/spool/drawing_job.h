// A drawing device whose document is a print job, delivered when the document ends.
#pragma once

#include <memory>
#include <utility>

#include "partnerkit/drawing.h"
#include "partnerkit/spooling.h"

namespace partnerkit::spool {

class DrawingJob : public DrawingDevice {
 public:
  // `device` writes its document to `job`.
  DrawingJob(std::unique_ptr<DrawingDevice> device, std::shared_ptr<RawJob> job)
      : job_(std::move(job)), device_(std::move(device)) {}

  double TwipsPerPixelX() const override { return device_->TwipsPerPixelX(); }
  double TwipsPerPixelY() const override { return device_->TwipsPerPixelY(); }
  void StartPage(int width, int height) override { device_->StartPage(width, height); }
  void EndPage() override { device_->EndPage(); }
  void EndDoc() override {
    // Called again after a failed delivery, it delivers again.
    if (!ended_) device_->EndDoc();
    ended_ = true;
    job_->Close();
  }
  void Rectangle(const PixelRect& rect, int penWidth) override { device_->Rectangle(rect, penWidth); }
  void Text(int x, int y, std::string_view text, const Font& font, const TextInks& inks) override {
    device_->Text(x, y, text, font, inks);
  }

 private:
  std::shared_ptr<RawJob> job_;
  std::unique_ptr<DrawingDevice> device_;
  bool ended_ = false;
};

}  // namespace partnerkit::spool
