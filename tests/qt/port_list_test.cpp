// Which device Com1 and Com2 stand for: the variables first, else adapters before built-in
// ports, each group by name.
#include "link/qt/port_list.h"

#include <gtest/gtest.h>

#include <cstdlib>

#include "link/qt/qt_serial_port.h"

namespace zx917 {
namespace {

std::vector<std::string> names(const std::vector<SystemPort>& ports) {
    std::vector<std::string> out;
    for (const auto& p : ports) out.push_back(p.name);
    return out;
}

TEST(PortList_Order, AdaptersFirstThenBuiltInEachByName) {
    struct Case {
        const char* name;
        std::vector<SystemPort> listed;
        std::vector<std::string> order;
    };
    auto port = [](const char* n, bool adapter) {
        return SystemPort{n, std::string("/dev/") + n, "", adapter};
    };
    const Case cases[] = {
        {"mixed",
         {port("ttyS1", false), port("ttyUSB1", true), port("ttyS0", false), port("ttyACM0", true),
          port("ttyUSB0", true)},
         {"ttyACM0", "ttyUSB0", "ttyUSB1", "ttyS0", "ttyS1"}},
        {"built-in only", {port("ttyS4", false), port("ttyS10", false)}, {"ttyS10", "ttyS4"}},
        {"a USB adapter with another name",
         {port("ttyS0", false), port("rfcomm0", true)},
         {"rfcomm0", "ttyS0"}},
        {"none", {}, {}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        EXPECT_EQ(names(OrderPorts(c.listed)), c.order);
    }
}

TEST(PortList_Com, VariablesNameTheDevice) {
    ::setenv("ZX917_COM2", "/dev/ttyUSB7", 1);
    ::setenv("ZX917_COM1", "", 1);  // empty: as if unset
    const SystemPort com2 = ComDevice(2);
    EXPECT_EQ(com2.path, "/dev/ttyUSB7");
    EXPECT_EQ(com2.name, "ttyUSB7");
    EXPECT_EQ(com2.description, "set by ZX917_COM2");
    EXPECT_FALSE(DescribedComDevice(2).description.empty());
    EXPECT_EQ(QtSerialPort::DevicePath(2), "/dev/ttyUSB7");
    EXPECT_EQ(ComDevice(1).path, OrderPorts(SystemPorts()).empty()
                                     ? std::string()
                                     : OrderPorts(SystemPorts()).front().path);
    EXPECT_EQ(ComDevice(0).path, "");
    // The wait before looking at the output queue again: its line time.
    EXPECT_EQ(QtSerialPort::DrainWait(44, "38400,E,8,1").count(), 12);  // 11 bits a byte
    EXPECT_EQ(QtSerialPort::DrainWait(1, "38400,E,8,1").count(), 1);
    EXPECT_EQ(QtSerialPort::DrainWait(4000, "9600,n,8,1").count(), 50);
    EXPECT_EQ(QtSerialPort::DrainWait(10, "bad").count(), 2);
    ::unsetenv("ZX917_COM2");
    ::unsetenv("ZX917_COM1");
}

}  // namespace
}  // namespace zx917
