// While it lives, no thread can be started.
#pragma once

#include <gtest/gtest.h>

#include <pthread.h>

// By a stack that is larger than what there are addresses for.
class NoNewThreads {
  public:
    NoNewThreads() {
        pthread_attr_t attributes;
        EXPECT_EQ(pthread_getattr_default_np(&attributes), 0);
        EXPECT_EQ(pthread_attr_getstacksize(&attributes, &mStackSize), 0);
        pthread_attr_destroy(&attributes);
        SetStackSize(size_t{1} << 56);
    }
    ~NoNewThreads() { SetStackSize(mStackSize); }
    NoNewThreads(const NoNewThreads&) = delete;
    NoNewThreads& operator=(const NoNewThreads&) = delete;

  private:
    static void SetStackSize(size_t size) {
        pthread_attr_t attributes;
        EXPECT_EQ(pthread_getattr_default_np(&attributes), 0);
        EXPECT_EQ(pthread_attr_setstacksize(&attributes, size), 0);
        EXPECT_EQ(pthread_setattr_default_np(&attributes), 0);
        pthread_attr_destroy(&attributes);
    }

    size_t mStackSize = 0;
};
