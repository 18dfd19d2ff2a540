// What the gallery's rows are about: the stock of a made-up bicycle shop.
#pragma once

#include <SupportDefs.h>

#include <string>

// The n-th of endlessly many; n counts from 0. Equal n, equal texts.
struct StockItem {
    explicit StockItem(int32 n);

    std::string part;
    std::string maker;
    std::string shelf;
    std::string count;
    std::string price;
    std::string note;
};

constexpr int32 kStockParts = 16;

const char* StockPart(int32 index);
