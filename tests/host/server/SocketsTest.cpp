#include <arpa/inet.h>
#include <gtest/gtest.h>
#include <netinet/in.h>

#include <string>

#include "server/Sockets.h"

namespace cimhost::server {
namespace {

std::string networkOfFour(const char* host) {
    sockaddr_in address{};
    address.sin_family = AF_INET;
    EXPECT_EQ(::inet_pton(AF_INET, host, &address.sin_addr), 1);
    return networkOf(reinterpret_cast<const sockaddr*>(&address));
}

std::string networkOfSix(const char* host) {
    sockaddr_in6 address{};
    address.sin6_family = AF_INET6;
    EXPECT_EQ(::inet_pton(AF_INET6, host, &address.sin6_addr), 1);
    return networkOf(reinterpret_cast<const sockaddr*>(&address));
}

TEST(SocketsTest, ANetworkIsAnIpv4AddressOr64BitsOfAnIpv6Address) {
    EXPECT_NE(networkOfFour("192.0.2.1"), networkOfFour("192.0.2.2"));
    EXPECT_EQ(networkOfSix("2001:db8::1"), networkOfSix("2001:db8::2:3:4:5"));
    EXPECT_NE(networkOfSix("2001:db8::1"), networkOfSix("2001:db8:0:1::1"));
}

TEST(SocketsTest, AnIpv4ClientOfAnIpv6SocketHasTheNetworkOfItsIpv4Address) {
    EXPECT_EQ(networkOfSix("::ffff:192.0.2.1"), networkOfFour("192.0.2.1"));
    EXPECT_NE(networkOfSix("::ffff:192.0.2.1"), networkOfSix("::ffff:192.0.2.2"));
}

}  // namespace
}  // namespace cimhost::server
