#pragma once

/// The kinds of message. Debug traces are shown by no message manager.
enum class MsgType { error, warning, status, debug };
