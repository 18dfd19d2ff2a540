// What brings the indexer window its pulses: a window receives them only through a view that asks for them.
#pragma once

#include <View.h>

class FileIndexWindow;

// Has no size and draws nothing. Belongs to its window.
class PulseView : public BView {
  public:
    explicit PulseView(FileIndexWindow* window);
    void Pulse() override;

  private:
    FileIndexWindow* const mWindow;
};
