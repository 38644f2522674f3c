#include "host/table/CheckpointEnFond.h"

#include <sqlite3.h>

namespace quarvo::host {

CheckpointEnFond::CheckpointEnFond(std::filesystem::path path)
    : path_(std::move(path)), thread_([this](std::stop_token stop) { boucle(stop); }) {}

CheckpointEnFond::~CheckpointEnFond() {
  thread_.request_stop();
  thread_.join();
}

void CheckpointEnFond::demander() {
  {
    std::lock_guard lock(mutex_);
    demande_ = true;
  }
  cv_.notify_one();
}

void CheckpointEnFond::boucle(std::stop_token stop) {
  sqlite3* db = nullptr;
  if (sqlite3_open_v2(path_.c_str(), &db, SQLITE_OPEN_READWRITE | SQLITE_OPEN_NOMUTEX, nullptr) !=
      SQLITE_OK) {
    sqlite3_close(db);
    return;  // the writer's own checkpoints take over
  }
  sqlite3_busy_timeout(db, 1000);
  while (true) {
    {
      std::unique_lock lock(mutex_);
      if (!cv_.wait(lock, stop, [this] { return demande_; })) break;
      demande_ = false;
    }
    if (sqlite3_wal_checkpoint_v2(db, nullptr, SQLITE_CHECKPOINT_PASSIVE, nullptr, nullptr) ==
        SQLITE_OK) {
      ++faits_;
    }
  }
  sqlite3_close(db);
}

}  // namespace quarvo::host
