#pragma once

#include <sstream>
#include <string>

#include "manager/parts/IscProgram.h"

/// ISC programs as texts, for comparing them. Captures stand behind '/', least and most waits are "cycles,seconds".
namespace IscText {

inline std::string of(const Isc::Field& field) {
  using Kind = Isc::Value::Kind;
  const Isc::Value& value = field.value;
  std::string text = std::to_string(field.length) + ':' + (value.complement ? "~" : "");
  const std::string variable = '$' + value.variable;
  const std::string amount = std::to_string(value.amount);
  switch (value.kind) {
    case Kind::bits:
      text += value.bits.hex();
      break;
    case Kind::input:
      text += '?';
      break;
    case Kind::output:
      text += '!';
      break;
    case Kind::variable:
      text += variable;
      break;
    case Kind::set:
      text += variable + '=' + value.bits.hex();
      break;
    case Kind::add:
      text += variable + '+' + value.bits.hex();
      break;
    case Kind::subtract:
      text += variable + '-' + value.bits.hex();
      break;
    case Kind::shiftLeft:
      text += variable + "<<" + amount;
      break;
    case Kind::shiftRight:
      text += variable + ">>" + amount;
      break;
  }
  return field.mask ? text + '*' + field.mask->hex() : text;
}

inline std::string of(const Isc::Wait& wait) {
  std::ostringstream text;
  text << wait.cycles << ',' << wait.seconds;
  return text.str();
}

inline std::string of(const Isc::Step& step) {
  std::string text = '(' + step.instruction;
  for (const Isc::Field& field : step.updates) text += ' ' + of(field);
  text += " wait " + of(step.least);
  if (step.most) text += ':' + of(*step.most);
  if (!step.captures.empty()) text += " /";
  for (const Isc::Field& field : step.captures) text += ' ' + of(field);
  return text + ')';
}

inline std::string of(const Isc::Item& item) {
  std::string text;
  for (const Isc::Step& step : item.steps) text += (text.empty() ? "" : " ") + of(step);
  if (!item.loop) return text;
  return "loop " + std::to_string(item.loopLeast) + ".." + std::to_string(item.loopMost) + " [" + text + ']';
}

inline std::string of(const Isc::Flow& flow) {
  std::string text = flow.unprocessed ? "unprocessed " : "";
  if (flow.exitOnError) text += "exit_on_error ";
  for (const Isc::Block& block : flow.blocks) {
    using Kind = Isc::Block::Kind;
    if (&block != &flow.blocks.front()) text += ' ';
    if (block.kind == Kind::initialize) text += "initialize";
    if (block.kind == Kind::repeat) text += "repeat " + std::to_string(block.count);
    if (block.kind == Kind::terminate) text += "terminate";
    for (const Isc::Item& item : block.items) text += ' ' + of(item);
  }
  return text;
}

inline std::string of(const std::vector<Isc::Use>& uses) {
  std::string text;
  for (const Isc::Use& use : uses) {
    text += (text.empty() ? "" : " ") + use.name + (use.array.empty() ? "" : '(' + use.array + ')');
    if (use.choice == Isc::Use::Choice::optional) text += " optional";
    if (use.choice == Isc::Use::Choice::recommended) text += " recommended";
    if (&use != &uses.back()) text += ',';
  }
  return text;
}

}  // namespace IscText
