// Board files. Input: the file.
#include <toml++/toml.h>

#include "QorJtag_Host.h"
#include "QorVIO.h"
#include "Sim.h"
#include "tests/fuzz/Fuzz.h"

namespace {

unsigned number(const toml::table& table, const char* key, unsigned otherwise) {
  return static_cast<unsigned>(table[key].value_or<std::int64_t>(otherwise));
}

void checkCore(unsigned session, unsigned device, const toml::table& core) {
  const QOR_CORE_REF ref{device, number(core, "user_chain", 0), number(core, "index", 0)};
  QORVIO_CORE_INFO info{};
  const bool isVio = core["type"].is_string();
  require((QorVIO_getInfo(session, ref, &info) == 0) == (isVio || number(core, "type", 0) == 9),
          "a VIO core");
  const std::pair<const char*, unsigned> fields[] = {{"async_in", info.async_input_count},
                                                     {"sync_in", info.sync_input_count},
                                                     {"async_out", info.async_output_count},
                                                     {"sync_out", info.sync_output_count},
                                                     {"revision", info.core_revision}};
  for (const auto& [key, seen] : fields)
    if (isVio) requireEqual(key + std::to_string(seen), key + std::to_string(number(core, key, 0)));
}

void checkBoard(const qorsim::ChainBuilder& board, const toml::table& file) {
  const unsigned session = QorJtag_session_openCable(board.cable());
  QorJtag_session_setMessageHandler(session, [](unsigned, const char*) {});
  std::vector<QorRT::Qor_Device> devices;
  QorJtag_session_getDevices(session, devices);
  const toml::array& tables = *file["device"].as_array();
  require(devices.size() == tables.size(), "as many devices");
  for (unsigned i = 0; i < devices.size(); ++i) {
    const toml::table& table = *tables[i].as_table();
    require(devices[i].idcode == number(table, "idcode", 0), "IDCODE");
    require(devices[i].irLength == number(table, "ir_length", 6), "IR length");
    requireEqual(devices[i].name, table["name"].value_or("device" + std::to_string(i)));
    if (const toml::array* cores = table["core"].as_array())
      for (const toml::node& core : *cores) checkCore(session, i, *core.as_table());
  }
  QorJtag_session_close(session);
}

}  // namespace

void fuzz(std::string_view input) {
  try {
    const std::string text(input);
    checkBoard(qorsim::boardText(text, "F"), toml::parse(text));
  } catch (const std::runtime_error& e) {
    const std::string what = e.what();
    const std::size_t end = what.find_first_not_of("0123456789", 2);
    require(what.rfind("F:", 0) == 0 && end > 2 && what.compare(end, 2, ": ") == 0, what);
  }
}
