// Which columns the table of tags has, and one line of it. Pure.
#pragma once

#include "cli/poll/LiveTable.h"

namespace cli {

class TableColumns {
  public:
    TableColumns(int width, const TableStyle& style);

    [[nodiscard]] ScreenLine titles() const;
    [[nodiscard]] ScreenLine line(const TableRow& row) const;

  private:
    int width_;
    bool unicode_;
    // 0: no such column.
    int unit_ = 0;
    int quality_ = 0;
    int age_ = 0;
    int history_ = 0;
    int name_ = 0;
    int value_ = 0;
};

}  // namespace cli
