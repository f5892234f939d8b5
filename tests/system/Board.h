// A session on a simulated board, with its messages kept, and the short names that the tests use.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "QorJtag_Host.h"
#include "QorVIO.h"
#include "QorVIO_Core.h"
#include "Sim.h"

using TextMap = QorRT::hash_map<std::string, std::string>;
using Bytes = std::vector<unsigned char>;
using testing::ElementsAre;

constexpr unsigned failed = 0x80000000;

/// The demo board: simulated in process, or at the cable that the environment names, as it is there.
inline std::string demoUrl() {
  const char* const url = std::getenv("QORVIO_TEST_CABLE");
  return url != nullptr ? url : "sim:";
}

enum PortType : unsigned { syncOut, syncIn, asyncOut, asyncIn };

/// One session. Closes it at the end, unless the test has done so.
class Board {
 public:
  explicit Board(std::unique_ptr<QorRT::Qor_Cable> cable)
      : session(QorJtag_session_openCable(std::move(cable))) {
    listen();
  }
  explicit Board(const std::string& url) : session(QorJtag_session_open(url.c_str())) { listen(); }
  Board(const Board&) = delete;
  Board& operator=(const Board&) = delete;
  ~Board() { close(); }

  void close() {
    if (isOpen_) QorJtag_session_close(session);
    isOpen_ = false;
  }

  /// The messages since the last time this was asked, as "TYPE TEXT".
  std::vector<std::string> takeMessages() { return std::exchange(messages_, {}); }

  const unsigned session;

 private:
  void listen() {
    QorJtag_session_setMessageHandler(session, [this](unsigned type, const char* text) {
      messages_.push_back((type == 0x100 ? "100 " : type == 0x8000 ? "8000 " : "? ") + std::string(text));
    });
  }

  bool isOpen_ = true;
  std::vector<std::string> messages_;
};

/// One core of a board, through the exported functions; an unexpected failure fails the test with its
/// message.
class VioCore {
 public:
  VioCore(Board& board, QOR_CORE_REF address) : board_(board), session(board.session), ref(address) {
    check(QorVIO_initCore(session, ref));
  }

  void define(const std::string& name, PortType type, std::vector<unsigned> bits) {
    check(
        QorVIO_defineBus(session, ref, name.c_str(), type, bits.data(), static_cast<unsigned>(bits.size())));
  }
  void write(TextMap values) {
    TextMap* map = &values;
    check(QorVIO_writeValues(session, ref, &map));
  }
  TextMap read() {
    TextMap values;
    TextMap* map = &values;
    check(QorVIO_readValues(session, ref, &map));
    return values;
  }

 private:
  void check(unsigned code) { EXPECT_EQ(code, 0U) << testing::PrintToString(board_.takeMessages()); }

  Board& board_;

 public:
  const unsigned session;
  const QOR_CORE_REF ref;
};
