// SPDX-License-Identifier: MIT
#include "Model/FailureText.h"

#include "LogGenerator/Ondrel/SharedDecoders.h"
#include "LogGenerator/Packets/Walk.h"

namespace kestro {

std::string failureText(const std::exception_ptr& failure) {
  if (!failure) return "no exception";
  try {
    std::rethrow_exception(failure);
  } catch (const LogCode_0xFF0000::UnknownDataException&) {
    return "a SIM packet holds no property list (LogCode_0xFF0000::UnknownDataException)";
  } catch (const ArrayOutOfBoundsException&) {
    return "a record lies past its packet's count (ArrayOutOfBoundsException)";
  } catch (const std::exception& exception) {
    return exception.what();
  } catch (...) {
    return "an exception of unknown type";
  }
}

}  // namespace kestro
