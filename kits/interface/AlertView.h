// AlertView: what of an alert is no button.
#pragma once

#include "AlertLayout.h"

#include <Alert.h>
#include <View.h>

#include <memory>
#include <string>
#include <vector>

class BBitmap;

// Fills the alert. Draws the stripe, the icon and the lines of the text.
class AlertView : public BView {
  public:
    AlertView(const AlertLayout& layout, alert_type type, std::vector<std::string> lines);
    ~AlertView() override;

    void Draw(BRect updateRect) override;

  private:
    const AlertLayout mLayout;
    const std::vector<std::string> mLines;
    const std::unique_ptr<BBitmap> mIcon;
};
