// "brtide day ... --png FILE [--size WxH]": the day drawn by the library's TidesWindow
// control (created by its programmatic identifier, drawn through IViewObject::Draw into
// a bitmap) and written as a PNG picture.
#pragma once

#include "host/brtide/DayExtension.h"

namespace br::brtide {

class DayPictureOption final : public DayExtension {
public:
  OptionSpec Option() const override;
  bool Accepts(const std::vector<std::string>& values, std::string& error) const override;
  int Run(ITidesPort& port, const DayRequest& request, const DayReport& day, const std::vector<std::string>& values,
          std::ostream& messages, std::ostream& err) override;
};

// --size: read by the picture; on its own it changes nothing.
class PictureSizeOption final : public DayExtension {
public:
  OptionSpec Option() const override;
  bool Accepts(const std::vector<std::string>& values, std::string& error) const override;
  std::string RequiredOption() const override { return "--png"; }
  int Run(ITidesPort&, const DayRequest&, const DayReport&, const std::vector<std::string>&, std::ostream&,
          std::ostream&) override {
    return kExitOk;
  }
};

}  // namespace br::brtide
