// What is plugged into this computer.
#pragma once

#include <string>
#include <vector>

namespace os {

/// Texts are as the device gives them: of any bytes, and empty where it gives none.
struct UsbDevice {
  std::string vendor, product;  ///< four hexadecimal digits, small letters
  std::string name;
  std::string serial;
};

/// Where the system shows them.
inline const std::string usbFolder = "/sys/bus/usb/devices";

/// Every one that the folder shows, in the order of their places; none where there is no such folder.
std::vector<UsbDevice> usbDevices(const std::string& folder = usbFolder);

}  // namespace os
