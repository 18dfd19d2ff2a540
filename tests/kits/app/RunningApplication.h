// An application that runs in a thread of its own while a test looks at it.
#pragma once

#include <Application.h>

#include <future>
#include <memory>
#include <thread>

namespace test {

// Made, run and deleted in its thread; from the constructor's return on it is a running application, until
// the destructor.
class RunningApplication {
  public:
    explicit RunningApplication(const char* signature)
        : mThread([this, signature] {
              Application application(signature, mReady);
              application.Run();
          }) {
        mReady.get_future().wait();
    }
    ~RunningApplication() {
        be_app_messenger.SendMessage(B_QUIT_REQUESTED);
        mThread.join();
    }
    RunningApplication(const RunningApplication&) = delete;
    RunningApplication& operator=(const RunningApplication&) = delete;

  private:
    class Application : public BApplication {
      public:
        Application(const char* signature, std::promise<void>& ready)
            : BApplication(signature), mReady(ready) {}
        void ReadyToRun() override { mReady.set_value(); }

      private:
        std::promise<void>& mReady;
    };

    std::promise<void> mReady;
    std::thread mThread;
};

} // namespace test
