// Columns without a list, in a display order of their own.
#pragma once

#include "gui/ColumnListView/CLVColumn.h"
#include "gui/ColumnListView/ColumnLayout.h"

#include <List.h>

#include <initializer_list>
#include <memory>
#include <string>
#include <vector>

class ColumnOrder {
  public:
    struct Column {
        float width;
        unsigned long flags = 0;
    };

    // Named "A", "B" and so on from the left, and laid out.
    ColumnOrder(std::initializer_list<Column> columns) {
        for (const Column& each : columns) {
            const std::string name(1, static_cast<char>('A' + mColumns.size()));
            mColumns.push_back(std::make_unique<CLVColumn>(name.c_str(), each.width, each.flags, 4.0F));
            order.AddItem(mColumns.back().get());
        }
        dataWidth = LayOutColumns(order);
    }
    CLVColumn& operator[](size_t index) { return *mColumns[index]; }

    BList order;
    float dataWidth = 0;

  private:
    std::vector<std::unique_ptr<CLVColumn>> mColumns;
};
