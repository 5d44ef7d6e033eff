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

TEST(SocketTableTest, TableThatIsCutTellsTheOwnerOrNothing) {
    std::size_t told = 0;
    for (std::size_t length = 0; length <= kTable.size(); ++length)
        if (const auto owner = FindOwner(kTable.substr(0, length), 0xC001, 8123)) {
            EXPECT_EQ(owner->user, 1001) << length;
            EXPECT_TRUE(owner->isOpen) << length;
            ++told;
        }
    EXPECT_GT(told, 100);
}

TEST(SocketTableTest, LineOfAnotherConnectionTellsNothing) {
    const auto line = [](const std::string& here, const std::string& there, const std::string& user = "7") {
        return "   1: " + here + " " + there + " 01 00000000:00000000 00:00000000 00000000 " + user +
               " 0 712 1 0\n";
    };
    const std::string own = "0100007F:C001", server = "0100007F:1FBB";
    EXPECT_EQ(FindOwner(line(own, server), 0xC001, 8123)->user, 7);
    EXPECT_EQ(FindOwner(line(server, own) + line(own, server, "8"), 0xC001, 8123)->user, 8);
    for (const std::string& other :
         {line(server, own), line(own, "0100007F:1FBC"), line(own, "0200007F:1FBB"),
          line("0200007F:C001", server), line(own + "0", server), line(own, server + "0"),
          line(own, server, "-"), line(own, server, "x"), line(own, server, "99999999999"), line("", server),
          "100007F:C001 " + server, std::string(5000, '\n')})
        EXPECT_FALSE(FindOwner(other, 0xC001, 8123)) << other;
}

} // namespace
