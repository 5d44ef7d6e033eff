#include "WebGate/SocketTable.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;

const std::string kTable =
    "  sl  local_address rem_address   st tx_queue rx_queue tr tm->when retrnsmt   uid  timeout inode\n"
    "   0: 0100007F:1FBB 00000000:0000 0A 00000000:00000000 00:00000000 00000000  1000        0 711 1 0 100 "
    "0 0 10 0\n"
    "   1: 0100007F:1FBB 0100007F:C001 01 00000000:00000000 00:00000000 00000000  1000        0 712 1 0 20 4 "
    "30 10 -1\n"
    "   2: 0100007F:C001 0100007F:1FBB 01 00000000:00000000 00:00000000 00000000  1001        0 713 1 0 20 4 "
    "30 10 -1\n"
    "   3: 0100007F:C002 0100007F:1FBB 05 00000000:00000000 00:00000000 00000000     0        0 0 1 0 20 4 "
    "30 10 -1\n"
    "   4: 0000000000000000FFFF00000100007F:C003 0000000000000000FFFF00000100007F:1FBB 01 00000000:00000000 "
    "00:00000000 00000000  1002        0 714 1 0 20 4 30 10 -1\n"
    "   5: 0100007F:C004 0100007F:1FBB 01 0000";

TEST(SocketTableTest, OwnerIsThatOfTheOtherEnd) {
    EXPECT_EQ(FindOwner(kTable, 0xC001, 8123)->user, 1001);
    EXPECT_EQ(FindOwner(kTable, 8123, 0xC001)->user, 1000);
    EXPECT_EQ(FindOwner(kTable, 0xC003, 8123)->user, 1002);
    EXPECT_TRUE(FindOwner(kTable, 0xC001, 8123)->isOpen);
    EXPECT_FALSE(FindOwner(kTable, 0xC002, 8123)->isOpen);
    for (const int port : {0xC000, 0xC004, 0}) EXPECT_FALSE(FindOwner(kTable, port, 8123)) << port;
    EXPECT_FALSE(FindOwner("", 0xC001, 8123));
}

} // namespace
