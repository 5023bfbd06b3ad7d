#pragma once
// Sets the window's IsLoading flag while the program itself changes fields, so
// that their handlers stay quiet, and restores what it found however the
// procedure ends.

namespace quorvel {

class LoadingScope {
public:
    explicit LoadingScope(bool& flag) : flag_(flag), saved_(flag) { flag_ = true; }
    ~LoadingScope() { flag_ = saved_; }
    LoadingScope(const LoadingScope&) = delete;
    LoadingScope& operator=(const LoadingScope&) = delete;

private:
    bool& flag_;
    bool saved_;
};

} // namespace quorvel
