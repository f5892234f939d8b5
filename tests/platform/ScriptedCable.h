// A chain of two devices that writes down what it is sent, and answers from a script.
#pragma once

#include <deque>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "QorJtag_Host.h"
#include "Qor_Cable.h"
#include "tests/platform/HubScript.h"
#include "tests/platform/ThrownBy.h"
#include "tests/platform/WireBits.h"

/// What comes back of a scan: bits filled up with zeros, or what a hub says to what was sent.
class Answer {
 public:
  Answer(Bits bits) : bits_(std::move(bits)) {}
  Answer(Reply reply) : reply_(std::move(reply)) {}
  Bits to(const Bits& sent) const { return reply_ ? reply_->to(sent) : bits_; }

 private:
  Bits bits_;
  std::optional<Reply> reply_;
};

/// Shared by a test and the cable that its session owns.
struct Script {
  std::deque<Answer> answers;       // to each scan that captures, in turn; zeros after the last
  std::vector<std::string> frames;  // SentFrame::text() of each DR scan
  std::vector<unsigned> tags;       // of each DR scan
  std::vector<std::string>
      log;              // "ir DEVICE CHAIN", "dr DEVICE BITS NUMBER", "idle TCKS"; "run" after each queue
  std::string failure;  // thrown by the next run, when not empty
  bool destroyed = false;
};

class ScriptedCable : public QorRT::Qor_Cable {
 public:
  explicit ScriptedCable(std::shared_ptr<Script> script, std::size_t devices = 2)
      : script_(std::move(script)) {
    devices_.resize(devices);
  }
  ~ScriptedCable() override { script_->destroyed = true; }

  const std::vector<QorRT::Qor_Device>& devices() const override { return devices_; }

 private:
  void run(std::vector<QorRT::Qor_Scan>& scans) override {
    for (QorRT::Qor_Scan& scan : scans) step(scan);
    script_->log.push_back("run");
    if (!script_->failure.empty()) throw std::runtime_error(std::exchange(script_->failure, ""));
  }

  void step(QorRT::Qor_Scan& scan) {
    const std::string device = std::to_string(scan.device) + " ";
    switch (scan.kind) {
      case QorRT::Qor_Scan::Kind::ir:
        return script_->log.push_back("ir " + device + std::to_string(scan.userChain));
      case QorRT::Qor_Scan::Kind::idle:
        return script_->log.push_back("idle " + std::to_string(scan.cycles));
      case QorRT::Qor_Scan::Kind::dr:
        script_->log.push_back("dr " + device + std::to_string(scan.bitCount) + " " +
                               hexOf(bitsOfBytes(scan.out, scan.bitCount)));
        if (scan.capture) scan.in = bytesOf(nextAnswer(bitsOfBytes(scan.out, scan.bitCount)));
    }
  }

  Bits nextAnswer(const Bits& sent) {
    Bits bits;
    if (sent.size() > 58) {
      script_->frames.push_back(SentFrame(sent).text());
      script_->tags.push_back(SentFrame(sent).tag());
    }
    if (!script_->answers.empty()) {
      bits = script_->answers.front().to(sent);
      script_->answers.pop_front();
    }
    bits.resize(sent.size(), '0');
    bits.resize((sent.size() + 7) / 8 * 8, '1');  // what is above a capture in its last byte is nobody's
    return bits;
  }

  std::shared_ptr<Script> script_;
  std::vector<QorRT::Qor_Device> devices_{{0x0A5F1093, "near", 6}, {0, "far", 4}};
};

/// A session on a scripted cable, closed with the test.
class ScriptedSession {
 public:
  ~ScriptedSession() { close(); }
  void close() {
    if (std::exchange(isOpen_, false)) QorJtag_session_close(handle);
  }

  const std::shared_ptr<Script> script = std::make_shared<Script>();
  const unsigned handle = QorJtag_session_openCable(std::make_unique<ScriptedCable>(script));

 private:
  bool isOpen_ = true;
};
