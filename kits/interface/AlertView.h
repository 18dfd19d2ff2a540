// AlertView: what of an alert is neither text nor button.
#pragma once

#include "AlertLayout.h"

#include <Alert.h>
#include <View.h>

#include <memory>

class BBitmap;

// Fills the alert. Draws the stripe and the icon.
class AlertView : public BView {
  public:
    AlertView(const AlertLayout& layout, alert_type type);
    ~AlertView() override;

    void Draw(BRect updateRect) override;

  private:
    const AlertLayout mLayout;
    const std::unique_ptr<BBitmap> mIcon;
};
