#include <OS.h>

#include <gtest/gtest.h>
#include <string>
#include <thread>
#include <vector>

TEST(PortTest, MessagesComeOutInTheOrderTheyWentIn) {
    const port_id port = create_port(4, "order");
    ASSERT_GT(port, 0);
    EXPECT_EQ(write_port(port, 7, "seven", 6), B_OK);
    EXPECT_EQ(write_port(port, -8, nullptr, 0), B_OK);
    EXPECT_EQ(port_count(port), 2);
    EXPECT_EQ(port_buffer_size(port), 6);
    int32 code = 0;
    char text[16] = {};
    EXPECT_EQ(read_port(port, &code, text, sizeof(text)), 6);
    EXPECT_EQ(code, 7);
    EXPECT_STREQ(text, "seven");
    EXPECT_EQ(read_port(port, &code, text, sizeof(text)), 0);
    EXPECT_EQ(code, -8);
    EXPECT_EQ(port_count(port), 0);
    delete_port(port);
}

TEST(PortTest, WhatDoesNotFitIntoTheBufferIsDropped) {
    const port_id port = create_port(2, "short");
    write_port(port, 1, "abcdef", 6);
    write_port(port, 2, "gh", 2);
    char text[4] = {'x', 'x', 'x', 'x'};
    EXPECT_EQ(read_port(port, nullptr, text, 3), 3);
    EXPECT_EQ(std::string(text, 4), "abcx");
    EXPECT_EQ(read_port(port, nullptr, nullptr, 0), 0);
    EXPECT_EQ(port_count(port), 0);
    delete_port(port);
}

TEST(PortTest, TimeOuts) {
    const port_id port = create_port(1, "times");
    EXPECT_EQ(read_port_etc(port, nullptr, nullptr, 0, B_RELATIVE_TIMEOUT, 0), B_WOULD_BLOCK);
    EXPECT_EQ(read_port_etc(port, nullptr, nullptr, 0, B_RELATIVE_TIMEOUT, 2000), B_TIMED_OUT);
    EXPECT_EQ(read_port_etc(port, nullptr, nullptr, 0, B_ABSOLUTE_TIMEOUT, system_time() + 2000),
              B_TIMED_OUT);
    EXPECT_EQ(port_buffer_size_etc(port, B_RELATIVE_TIMEOUT, 0), B_WOULD_BLOCK);
    EXPECT_EQ(write_port(port, 1, nullptr, 0), B_OK);
    EXPECT_EQ(write_port_etc(port, 2, nullptr, 0, B_RELATIVE_TIMEOUT, 0), B_WOULD_BLOCK);
    EXPECT_EQ(write_port_etc(port, 2, nullptr, 0, B_RELATIVE_TIMEOUT, 2000), B_TIMED_OUT);
    EXPECT_EQ(port_count(port), 1);
    delete_port(port);
}

TEST(PortTest, AWriterWaitsForRoom) {
    const port_id port = create_port(1, "full");
    write_port(port, 1, nullptr, 0);
    std::thread writer([port] { EXPECT_EQ(write_port(port, 2, "x", 1), B_OK); });
    int32 code = 0;
    snooze(2000);
    EXPECT_EQ(port_count(port), 1);
    EXPECT_EQ(read_port(port, &code, nullptr, 0), 0);
    EXPECT_EQ(code, 1);
    char byte = 0;
    EXPECT_EQ(read_port(port, &code, &byte, 1), 1);
    EXPECT_EQ(code, 2);
    writer.join();
    delete_port(port);
}

TEST(PortTest, DeletingWakesReadersAndWriters) {
    const port_id empty = create_port(1, "empty");
    const port_id full = create_port(1, "full");
    write_port(full, 0, nullptr, 0);
    status_t answers[3] = {};
    std::thread reader([&] { answers[0] = static_cast<status_t>(read_port(empty, nullptr, nullptr, 0)); });
    std::thread sizer([&] { answers[1] = static_cast<status_t>(port_buffer_size(empty)); });
    std::thread writer([&] { answers[2] = write_port(full, 1, nullptr, 0); });
    snooze(3000);
    EXPECT_EQ(delete_port(empty), B_OK);
    EXPECT_EQ(delete_port(full), B_OK);
    reader.join();
    sizer.join();
    writer.join();
    for (const status_t answer : answers)
        EXPECT_EQ(answer, B_BAD_PORT_ID);
}

TEST(PortTest, AClosedPortCanBeReadUntilItIsEmpty) {
    const port_id port = create_port(2, "closing");
    write_port(port, 5, nullptr, 0);
    EXPECT_EQ(close_port(port), B_OK);
    EXPECT_EQ(write_port(port, 6, nullptr, 0), B_BAD_PORT_ID);
    int32 code = 0;
    EXPECT_EQ(read_port(port, &code, nullptr, 0), 0);
    EXPECT_EQ(code, 5);
    EXPECT_EQ(read_port(port, &code, nullptr, 0), B_BAD_PORT_ID);
    EXPECT_EQ(delete_port(port), B_OK);
}

TEST(PortTest, RefusesWhatMakesNoSense) {
    EXPECT_EQ(create_port(0, "none"), B_BAD_VALUE);
    EXPECT_EQ(create_port(B_PORT_MAX_CAPACITY + 1, "many"), B_BAD_VALUE);
    const port_id port = create_port(1, nullptr);
    const std::vector<char> big(B_PORT_MAX_MESSAGE_SIZE + 1);
    EXPECT_EQ(write_port(port, 0, big.data(), big.size()), B_BAD_VALUE);
    EXPECT_EQ(write_port(port, 0, nullptr, 1), B_BAD_VALUE);
    EXPECT_EQ(read_port(port, nullptr, nullptr, 1), B_BAD_VALUE);
    EXPECT_EQ(get_port_info(port, nullptr), B_BAD_VALUE);
    delete_port(port);
    port_info info;
    EXPECT_EQ(write_port(port, 0, nullptr, 0), B_BAD_PORT_ID);
    EXPECT_EQ(read_port(port, nullptr, nullptr, 0), B_BAD_PORT_ID);
    EXPECT_EQ(port_buffer_size(port), B_BAD_PORT_ID);
    EXPECT_EQ(port_count(port), B_BAD_PORT_ID);
    EXPECT_EQ(close_port(port), B_BAD_PORT_ID);
    EXPECT_EQ(delete_port(port), B_BAD_PORT_ID);
    EXPECT_EQ(set_port_owner(port, 0), B_BAD_PORT_ID);
    EXPECT_EQ(get_port_info(port, &info), B_BAD_PORT_ID);
}

TEST(PortTest, IsFoundByNameAndTellsAboutItself) {
    const port_id port = create_port(3, "found by name");
    EXPECT_EQ(find_port("found by name"), port);
    EXPECT_EQ(find_port("no such port"), B_NAME_NOT_FOUND);
    EXPECT_EQ(find_port(nullptr), B_BAD_VALUE);
    write_port(port, 1, nullptr, 0);
    write_port(port, 1, nullptr, 0);
    read_port(port, nullptr, nullptr, 0);
    port_info info;
    ASSERT_EQ(get_port_info(port, &info), B_OK);
    EXPECT_STREQ(info.name, "found by name");
    EXPECT_EQ(info.capacity, 3);
    EXPECT_EQ(info.queue_count, 1);
    EXPECT_EQ(info.total_count, 2);
    EXPECT_EQ(set_port_owner(port, info.team), B_OK);
    EXPECT_EQ(set_port_owner(port, info.team + 1), B_BAD_TEAM_ID);
    delete_port(port);
}
