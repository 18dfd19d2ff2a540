// Messages posted from one looper to another, and questions answered, a second.
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
constexpr int32 kRoundTrips = 50'000;
constexpr double kRoundTripsPerSecond = 50'000;

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

// Answers each message with its number plus one.
class Answering : public BLooper {
  public:
    Answering() : BLooper("answering") {}
    void MessageReceived(BMessage* message) override {
        BMessage reply(B_REPLY);
        int32 number = 0;
        if (message->FindInt32("n", &number) == B_OK)
            reply.AddInt32("n", number + 1);
        message->SendReply(&reply);
    }
};

// Synchronous sends from this thread, each waiting for its reply. 0 when one of them fails.
double RoundTripsPerSecond(bool withField) {
    auto* const answering = new Answering;
    answering->Run();
    const BMessenger messenger(answering);
    std::vector<double> rates;
    bool answered = true;
    for (int round = 1; round <= kRounds; round++) {
        const bench::Stopwatch watch;
        for (int32 number = 0; number < kRoundTrips; number++) {
            BMessage message('ask_');
            if (withField)
                message.AddInt32("n", number);
            BMessage reply;
            answered &= messenger.SendMessage(&message, &reply) == B_OK && reply.what == B_REPLY &&
                        (!withField || reply.GetInt32("n", 0) == number + 1);
        }
        rates.push_back(kRoundTrips / watch.Seconds());
    }
    QuitLooper(answering);
    return answered ? bench::Median(rates) : 0;
}

} // namespace

int main() {
    bool reached = bench::Report("post, no fields", PostsPerSecond(false), "messages/s", "wanted",
                                 kPostsPerSecond, 1, bench::Better::higher);
    reached &= bench::Report("post, one number", PostsPerSecond(true), "messages/s", "wanted",
                             kPostsPerSecond, 1, bench::Better::higher);
    reached &= bench::Report("question and answer, no fields", RoundTripsPerSecond(false), "a second",
                             "wanted", kRoundTripsPerSecond, 1, bench::Better::higher);
    reached &= bench::Report("question and answer, one number", RoundTripsPerSecond(true), "a second",
                             "wanted", kRoundTripsPerSecond, 1, bench::Better::higher);
    return reached ? 0 : 1;
}
