// Messages posted from one looper to another a second.
#include "support/Figures.h"

#include <Looper.h>
#include <Message.h>
#include <Messenger.h>

#include <atomic>
#include <vector>

namespace {

constexpr int32 kMessages = 300'000;
constexpr int kRounds = 5;
constexpr double kPostsPerSecond = 500'000;

class Receiver : public BLooper {
  public:
    Receiver() : BLooper("receiver") {}
    void MessageReceived(BMessage* message) override {
        mSum += message->GetInt32("n", 1);
        mReceived.fetch_add(1, std::memory_order_release);
        mReceived.notify_one();
    }
    // Waits until that many have been handled since the looper began.
    void WaitFor(int64 count) {
        for (int64 now = mReceived.load(); now < count; now = mReceived.load(std::memory_order_acquire))
            mReceived.wait(now);
    }

  private:
    int64 mSum = 0;
    std::atomic<int64> mReceived{0};
};

// Posts all of its messages in one go when told to.
class Sender : public BLooper {
  public:
    Sender(Receiver* receiver, bool withField)
        : BLooper("sender"), mReceiver(receiver), mWithField(withField) {}
    void MessageReceived(BMessage*) override {
        for (int32 number = 0; number < kMessages; number++) {
            BMessage message('post');
            if (mWithField)
                message.AddInt32("n", number);
            mReceiver->PostMessage(&message);
        }
    }

  private:
    Receiver* mReceiver;
    bool mWithField;
};

void QuitLooper(BLooper* looper) {
    if (looper->Lock())
        looper->Quit();
}

double PostsPerSecond(bool withField) {
    auto* const receiver = new Receiver;
    receiver->Run();
    auto* const sender = new Sender(receiver, withField);
    sender->Run();
    std::vector<double> rates;
    for (int round = 1; round <= kRounds; round++) {
        const bench::Stopwatch watch;
        sender->PostMessage('go__');
        receiver->WaitFor(int64{kMessages} * round);
        rates.push_back(kMessages / watch.Seconds());
    }
    QuitLooper(sender);
    QuitLooper(receiver);
    return bench::Median(rates);
}

} // namespace

int main() {
    bool reached = bench::Report("post, no fields", PostsPerSecond(false), "messages/s", "wanted",
                                 kPostsPerSecond, 1, bench::Better::higher);
    reached &= bench::Report("post, one number", PostsPerSecond(true), "messages/s", "wanted",
                             kPostsPerSecond, 1, bench::Better::higher);
    return reached ? 0 : 1;
}
