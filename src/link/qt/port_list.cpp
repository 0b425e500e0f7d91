#include "link/qt/port_list.h"

#include <QSerialPortInfo>
#include <algorithm>
#include <cstdlib>

namespace zx917 {

std::vector<SystemPort> OrderPorts(std::vector<SystemPort> ports) {
    std::stable_sort(ports.begin(), ports.end(), [](const SystemPort& a, const SystemPort& b) {
        if (a.adapter != b.adapter) return a.adapter;
        return a.name < b.name;
    });
    return ports;
}

std::vector<SystemPort> SystemPorts() {
    std::vector<SystemPort> out;
    for (const QSerialPortInfo& info : QSerialPortInfo::availablePorts()) {
        SystemPort p;
        p.name = info.portName().toStdString();
        p.path = info.systemLocation().toStdString();
        p.description = info.description().toStdString();
        if (!info.manufacturer().isEmpty() &&
            p.description.find(info.manufacturer().toStdString()) == std::string::npos) {
            p.description +=
                (p.description.empty() ? "" : ", ") + info.manufacturer().toStdString();
        }
        p.adapter = info.hasVendorIdentifier() || p.name.starts_with("ttyUSB") ||
                    p.name.starts_with("ttyACM");
        out.push_back(std::move(p));
    }
    return OrderPorts(std::move(out));
}

SystemPort ComDevice(int16_t port) {
    const std::string var = "ZX917_COM" + std::to_string(port);
    if (const char* env = std::getenv(var.c_str()); env != nullptr && *env != '\0') {
        SystemPort p;
        p.path = env;
        p.name = p.path.substr(p.path.find_last_of('/') + 1);
        p.description = "set by " + var;
        return p;
    }
    const auto ports = SystemPorts();
    if (port < 1 || static_cast<std::size_t>(port) > ports.size()) return {};
    return ports[port - 1];
}

SystemPort DescribedComDevice(int16_t port) {
    SystemPort p = ComDevice(port);
    if (p.path.empty()) return p;
    // A variable names only the path: the system knows what is behind it.
    for (const SystemPort& s : SystemPorts()) {
        if (s.path == p.path && !s.description.empty()) p.description = s.description;
    }
    return p;
}

std::string DescribeComPort(int16_t port) {
    const SystemPort d = DescribedComDevice(port);
    if (d.path.empty()) return {};
    return d.description.empty() ? d.path : d.path + " - " + d.description;
}

}  // namespace zx917
