// SPDX-License-Identifier: MIT
#include "Platform/Linux/GpsdPositions.h"

#include <QObject>
#include <QTimer>
#include <chrono>
#include <memory>
#include <thread>
#include <utility>

#include "Platform/Linux/GpsdReader.h"

namespace kestro {
namespace {

constexpr std::chrono::milliseconds kLook{200};

class GpsdFeed final : public PositionFeed {
 public:
  GpsdFeed(const PositionServer& server, PositionHandlers handlers)
      : _handlers(std::make_shared<PositionHandlers>(std::move(handlers))) {
    QObject::connect(&_timer, &QTimer::timeout, &_timer, [this]() noexcept { look(); });
    _timer.start(kLook);
    std::thread([server, mailbox = _mailbox] { readGpsd(server, mailbox); }).detach();
  }
  ~GpsdFeed() override { _mailbox->stop(); }

 private:
  // A handler may destroy this feed.
  void look() {
    const auto news = _mailbox->take();
    if (!news.isNew) return;
    const auto handlers = _handlers;
    if (news.failure.empty()) {
      handlers->moved(news.fix);
    } else {
      handlers->failed(news.failure);
    }
  }

  std::shared_ptr<PositionHandlers> _handlers;
  std::shared_ptr<GpsdMailbox> _mailbox = std::make_shared<GpsdMailbox>();
  QTimer _timer;
};

}  // namespace

std::unique_ptr<PositionFeed> GpsdPositions::follow(const PositionServer& server,
                                                    PositionHandlers handlers) {
  return std::make_unique<GpsdFeed>(server, std::move(handlers));
}

}  // namespace kestro
