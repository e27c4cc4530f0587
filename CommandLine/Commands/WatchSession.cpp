// SPDX-License-Identifier: MIT
#include "CommandLine/Commands/WatchSession.h"

#include <string>
#include <utility>

#include "Model/ConnectionProblem.h"
#include "Platform/Clock.h"
#include "Platform/LogSourceState.h"

namespace kestro {
namespace {

constexpr const char* kConnecting = "Connecting...";

}  // namespace

WatchSession::WatchSession(Platform& platform, WatchView& view,
                           std::optional<std::uint64_t> refreshLimit, std::function<void()> ended,
                           std::string serverName)
    : _platform(platform),
      _view(view),
      _refreshLimit(refreshLimit),
      _ended(std::move(ended)),
      _serverName(std::move(serverName)),
      _updateMessage(kConnecting),
      _self(std::make_shared<WatchSession*>(this)),
      _model(KestroModel::create(platform, [weak = std::weak_ptr(_self)] {
        if (const auto session = weak.lock()) (*session)->refresh();
      })) {
  _state.status = kConnecting;
  _model->setConnectionHandler([weak = std::weak_ptr(_self)](bool) {
    if (const auto session = weak.lock()) (*session)->connectionChanged();
  });
  _model->setNewsHandler([weak = std::weak_ptr(_self)] {
    if (const auto session = weak.lock()) (*session)->updateOrigin();
  });
}

void WatchSession::start() {
  redraw();
  _model->restartMonitor();
}

void WatchSession::redraw() {
  if (_isOver) return;
  _view.changed(_state);
  endIfOver();
}

void WatchSession::refresh() {
  if (_isOver) return;
  NodePointer tree = _model->topLevelNodes();
  if (!tree) return;  // the channel's technology has no generator: the last display stays
  const Moment now = _platform.clock().now();
  if (_model->isConnected()) _updateMessage = updatedText(_platform.clock(), now);
  _state.previous = std::exchange(_state.tree, std::move(tree));
  _state.time = now;
  updateStatus();
  ++_refreshCount;
  _view.refreshed(_state);
  endIfOver();
}

void WatchSession::connectionChanged() {
  const std::string before = _state.status;
  updateStatus();
  updateOrigin();
  if (_state.status != before) redraw();
}

void WatchSession::updateOrigin() {
  if (_isOver) return;
  const LogSourceState& source = _model->source();
  const bool hasEnded = source.hasEnded.value_or(false);
  _state.technology = _model->technology();
  _state.source = sourceText(source);
  _state.isRenewed = _model->isConnected() && !hasEnded;
  _state.notice.clear();
  if (_model->problem()) {
    _state.notice = problemText(*_model->problem(), _serverName);
  } else if (_model->isConnected() && hasEnded) {
    _state.notice = sourceEndedText(source);
  }
  _view.noticed(_state);
  endIfOver();
}

void WatchSession::updateStatus() {
  _state.status = _model->isConnected() ? _updateMessage : kConnecting;
}

void WatchSession::endIfOver() {
  const bool isComplete = _refreshLimit && _refreshCount >= *_refreshLimit;
  if (!isComplete && _view.failureMessage().empty()) return;
  _isOver = true;
  _ended();
}

}  // namespace kestro
