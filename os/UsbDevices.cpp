#include "os/UsbDevices.h"

#include <algorithm>
#include <filesystem>
#include <fstream>

namespace os {
namespace {

namespace fs = std::filesystem;

std::string lineIn(const fs::path& file) {
  std::ifstream stream(file);
  std::string line;
  std::getline(stream, line);
  return line;
}

}  // namespace

std::vector<UsbDevice> usbDevices(const std::string& folder) {
  std::error_code failed;
  std::vector<fs::path> places;
  for (const auto& entry : fs::directory_iterator(folder, failed)) places.push_back(entry.path());
  std::sort(places.begin(), places.end());
  std::vector<UsbDevice> devices;
  for (const fs::path& place : places) {
    UsbDevice device{lineIn(place / "idVendor"), lineIn(place / "idProduct"), lineIn(place / "product"),
                     lineIn(place / "serial")};
    if (device.vendor.size() == 4 && device.product.size() == 4) devices.push_back(std::move(device));
  }
  return devices;
}

}  // namespace os
